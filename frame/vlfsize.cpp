#include <sys/stat.h>

#include "frame/frame.h"

int64_t VLFileSize(VLFile *file) {
  struct stat st;
  if (!file || ::fstat(file->descriptor, &st) != 0) return -1;
  return static_cast<int64_t>(st.st_size);
}
