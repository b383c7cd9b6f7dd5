#include "frame/frame.h"
#include "frame/paths.h"

int SplitDrive(const char *path, char *out) {
  auto s = vl::path::split(path);
  return vl::path::piece(path, 0, s.driveEnd, vl::path::kDriveMax, out);
}
