// Case-insensitive comparison of random Latin text: VLStrcmp against strcasecmp,
// VLWcscmp against wcscasecmp and VLStrcmpU against ICU's u_strcasecmp, on the same
// word pairs (each word against a copy with its case changed at random, one pair in four
// differing in a letter). The rows join the summary the conversion benchmark prints.
#include <benchmark/benchmark.h>
#include <strings.h>
#include <unicode/uchar.h>
#include <unicode/ustring.h>
#include <wchar.h>

#include <random>
#include <string>
#include <vector>

#include "veltrin.h"

namespace {

struct Pairs {
  std::vector<std::string> a, b;        // MS1252 bytes
  std::vector<std::u16string> ua, ub;   // UTF-16
  std::vector<std::wstring> wa, wb;     // UTF-32 for the C library
  std::vector<std::vector<VLWChar>> va, vb;
  size_t bytes = 0;                     // of both sides, in bytes of the code page
};

const Pairs &pairs() {
  static const Pairs p = [] {
    // ASCII and Latin-1 letters (all single bytes in MS1252 and equal to their code points).
    std::u16string letters = u"abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ";
    for (char16_t c = 0xE0; c <= 0xFE; ++c)
      if (c != 0xF7) letters += c;
    std::mt19937 rng(17);
    Pairs r;
    for (int i = 0; i < 4096; ++i) {
      std::u16string a, b;
      const size_t len = 4 + rng() % 16;
      for (size_t k = 0; k < len; ++k) {
        char16_t c = letters[rng() % letters.size()];
        a += c;
        char16_t u = c >= 0xE0 ? static_cast<char16_t>(c - 0x20) : (c >= 'a' && c <= 'z') ? static_cast<char16_t>(c - 0x20) : c;
        b += rng() % 2 ? u : c;
      }
      if (rng() % 4 == 0) b[rng() % b.size()] = letters[rng() % letters.size()];
      for (auto [u, s, w, v] : {std::tuple{&a, &r.a, &r.wa, &r.va}, std::tuple{&b, &r.b, &r.wb, &r.vb}}) {
        s->emplace_back(u->begin(), u->end());
        w->emplace_back(u->begin(), u->end());
        v->emplace_back(u->begin(), u->end());
        v->back().push_back(0);
        r.bytes += u->size();
      }
      r.ua.push_back(a);
      r.ub.push_back(b);
    }
    return r;
  }();
  return p;
}

VLLocale *latin() {
  static VLLocale *l = [] {
    uint32_t rc;
    return VLGetLocale("English_UnitedStates.MS1252", 0, &rc);
  }();
  return l;
}

template <class Cmp>
void run(benchmark::State &st, Cmp cmp) {
  const Pairs &p = pairs();
  for (auto _ : st) {
    int sum = 0;
    for (size_t i = 0; i < p.a.size(); ++i) sum += cmp(p, i) > 0;
    benchmark::DoNotOptimize(sum);
  }
  st.SetBytesProcessed(static_cast<int64_t>(st.iterations() * p.bytes));
}

const bool kRegistered = [] {
  const uint32_t nocase = VL_CMP_NOCASE;
  benchmark::RegisterBenchmark("NoCase bytes/veltrin", [=](benchmark::State &st) {
    if (!latin()) return st.SkipWithError("no MS1252 locale");
    run(st, [=](const Pairs &p, size_t i) { return VLStrcmp(latin(), p.a[i].c_str(), -1, p.b[i].c_str(), -1, nocase); });
  });
  benchmark::RegisterBenchmark("NoCase bytes/libc", [](benchmark::State &st) {
    run(st, [](const Pairs &p, size_t i) { return strcasecmp(p.a[i].c_str(), p.b[i].c_str()); });
  });
  benchmark::RegisterBenchmark("NoCase W/veltrin", [=](benchmark::State &st) {
    if (!latin()) return st.SkipWithError("no MS1252 locale");
    run(st, [=](const Pairs &p, size_t i) { return VLWcscmp(latin(), p.va[i].data(), -1, p.vb[i].data(), -1, nocase); });
  });
  benchmark::RegisterBenchmark("NoCase W/libc", [](benchmark::State &st) {
    run(st, [](const Pairs &p, size_t i) { return wcscasecmp(p.wa[i].c_str(), p.wb[i].c_str()); });
  });
  benchmark::RegisterBenchmark("NoCase UTF16/veltrin", [=](benchmark::State &st) {
    if (!latin()) return st.SkipWithError("no MS1252 locale");
    run(st, [=](const Pairs &p, size_t i) {
      return VLStrcmpU(latin(), reinterpret_cast<const VLUChar *>(p.ua[i].c_str()), -1,
                       reinterpret_cast<const VLUChar *>(p.ub[i].c_str()), -1, nocase);
    });
  });
  benchmark::RegisterBenchmark("NoCase UTF16/icu", [](benchmark::State &st) {
    run(st, [](const Pairs &p, size_t i) { return u_strcasecmp(p.ua[i].c_str(), p.ub[i].c_str(), U_FOLD_CASE_DEFAULT); });
  });
  return true;
}();

}  // namespace
