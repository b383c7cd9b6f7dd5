#include <cstdio>

#include "frame/frame.h"

char *VLGetDataFileName(const char *directory, int type, int id, char *buffer, int size) {
  static const char *const kPrefix[] = {"la", "te", "cp", "so"};
  int need = static_cast<int>(std::strlen(directory)) + 14;
  if (need > size) {
    std::fprintf(stderr, "Buffer provided = %d, needed = %d\n", size, need);
    return nullptr;
  }
  if (type < 0 || type > 3) return nullptr;
  const char *ps = vlglobals ? vlglobals->pathSeparator : "/";
  const char *ns = vlglobals ? vlglobals->nameSeparator : "_";
  std::snprintf(buffer, static_cast<size_t>(size), "%s%s%s%s%05d%s", directory, ps, kPrefix[type], ns,
                id & 0xFFFF, ".nls");
  return buffer;
}
