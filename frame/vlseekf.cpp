#include <unistd.h>

#include "frame/frame.h"

int VLSeekFile(VLFile *file, int32_t offset, int origin) {
  if (!file) return 1;
  int whence = origin == VL_SEEK_CUR ? SEEK_CUR : origin == VL_SEEK_END ? SEEK_END : SEEK_SET;
  if (::lseek(file->descriptor, offset, whence) < 0) return 1;
  file->atEnd = 0;
  return 0;
}
