#include "frame/frame.h"
#include "frame/paths.h"

int SplitFile(const char *path, char *out) {
  auto s = vl::path::split(path);
  if (s.dotName) return vl::path::piece(path, 0, 0, 1, out);
  return vl::path::piece(path, s.dirEnd, s.dot, vl::path::kFileMax, out);
}
