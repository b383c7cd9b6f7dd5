#include <cstdio>

#include "store/store.h"

char *VLGetAliasFileName(const char *directory, char *buffer, int size) {
  if (!directory || !buffer) return nullptr;
  int need = static_cast<int>(std::strlen(directory)) + 10;
  if (size < need) {
    std::fprintf(stderr, "Buffer provided = %d, needed = %d\n", size, need);
    return nullptr;
  }
  const char *sep = vlglobals ? vlglobals->pathSeparator : "/";
  std::snprintf(buffer, static_cast<size_t>(size), "%s%s%s", directory, sep, "alias.txt");
  return buffer;
}
