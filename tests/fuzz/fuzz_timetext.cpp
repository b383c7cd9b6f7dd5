// Time patterns and time text, in every kind of code page: the first byte picks the
// locale and where the pattern ends, the rest is pattern then text.
#include <ctime>
#include <vector>

#include "tests/fuzz/fuzzdefs.h"

namespace {
const char *const kLocales[] = {"English_UnitedStates.Latin1", "German_Germany.UTF-8", "Japanese_Japan.MS932",
                                "Japanese_Japan.IBM930"};
VLLocale *locales[4];
}  // namespace

extern "C" int LLVMFuzzerInitialize(int *, char ***) {
  VLInit(fuzz::realDefs(), nullptr, nullptr, 0, 0);
  uint32_t rc;
  for (int i = 0; i < 4; ++i) locales[i] = VLGetLocale(kLocales[i], 0, &rc);
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  fuzz::Input in{data, size};
  VLLocale *l = locales[in.byte() % 4];
  size_t split = in.n ? in.byte() % (in.n + 1) : 0;
  if (split > in.n) split = in.n;
  // Each in a block of its own, exactly as long as given.
  std::vector<char> pattern(in.p, in.p + split), text(in.p + split, in.p + in.n);
  struct tm t {};
  t.tm_year = 99, t.tm_mon = 11, t.tm_mday = 31, t.tm_hour = 23, t.tm_min = 59, t.tm_sec = 59, t.tm_wday = 5,
  t.tm_yday = 364;
  std::vector<char> out(64);
  VLTimeToString(l, &t, out.data(), int32_t(out.size()), pattern.data(), int32_t(pattern.size()), 0);
  VLTimeToString(l, &t, out.data(), 3, pattern.data(), int32_t(pattern.size()), VL_OPT_NULLTERM);
  std::vector<VLUChar> uout(64);
  std::vector<VLUChar> upattern(pattern.size() / 2 + 1);
  for (size_t i = 0; i + 1 < pattern.size(); i += 2) upattern[i / 2] = VLUChar(pattern[i] | pattern[i + 1] << 8);
  VLTimeToStringU(l, &t, uout.data(), int32_t(uout.size()), upattern.data(), int32_t(pattern.size() / 2), 0);
  struct tm back = t;
  VLStringToTime(l, &back, text.data(), int32_t(text.size()), pattern.data(), int32_t(pattern.size()), 0);
  back = t;
  VLStringToTime(l, &back, text.data(), int32_t(text.size()), "%c", -1, 0);
  return 0;
}
