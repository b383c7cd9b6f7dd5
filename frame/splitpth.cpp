#include "frame/frame.h"

VL_TRACE_MODULE("splitpth");

int SplitPath(const char *path, char *drive, char *dir, char *file, char *extent) {
  int n = SplitDrive(path, drive);
  n += SplitDir(path, dir);
  n += SplitFile(path, file);
  n += SplitExtent(path, extent);
  VL_DETAIL("Original path: %s\n drive: %s\n directory: %s\n file: %s\n extent: %s", path, drive, dir, file,
            extent);
  return n;
}
