// The user's locale name: "VL_LANG", else English until native names are mapped.
#include "locale/locale.h"

int vl::loc::userLocaleName(char *out, int size) {
  int n = VLGetEnv("VL_LANG", out, size);
  if (n > 0 && n <= size) return 1;
  const char kDefault[] = "English";
  std::memcpy(out, kDefault, sizeof kDefault);
  return 2;
}
