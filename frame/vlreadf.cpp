#include <unistd.h>

#include "frame/frame.h"

int32_t VLReadFile(VLFile *file, void *buffer, uint32_t length, uint32_t *rc) {
  uint32_t dummy;
  if (!rc) rc = &dummy;
  *rc = 0;
  if (!file) {
    *rc = VL_RC_FILE_IO;
    return 0;
  }
  if (file->mode == VL_FILE_WRITE) {
    *rc = VL_RC_FILE_WRITEONLY;
    return 0;
  }
  size_t done = 0;
  auto *p = static_cast<unsigned char *>(buffer);
  while (done < length) {
    ssize_t n = ::read(file->descriptor, p + done, length - done);
    if (n < 0) {
      *rc = VL_RC_FILE_IO;
      return 0;
    }
    if (n == 0) {
      file->atEnd = 1;
      break;
    }
    done += static_cast<size_t>(n);
  }
  return static_cast<int32_t>(done);
}
