#include "frame/frame.h"
#include "frame/paths.h"

int SplitExtent(const char *path, char *out) {
  auto s = vl::path::split(path);
  if (s.dotName) return vl::path::piece(path, 0, 0, 1, out);
  return vl::path::piece(path, s.dot, s.nameEnd, vl::path::kExtentMax, out);
}
