// Number text read back in every form, and values written into buffers of every size.
#include <cstring>
#include <vector>

#include "tests/fuzz/fuzzdefs.h"

namespace {
const char *const kLocales[] = {"German_Germany.MS1252", "English_UnitedStates.37", "Japanese_Japan.IBM930",
                                "French_France.UTF-8", "Japanese_Japan.MS932"};
VLLocale *locales[5];
}  // namespace

extern "C" int LLVMFuzzerInitialize(int *, char ***) {
  VLInit(fuzz::realDefs(), nullptr, nullptr, 0, 0);
  uint32_t rc;
  for (int i = 0; i < 5; ++i) locales[i] = VLGetLocale(kLocales[i], 0, &rc);
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  fuzz::Input in{data, size};
  VLLocale *l = locales[in.byte() % 5];
  int32_t radix = int32_t(in.byte() % 40);
  uint32_t value = in.word();
  int32_t room = int32_t(in.byte() % 48);
  std::vector<char> text(in.p, in.p + in.n);
  char *end = nullptr;
  VLStringToLong(l, text.data(), int32_t(text.size()), &end, radix, 0);
  VLStringToLong(l, text.data(), int32_t(text.size()), &end, radix, 0x80);
  VLStringToDouble(l, text.data(), int32_t(text.size()), &end, 0);
  std::vector<VLUChar> u(text.size() / 2 + 1);
  for (size_t i = 0; i + 1 < text.size(); i += 2) u[i / 2] = VLUChar(text[i] | text[i + 1] << 8);
  VLUChar *uend = nullptr;
  VLStringToLongU(l, u.data(), int32_t(text.size() / 2), &uend, radix, 0);
  std::vector<char> out(size_t(room) + 1);
  VLLongToString(l, int32_t(value), out.data(), room, 0);
  double d;
  static_assert(sizeof d == 8);
  uint64_t bits = uint64_t(value) << 32 | in.word();
  std::memcpy(&d, &bits, sizeof d);
  VLDoubleToString(l, d, out.data(), room, 0);
  VLCurrencyToString(l, out.data(), room, 0, d);
  return 0;
}
