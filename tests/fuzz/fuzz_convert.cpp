// Conversion input in every kind of code page, through the streaming converter with
// random chunking of input and output; the result must not depend on the chunking.
#include <cstdlib>
#include <cstring>
#include <vector>

#include "tests/fuzz/fuzzdefs.h"

namespace {

const char *const kLocales[] = {
    "German_Germany.Latin1", "German_Germany.MS1252", "Japanese_Japan.MS932",
    "Japanese_Japan.954",    "Japanese_Japan.IBM930", "German_Germany.UTF-8",
    "English_UnitedStates.37", "Chinese_China.936",   "Korean_Korea.949",
};
constexpr size_t kCount = sizeof kLocales / sizeof *kLocales;
VLLocale *locales[kCount];

// Converts in chunks whose sizes come from the seed; returns the status of the last call.
uint32_t convert(VLLocale *target, VLLocale *source, const uint8_t *in, size_t n, uint32_t seed,
                 std::vector<uint8_t> &out) {
  VLConversion *c = VLOpenConversion(target, source);
  if (!c) return 20;
  uint32_t rc = 0;
  size_t done = 0;
  int rounds = 0;
  while (rounds++ < 100000) {
    size_t take = seed ? 1 + (seed % 7) : n - done;
    if (take > n - done) take = n - done;
    uint32_t room = seed ? 1 + (seed >> 3) % 9 : 4096;
    seed = seed * 1103515245u + 12345u;
    if (!seed) seed = 1;
    std::vector<uint8_t> chunk(in + done, in + done + take);  // exact block: overreads show
    std::vector<uint8_t> buf(room);
    const unsigned char *ip = chunk.data();
    uint32_t inLeft = uint32_t(take);
    unsigned char *op = buf.data();
    uint32_t outLeft = room;
    rc = VLConvertBuffer(c, &op, &outLeft, &ip, &inLeft, 0);
    out.insert(out.end(), buf.data(), op);
    done += take - inLeft;
    if (rc != 0 && rc != 52 && rc != 53) break;
    if (done == n && rc != 52) break;  // 53 at the end: the input stops inside a character
  }
  VLCloseConversion(c);
  return rc;
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int *, char ***) {
  VLInit(fuzz::realDefs(), nullptr, nullptr, 0, 0);
  uint32_t rc;
  for (size_t i = 0; i < kCount; ++i) locales[i] = VLGetLocale(kLocales[i], 0, &rc);
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  fuzz::Input in{data, size};
  VLLocale *source = locales[in.byte() % kCount];
  VLLocale *target = locales[in.byte() % kCount];
  uint32_t seed = in.word() | 1;
  if (!source || !target) return 0;
  std::vector<uint8_t> whole, chunked;
  uint32_t a = convert(target, source, in.p, in.n, 0, whole);
  uint32_t b = convert(target, source, in.p, in.n, seed, chunked);
  if (a == 0 && b == 0 && whole != chunked) std::abort();
  // The one-shot string forms over the same bytes, into a buffer that is just too small.
  std::vector<char> src(in.p, in.p + in.n), out(in.n + 1);
  VLConvertString(target, out.data(), int32_t(out.size()), source, src.data(), int32_t(src.size()), 0);
  VLConvertStringEx(target, out.data(), 0, int32_t(out.size()), source, src.data(), 0, int32_t(src.size()),
                    VL_OPT_NULLTERM);
  return 0;
}
