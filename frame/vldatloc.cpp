// Where the definitions may be: the environment, or the built-in location.
#include "frame/frame.h"

int VLGetDataLocation(char *buffer, int size, int which) {
  static const char kBuiltin[] = "/Tavrel/locale";
  if (which == 0) {
    int n = VLGetEnv("VL_LOCALEDIR", buffer, size);
    if (n == 0) return -1;
    return n > size ? 0 : n;
  }
  if (which == 1) {
    if (size > 16) {
      std::memcpy(buffer, kBuiltin, sizeof kBuiltin);
      return 17;
    }
    return 0;
  }
  return 0;
}
