#include "frame/frame.h"
#include "frame/paths.h"

int SplitDir(const char *path, char *out) {
  auto s = vl::path::split(path);
  return vl::path::piece(path, s.driveEnd, s.dirEnd, vl::path::kDirMax, out);
}
