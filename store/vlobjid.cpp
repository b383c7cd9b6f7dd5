// Finds an object by id: a binary search within its type's range.
#include "store/store.h"

VL_TRACE_MODULE("vlobjid");

VLObjEntry *VLGetObjFromID(VLObjManager *m, uint16_t type, uint16_t id, int noLoad, uint32_t *rcOut) {
  VL_FLOW("VLGetObjFromID");
  uint32_t dummy;
  uint32_t *rc = rcOut ? rcOut : &dummy;
  *rc = 0;
  if (type == VL_OBJ_SORT && id == 0) VL_RET(static_cast<VLObjEntry *>(nullptr));
  VL_DETAIL("Searching for type %d, id %d", type, id);
  if (!m || !m->entries || type > 3 || m->typeStart[4] == 0) {
    *rc = VL_RC_NOTFOUND;
    VL_RET(static_cast<VLObjEntry *>(nullptr));
  }
  // An empty range probes the last entry of the type before; that entry answers only
  // when its own id happens to be equal.
  uint32_t lo = m->typeStart[type];
  uint32_t next = m->typeStart[type + 1];
  uint32_t hi = next ? next - 1 : 0;
  while (lo < hi) {
    uint32_t mid = (lo + hi) / 2;
    if (id <= m->entries[mid].id)
      hi = mid;
    else
      lo = mid + 1;
  }
  VLObjEntry *e = &m->entries[hi];
  if (e->id != id) {
    *rc = VL_RC_NOTFOUND;
    VL_RET(static_cast<VLObjEntry *>(nullptr));
  }
  if (noLoad == 1 && !__atomic_load_n(&e->section[0], __ATOMIC_ACQUIRE)) VL_RET(e);
  VL_RET(VLLoadObj(m, e, rc));
}
