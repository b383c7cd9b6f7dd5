#include "frame/frame.h"

int VLGetEnv(const char *name, char *buffer, int size) {
  const char *v = OSL1_GetEnv(name);
  if (!v) return 0;
  int n = static_cast<int>(std::strlen(v)) + 1;
  if (n <= size && buffer) std::memcpy(buffer, v, static_cast<size_t>(n));
  return n;
}
