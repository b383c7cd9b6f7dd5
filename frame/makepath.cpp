#include "frame/frame.h"

char *MakePath(char *out, const char *drive, const char *dir, const char *file, const char *extent) {
  out[0] = 0;
  if (drive) std::strcat(out, drive);
  if (dir) std::strcat(out, dir);
  if (file) std::strcat(out, file);
  if (extent && *extent) std::strcat(out, extent);
  return out;
}
