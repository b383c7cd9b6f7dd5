// Finds an object by name (case-insensitive), loading it unless asked not to.
#include "store/store.h"

VL_TRACE_MODULE("vlobjnam");

VLObjEntry *VLGetObjFromName(VLObjManager *m, uint16_t type, const char *name, int32_t length, int noLoad,
                             uint32_t *rcOut) {
  VL_FLOW("VLGetObjFromName");
  uint32_t dummy;
  uint32_t *rc = rcOut ? rcOut : &dummy;
  *rc = 0;
  if (!m || !m->entries || !name || length < 0) {
    *rc = VL_RC_NOTFOUND;
    VL_RET(static_cast<VLObjEntry *>(nullptr));
  }
  size_t len = static_cast<size_t>(length);
  // "BINARY" names code-point order, which has no object.
  if (type == VL_OBJ_SORT && (len == 6 || len == 7) && VLmemicmp(name, "BINARY", len) == 0)
    VL_RET(static_cast<VLObjEntry *>(nullptr));
  uint16_t from = type <= 3 ? m->typeStart[type] : 0, to = type <= 3 ? m->typeStart[type + 1] : 0;
  for (uint16_t i = from; i < to; ++i) {
    VLObjEntry *e = &m->entries[i];
    size_t n = std::strlen(e->name);
    // A length that counts the terminator matches too (the name's NUL is compared).
    if ((n == len || n + 1 == len) && VLmemicmp(e->name, name, len) == 0) {
      if (noLoad == 1 && !__atomic_load_n(&e->section[0], __ATOMIC_ACQUIRE)) VL_RET(e);
      VL_RET(VLLoadObj(m, e, rc));
    }
  }
  *rc = VL_RC_NOTFOUND;
  VL_RET(static_cast<VLObjEntry *>(nullptr));
}
