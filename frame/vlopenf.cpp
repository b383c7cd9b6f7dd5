// Opens a file; writing over an existing file goes to a temporary that replaces it on close.
#include <cerrno>
#include <fcntl.h>
#include <unistd.h>

#include "frame/frame.h"
#include "frame/paths.h"

VL_TRACE_MODULE("vlopenf");

namespace {
uint32_t openError(int e) {
  if (e == ENOENT || e == ENOTDIR) return VL_RC_FILE_MISSING;
  if (e == EACCES || e == EPERM) return VL_RC_FILE_ACCESS;
  return VL_RC_OPEN;
}
}  // namespace

VLFile *VLOpenFile(uint32_t, const char *name, int mode, int noTemp, uint32_t *rc) {
  VL_FLOW("VLOpenFile");
  uint32_t dummy;
  if (!rc) rc = &dummy;
  *rc = 0;
  VL_DETAIL("Opening file %s", name);
  vl::Block<VLFile> f(sizeof(VLFile));
  if (!f) {
    *rc = VL_RC_NOMEM;
    VL_RET(static_cast<VLFile *>(nullptr));
  }
  std::memset(f.get(), 0, sizeof(VLFile));
  f->mode = static_cast<uint8_t>(mode);
  f->isWrite = mode == VL_FILE_WRITE;
  int fd;
  if (mode == VL_FILE_WRITE) {
    const char *target = name;
    char temp[512];
    if (!noTemp && access(name, F_OK) == 0) {
      char drive[vl::path::kDriveMax], dir[vl::path::kDirMax], file[vl::path::kFileMax], ext[vl::path::kExtentMax];
      SplitPath(name, drive, dir, file, ext);
      size_t need = std::strlen(drive) + std::strlen(dir) + std::strlen(file) + 4;
      if (need < sizeof f->savedPath && *file) {
        MakePath(f->savedPath, drive, dir, file, nullptr);
        std::memcpy(f->savedExt, ext, std::strlen(ext) + 1);
        std::memcpy(temp, f->savedPath, std::strlen(f->savedPath) + 1);
        std::strcat(temp, "tmp");
        VL_STATE("Using temp file %s", temp);
        f->isTemp = 1;
        target = temp;
      }
    }
    fd = ::open(target, O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0644);
  } else {
    fd = ::open(name, (mode == VL_FILE_READWRITE ? O_RDWR : O_RDONLY) | O_CLOEXEC);
  }
  if (fd < 0) {
    *rc = openError(errno);
    VL_ERR("Unable to open %s, err = %d", name, errno);
    VL_RET(static_cast<VLFile *>(nullptr));
  }
  f->descriptor = fd;
  VL_RET(f.take());
}
