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
    if (discard == 1) {
      ::unlink(file->tempName);
    } else {
      VL_STATE("Renaming %s to %s", file->tempName, file->finalName);
      if (::access(file->finalName, W_OK) != 0 || ::rename(file->tempName, file->finalName) != 0) {
        VL_ERR("Close failed, rc = %d", errno);
        rc = 1;
      }
    }
  }
  vl::release(file->finalName);
  vl::release(file);
  VL_RET(rc);
}
