// Reads one section of a file into a block of its own.
#include "frame/frame.h"

void *VLLoadFile(VLFile *file, uint32_t offset, uint32_t size, uint32_t *rc) {
  uint32_t dummy;
  if (!rc) rc = &dummy;
  *rc = 0;
  if (size == 0) return nullptr;
  // Offsets come from file headers; anything past the signed range cannot be positioned.
  if (offset > 0x7FFFFFFFu) {
    *rc = VL_RC_FILE_IO;
    return nullptr;
  }
  vl::Block<void> b(size);
  if (!b) {
    *rc = VL_RC_NOMEM;
    return nullptr;
  }
  if (VLSeekFile(file, static_cast<int32_t>(offset), VL_SEEK_SET) != 0) {
    *rc = VL_RC_FILE_IO;
    return nullptr;
  }
  uint32_t rrc = 0;
  int32_t n = VLReadFile(file, b.get(), size, &rrc);
  if (rrc || n != static_cast<int32_t>(size)) {
    *rc = rrc == VL_RC_FILE_WRITEONLY ? rrc : VL_RC_FILE_IO;
    return nullptr;
  }
  return b.take();
}
