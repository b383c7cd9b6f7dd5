// Releases an object's sections and closes its file.
#include "store/store.h"

VL_TRACE_MODULE("vlunldob");

uint32_t VLUnloadObj(VLObjManager *, VLObjEntry *e) {
  VL_FLOW("VLUnloadObj");
  if (!e) VL_RET(uint32_t{0});
  vl::store::unloads.fetch_add(1, std::memory_order_release);
  uint32_t rc = 0;
  if (!(e->flags & 0x01)) {
    for (int i = 3; i >= 0; --i) {
      if (!e->section[i]) continue;
      if (e->flags & (0x02 << i)) {
        if (!vl::release(e->section[i])) rc = VL_RC_FREEFAIL;
      } else {
        VLUnloadFile(e->section[i]);
      }
    }
  }
  uint32_t crc = 0;
  if (e->file) crc = static_cast<uint32_t>(VLCloseFile(e->file, 0));
  e->file = nullptr;
  for (int i = 0; i < 4; ++i) {
    e->section[i] = nullptr;
    e->sectionSize[i] = 0;
  }
  VL_RET(crc ? crc : rc);
}
