// Name lookup for a name in wide characters: each is reduced to its low byte.
#include "store/store.h"

VLObjEntry *VLGetObjFromNameW(VLObjManager *m, uint16_t type, const VLWChar *name, int32_t length, int noLoad,
                              uint32_t *rcOut) {
  uint32_t dummy;
  uint32_t *rc = rcOut ? rcOut : &dummy;
  if (!name || length < 0) {
    *rc = VL_RC_NOTFOUND;
    return nullptr;
  }
  vl::Block<char> narrow(static_cast<size_t>(length) + 1);
  if (!narrow) {
    *rc = VL_RC_NOMEM;
    return nullptr;
  }
  for (int32_t i = 0; i < length; ++i) narrow.get()[i] = static_cast<char>(name[i] & 0xFF);
  narrow.get()[length] = 0;
  return VLGetObjFromName(m, type, narrow.get(), length, noLoad, rc);
}
