// Releases the manager: aliases, every loaded object, the table.
#include "store/store.h"

VL_TRACE_MODULE("vlobjtrm");

uint32_t VLTermObjManager(VLObjManager *m) {
  VL_FLOW("VLTermObjManager");
  if (!m) VL_RET(uint32_t{0});
  VLDestroyAliasList(m);
  uint32_t rc = 0;
  if (m->entries) {
    for (uint16_t i = 0; i < m->typeStart[4]; ++i) {
      VLObjEntry *e = &m->entries[i];
      if (e->section[0] && !(e->flags & 0x01)) rc = VLUnloadObj(m, e);
    }
    if (!vl::release(m->entries)) rc = 1;
  }
  if (!vl::release(m)) rc = 1;
  VL_RET(rc);
}
