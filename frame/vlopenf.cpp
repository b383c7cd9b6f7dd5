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
    if (!noTemp && access(name, F_OK) == 0) {
      // The temporary takes the name without its extension plus "tmp", beside the file,
      // whatever the lengths: the named file stays intact until the close.
      vl::path::Pieces p = vl::path::split(name);
      size_t n = std::strlen(name), base = p.dot;
      if (p.dotName || p.nameEnd == p.dirEnd) {
        *rc = VL_RC_FILE_IO;
        VL_ERR("Unable to open %s, err = %d", name, EISDIR);
        VL_RET(static_cast<VLFile *>(nullptr));
      }
      auto *names = static_cast<char *>(vl::alloc(n + 1 + base + 4));
      if (!names) {
        *rc = VL_RC_NOMEM;
        VL_RET(static_cast<VLFile *>(nullptr));
      }
      std::memcpy(names, name, n + 1);
      f->finalName = names;
      f->tempName = names + n + 1;
      std::memcpy(f->tempName, name, base);
      std::memcpy(f->tempName + base, "tmp", 4);
      VL_STATE("Using temp file %s", f->tempName);
      f->isTemp = 1;
      target = f->tempName;
    }
    fd = ::open(target, O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0644);
  } else {
    fd = ::open(name, (mode == VL_FILE_READWRITE ? O_RDWR : O_RDONLY) | O_CLOEXEC);
  }
  if (fd < 0) {
    int e = errno;
    vl::release(f->finalName);
    *rc = openError(e);
    VL_ERR("Unable to open %s, err = %d", name, e);
    VL_RET(static_cast<VLFile *>(nullptr));
  }
  f->descriptor = fd;
  VL_RET(f.take());
}
