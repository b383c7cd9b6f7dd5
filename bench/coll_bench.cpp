// Collation speed: VLStrcoll and VLStrxfrm against the C library's strcoll_l/strxfrm_l
// and ICU's ucol_strcollUTF8/ucol_strcoll/ucol_getSortKey, Swedish, on the same random word pairs in
// the same run (items_per_second = comparisons or keys per second). The C library's
// locale comes from the tests' localedef cache beside the definitions directory.
#include <benchmark/benchmark.h>
#include <locale.h>
#include <string.h>
#include <unicode/ucol.h>
#include <unicode/ustring.h>

#include <cstdlib>
#include <filesystem>
#include <random>
#include <string>
#include <vector>

#include "veltrin.h"

namespace {

constexpr size_t kWords = 1000;

const std::vector<std::string> &words() {
  static const std::vector<std::string> w = [] {
    const char *letters[] = {"a", "b", "c", "d", "e", "f", "g", "h", "i", "k", "l", "m", "n", "o", "p",
                             "r", "s", "t", "u", "v", "y", "\xc3\xa5", "\xc3\xa4", "\xc3\xb6", "\xc3\xa9",
                             "A", "S", "\xc3\x85", "\xc3\x96", "-"};
    std::mt19937 rng(12);
    std::uniform_int_distribution<size_t> len(3, 10), pick(0, std::size(letters) - 1);
    std::vector<std::string> out;
    for (size_t i = 0; i < kWords; ++i) {
      std::string s;
      for (size_t k = len(rng); k--;) s += letters[pick(rng)];
      out.push_back(s);
    }
    return out;
  }();
  return w;
}

VLLocale *ours() {
  static VLLocale *l = [] {
    uint32_t rc;
    return VLGetLocale("Swedish_Sweden.UTF-8", 0, &rc);
  }();
  return l;
}

locale_t theirs() {
  static locale_t c = [] {
    const std::string dir = (std::filesystem::path(VL_TEST_DEFS_DIR).parent_path() / "coll-oracle").string();
    setenv("LOCPATH", dir.c_str(), 1);
    locale_t r = newlocale(LC_COLLATE_MASK, "sv_SE.UTF-8", nullptr);
    unsetenv("LOCPATH");
    return r;
  }();
  return c;
}

UCollator *icu() {
  static UCollator *c = [] {
    UErrorCode err = U_ZERO_ERROR;
    UCollator *r = ucol_open("sv", &err);
    return U_FAILURE(err) ? nullptr : r;
  }();
  return c;
}

void collOurs(benchmark::State &st) {
  const auto &w = words();
  if (!ours() || !ours()->sort) return st.SkipWithError("no Swedish sort generated");
  for (auto _ : st)
    for (size_t i = 0; i + 1 < w.size(); ++i)
      benchmark::DoNotOptimize(VLStrcoll(ours(), w[i].data(), static_cast<int32_t>(w[i].size()), w[i + 1].data(),
                                         static_cast<int32_t>(w[i + 1].size()), 0));
  st.SetItemsProcessed(static_cast<int64_t>(st.iterations() * (w.size() - 1)));
}

void collC(benchmark::State &st) {
  const auto &w = words();
  if (!theirs()) return st.SkipWithError("no sv_SE.UTF-8 built by the tests");
  for (auto _ : st)
    for (size_t i = 0; i + 1 < w.size(); ++i) benchmark::DoNotOptimize(strcoll_l(w[i].c_str(), w[i + 1].c_str(), theirs()));
  st.SetItemsProcessed(static_cast<int64_t>(st.iterations() * (w.size() - 1)));
}

void collIcu(benchmark::State &st) {
  const auto &w = words();
  if (!icu()) return st.SkipWithError("ICU has no Swedish collator");
  for (auto _ : st)
    for (size_t i = 0; i + 1 < w.size(); ++i) {
      UErrorCode err = U_ZERO_ERROR;
      benchmark::DoNotOptimize(ucol_strcollUTF8(icu(), w[i].data(), static_cast<int32_t>(w[i].size()),
                                                w[i + 1].data(), static_cast<int32_t>(w[i + 1].size()), &err));
    }
  st.SetItemsProcessed(static_cast<int64_t>(st.iterations() * (w.size() - 1)));
}

// The same words as UTF-16, converted once outside the timing.
const std::vector<std::u16string> &words16() {
  static const std::vector<std::u16string> u = [] {
    std::vector<std::u16string> out;
    for (const std::string &s : words()) {
      UChar b[64];
      int32_t n = 0;
      UErrorCode err = U_ZERO_ERROR;
      u_strFromUTF8(b, 64, &n, s.data(), static_cast<int32_t>(s.size()), &err);
      out.emplace_back(reinterpret_cast<const char16_t *>(b), static_cast<size_t>(n));
    }
    return out;
  }();
  return u;
}

void collOursU(benchmark::State &st) {
  const auto &w = words16();
  if (!ours() || !ours()->sort) return st.SkipWithError("no Swedish sort generated");
  for (auto _ : st)
    for (size_t i = 0; i + 1 < w.size(); ++i)
      benchmark::DoNotOptimize(VLStrcollU(ours(), reinterpret_cast<const VLUChar *>(w[i].data()),
                                          static_cast<int32_t>(w[i].size()),
                                          reinterpret_cast<const VLUChar *>(w[i + 1].data()),
                                          static_cast<int32_t>(w[i + 1].size()), 0));
  st.SetItemsProcessed(static_cast<int64_t>(st.iterations() * (w.size() - 1)));
}

void collIcuU(benchmark::State &st) {
  const auto &w = words16();
  if (!icu()) return st.SkipWithError("ICU has no Swedish collator");
  for (auto _ : st)
    for (size_t i = 0; i + 1 < w.size(); ++i)
      benchmark::DoNotOptimize(ucol_strcoll(icu(), reinterpret_cast<const UChar *>(w[i].data()),
                                            static_cast<int32_t>(w[i].size()),
                                            reinterpret_cast<const UChar *>(w[i + 1].data()),
                                            static_cast<int32_t>(w[i + 1].size())));
  st.SetItemsProcessed(static_cast<int64_t>(st.iterations() * (w.size() - 1)));
}

void keyOurs(benchmark::State &st) {
  const auto &w = words();
  if (!ours() || !ours()->sort) return st.SkipWithError("no Swedish sort generated");
  char k[512];
  for (auto _ : st)
    for (const std::string &s : w)
      benchmark::DoNotOptimize(VLStrxfrm(ours(), k, sizeof k, s.data(), static_cast<int32_t>(s.size()), 0));
  st.SetItemsProcessed(static_cast<int64_t>(st.iterations() * w.size()));
}

void keyC(benchmark::State &st) {
  const auto &w = words();
  if (!theirs()) return st.SkipWithError("no sv_SE.UTF-8 built by the tests");
  char k[1024];
  for (auto _ : st)
    for (const std::string &s : w) benchmark::DoNotOptimize(strxfrm_l(k, s.c_str(), sizeof k, theirs()));
  st.SetItemsProcessed(static_cast<int64_t>(st.iterations() * w.size()));
}

// ICU keys UTF-16 only.
void keyIcu(benchmark::State &st) {
  const auto &w = words();
  if (!icu()) return st.SkipWithError("ICU has no Swedish collator");
  const auto &u = words16();
  uint8_t k[512];
  for (auto _ : st)
    for (const std::u16string &s : u)
      benchmark::DoNotOptimize(ucol_getSortKey(icu(), reinterpret_cast<const UChar *>(s.data()),
                                               static_cast<int32_t>(s.size()), k, sizeof k));
  st.SetItemsProcessed(static_cast<int64_t>(st.iterations() * w.size()));
}

BENCHMARK(collOurs)->Name("Swedish strcoll/veltrin");
BENCHMARK(collC)->Name("Swedish strcoll/clib");
BENCHMARK(collIcu)->Name("Swedish strcoll/icu");
BENCHMARK(collOursU)->Name("Swedish strcoll UTF-16/veltrin");
BENCHMARK(collIcuU)->Name("Swedish strcoll UTF-16/icu");
BENCHMARK(keyOurs)->Name("Swedish sortkey/veltrin");
BENCHMARK(keyC)->Name("Swedish sortkey/clib");
BENCHMARK(keyIcu)->Name("Swedish sortkey/icu");

}  // namespace
