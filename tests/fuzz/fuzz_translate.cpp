// The service layer's one-call translation with random code pages, options and sizes.
#include <cstdlib>
#include <vector>

#include "nls1.h"
#include "tests/fuzz/fuzzdefs.h"

namespace {
const uint32_t kPages[] = {1200, 819, 1252, 932, 954, 930, 939, 1208, 37, 936, 949, 950, 1251, 9999};
constexpr size_t kCount = sizeof kPages / sizeof *kPages;
const uint32_t kOptions[] = {0, NLS1_OPT_CHARLEN, NLS1_OPT_NULLTERM, NLS1_OPT_PAD, NLS1_OPT_LENIENT, 0x10};
}  // namespace

extern "C" int LLVMFuzzerInitialize(int *, char ***) {
  setenv("NLS1_LOCALEDIR", fuzz::realDefs(), 1);
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  fuzz::Input in{data, size};
  uint32_t target = kPages[in.byte() % kCount], source = kPages[in.byte() % kCount];
  uint8_t bits = in.byte();
  uint32_t options = 0;
  for (size_t i = 0; i < sizeof kOptions / sizeof *kOptions; ++i)
    if (bits & (1u << i)) options |= kOptions[i];
  int32_t outSize = int32_t(in.byte()) - 8;  // negative sizes too
  bool counted = in.byte() & 1;
  std::vector<uint8_t> src(in.p, in.p + in.n);
  if (source == 1200 && src.size() % 2) src.pop_back();
  // Sizes count characters with the character option: a character is at most 4 bytes.
  size_t room = outSize > 0 ? size_t(outSize) * ((options & NLS1_OPT_CHARLEN) ? 4 : 1) : 1;
  std::vector<uint8_t> out(room);
  // A counted length in characters could claim more than the bytes hold: that is the
  // caller's error, so character counts always come with a terminated source.
  if (options & NLS1_OPT_CHARLEN) counted = false;
  int32_t length = counted ? int32_t(source == 1200 ? src.size() / 2 : src.size()) : -1;
  if (!counted) src.insert(src.end(), {0, 0});
  int32_t count = 0;
  uint32_t rc = 0;
  NLS1_TranslateString(target, out.data(), outSize, source, src.data(), length, &count, options, &rc);
  return 0;
}
