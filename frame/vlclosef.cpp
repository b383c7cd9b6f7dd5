// Closes a file; a temporary replaces the named file, or is discarded.
#include <cerrno>
#include <cstdio>
#include <unistd.h>

#include "frame/frame.h"

VL_TRACE_MODULE("vlclosef");

int VLCloseFile(VLFile *file, int discard) {
  VL_FLOW("VLCloseFile");
  if (!file) VL_RET(1);
  if (::close(file->descriptor) != 0) VL_RET(1);
  file->descriptor = -1;
  int rc = 0;
  if (file->isTemp) {
    char temp[300], final[300];
    std::snprintf(temp, sizeof temp, "%stmp", file->savedPath);
    std::snprintf(final, sizeof final, "%s%s", file->savedPath, file->savedExt);
    if (discard == 1) {
      ::unlink(temp);
    } else {
      VL_STATE("Renaming %s to %s", temp, final);
      if (::access(final, W_OK) != 0 || ::rename(temp, final) != 0) {
        VL_ERR("Close failed, rc = %d", errno);
        rc = 1;
      }
    }
  }
  vl::release(file);
  VL_RET(rc);
}
