// Upper-casing UTF-16 text: VLMapStringU against ICU's u_strToUpper on the same random
// Latin text (with special casing on both sides: sharp s becomes SS). The rows join the
// summary the conversion benchmark prints.
#include <benchmark/benchmark.h>
#include <unicode/ustring.h>

#include <random>
#include <string>
#include <vector>

#include "veltrin.h"

namespace {

// Words of ASCII, Latin-1 and Latin Extended-A letters in both cases, some Greek.
const std::u16string &latinText() {
  static const std::u16string text = [] {
    const std::u16string letters =
        u"abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz"
        u"\u00E0\u00E1\u00E2\u00E4\u00E7\u00E8\u00E9\u00EA\u00F1\u00F6\u00FC\u00DF\u00C4\u00D6\u00DC"
        u"\u0101\u0107\u010D\u0119\u0142\u0144\u015B\u0161\u017C\u017E\u03B1\u03B2\u03B3";
    std::mt19937 rng(11);
    std::u16string t;
    while (t.size() < 256 * 1024) {
      const size_t len = 2 + rng() % 9;
      for (size_t i = 0; i < len; ++i) t += letters[rng() % letters.size()];
      t += u' ';
    }
    return t;
  }();
  return text;
}

void upperOurs(benchmark::State &st) {
  const std::u16string &in = latinText();
  std::vector<VLUChar> out(in.size() * 2 + 16);
  for (auto _ : st) {
    int32_t n = VLMapStringU(nullptr, out.data(), static_cast<int32_t>(out.size()),
                             reinterpret_cast<const VLUChar *>(in.data()), static_cast<int32_t>(in.size()), VL_MAP_UPPER);
    benchmark::DoNotOptimize(n);
  }
  st.SetBytesProcessed(static_cast<int64_t>(st.iterations() * in.size() * 2));
}

void upperIcu(benchmark::State &st) {
  const std::u16string &in = latinText();
  std::vector<UChar> out(in.size() * 2 + 16);
  for (auto _ : st) {
    UErrorCode err = U_ZERO_ERROR;
    int32_t n = u_strToUpper(out.data(), static_cast<int32_t>(out.size()), in.data(),
                             static_cast<int32_t>(in.size()), "", &err);
    benchmark::DoNotOptimize(n);
  }
  st.SetBytesProcessed(static_cast<int64_t>(st.iterations() * in.size() * 2));
}

const bool kRegistered = [] {
  benchmark::RegisterBenchmark("Upper UTF16 Latin/veltrin", upperOurs);
  benchmark::RegisterBenchmark("Upper UTF16 Latin/icu", upperIcu);
  return true;
}();

}  // namespace
