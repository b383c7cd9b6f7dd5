// Locale names and native names, as callers and the environment give them.
#include <cstdlib>
#include <vector>

#include "tests/fuzz/fuzzdefs.h"

extern "C" int LLVMFuzzerInitialize(int *, char ***) {
  VLInit(fuzz::realDefs(), nullptr, nullptr, 0, 0);
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  std::vector<char> name(data, data + size);
  name.push_back(0);
  uint32_t rc = 0;
  for (uint32_t options : {0u, uint32_t(VL_LOCALE_FALLBACK)}) {
    if (VLLocale *l = VLGetLocale(name.data(), options, &rc)) VLReleaseLocale(l);
    if (VLLocale *l = VLConvertNativeLocale(name.data(), options, &rc)) VLReleaseLocale(l);
  }
  char out[64];
  VLMapNativeLocale(name.data(), out, sizeof out);
  VLMapNativeLocale(name.data(), out, 7);
  std::vector<VLUChar> u(size / 2 + 1);
  for (size_t i = 0; i + 1 < size; i += 2) u[i / 2] = VLUChar(data[i] | data[i + 1] << 8);
  u.back() = 0;
  if (VLLocale *l = VLGetLocaleU(u.data(), VL_LOCALE_FALLBACK, &rc)) VLReleaseLocale(l);
  return 0;
}
