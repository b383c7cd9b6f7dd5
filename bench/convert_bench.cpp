// Conversion throughput: this library against iconv and ICU on the same inputs in the same
// run. Each row converts one text (about 1 MB of UTF-16) per iteration; a summary after the
// run gives MB/s of input and the ratio to the best peer.
#include <benchmark/benchmark.h>
#include <iconv.h>
#include <unicode/ucnv.h>

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <map>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "codepage/cpbody.h"
#include "nls1.h"
#include "veltrin.h"

namespace {

struct Page {
  const char *row;    // as the summary shows it
  uint16_t id;        // this library's code page number
  const char *iconv;  // the C library's name
  const char *icu;    // ICU's name
  int mix;            // 0 Western text, 1 Japanese text
  uint16_t key = 0;   // where the row keeps its text when the page has two rows
};

const Page kPages[] = {
    {"Latin1", 819, "ISO-8859-1", "ISO-8859-1", 0},     {"MS1252", 1252, "CP1252", "windows-1252", 0},
    {"EBCDIC37", 37, "IBM037", "ibm-37_P100-1995", 0}, {"UTF-8", 57352, "UTF-8", "UTF-8", 0},
    {"MS932", 932, "WINDOWS-31J", "ibm-943_P15A-2003", 1}, {"JapanEUC", 954, "EUC-JP", "ibm-33722_P12A_P12A-2009_U2", 1},
    {"IBM930", 930, "IBM930", "ibm-930_P120-1999", 1},
    {"UTF-8(ja)", 57352, "UTF-8", "UTF-8", 1, 2},
};

struct Loaded {
  VLLocale locale{};
  std::u16string text;  // characters this page and both peers round-trip
  std::string bytes;    // the same text in the page
};
std::map<uint16_t, Loaded> g_pages;

VLLocale localeFor(VLObjEntry *e) {
  VLLocale l{};
  l.codePage = e;
  if (vl::cp::maxLen(e) == 1) l.flags |= VL_LF_SINGLEBYTE;
  if (vl::cp::isShift(e)) l.flags |= VL_LF_SHIFT;
  return l;
}

bool roundTrips(VLLocale *l, char16_t c, UConverter *icu) {
  VLUChar u = c, back[4];
  char b[8];
  int32_t n = VLUnicodeToStringEx(l, b, 0, sizeof b, &u, 1, VL_OPT_NULLTERM);
  if (n < 2 || VLStringToUnicodeEx(back, 4, l, b, 0, n - 1, 0) != 1 || back[0] != u) return false;
  UErrorCode err = U_ZERO_ERROR;
  UChar src = c, again[4];
  char ib[16];
  int32_t k = ucnv_fromUChars(icu, ib, sizeof ib, &src, 1, &err);
  if (U_FAILURE(err)) return false;
  int32_t m = ucnv_toUChars(icu, again, 4, ib, k, &err);
  return U_SUCCESS(err) && m == 1 && again[0] == src && std::memcmp(ib, b, static_cast<size_t>(k)) == 0 &&
         k == n - 1;
}

// Text of about `units` characters: Western prose is mostly ASCII letters with an accented
// letter now and then; Japanese alternates runs of ideographs and kana with ASCII.
std::u16string makeText(VLLocale *l, UConverter *icu, int mix, size_t units) {
  std::vector<char16_t> ascii, other;
  for (char16_t c = 0x20; c < 0x7F; ++c)
    if (roundTrips(l, c, icu)) ascii.push_back(c);
  const std::pair<char16_t, char16_t> ranges[] = {{0xA0, 0x17F}, {0x3041, 0x30FF}, {0x4E00, 0x9FA5}};
  for (auto [lo, hi] : ranges)
    for (char16_t c = lo; c <= hi; ++c)
      if ((mix == 0) == (c < 0x3000) && roundTrips(l, c, icu)) other.push_back(c);
  std::mt19937 rng(7);
  std::u16string t;
  if (ascii.empty()) return t;
  std::uniform_int_distribution<int> len(1, 12), pct(0, 99);
  while (t.size() < units) {
    bool native = !other.empty() && pct(rng) < (mix ? 55 : 8);
    const auto &from = native ? other : ascii;
    std::uniform_int_distribution<size_t> pick(0, from.size() - 1);
    for (int k = mix ? len(rng) : 1; k--;) t += from[pick(rng)];
  }
  return t;
}

// ---- The three contenders ------------------------------------------------------------

void toUtf16Ours(benchmark::State &st, uint16_t id) {
  Loaded &p = g_pages[id];
  std::vector<VLUChar> out(p.bytes.size() + 16);
  for (auto _ : st) {
    int32_t n = VLStringToUnicodeEx(out.data(), static_cast<int32_t>(out.size()), &p.locale, p.bytes.data(), 0,
                                    static_cast<int32_t>(p.bytes.size()), 0);
    benchmark::DoNotOptimize(n);
  }
  st.SetBytesProcessed(static_cast<int64_t>(st.iterations() * p.bytes.size()));
}

void fromUtf16Ours(benchmark::State &st, uint16_t id) {
  Loaded &p = g_pages[id];
  std::vector<char> out(p.text.size() * 4 + 16);
  auto *in = reinterpret_cast<const VLUChar *>(p.text.data());
  for (auto _ : st) {
    int32_t n = VLUnicodeToStringEx(&p.locale, out.data(), 0, static_cast<int32_t>(out.size()), in,
                                    static_cast<int32_t>(p.text.size()), 0);
    benchmark::DoNotOptimize(n);
  }
  st.SetBytesProcessed(static_cast<int64_t>(st.iterations() * p.text.size() * 2));
}

// The primitive, on the text of the family's row.
void fromUtf16Prim(benchmark::State &st, uint16_t id) {
  Loaded &p = g_pages[id];
  std::vector<unsigned char> out(p.text.size() * 4 + 16);
  auto *in = reinterpret_cast<const VLUChar *>(p.text.data());
  for (auto _ : st) benchmark::DoNotOptimize(VLCpUnicodeToStr(p.locale.codePage, in, static_cast<int32_t>(p.text.size()), 0, out.data()));
  st.SetBytesProcessed(static_cast<int64_t>(st.iterations() * p.text.size() * 2));
}

void viaIconv(benchmark::State &st, const char *to, const char *from, const std::string &in) {
  iconv_t cd = iconv_open(to, from);
  if (cd == reinterpret_cast<iconv_t>(-1)) {
    st.SkipWithError("iconv_open");
    return;
  }
  std::vector<char> out(in.size() * 4 + 16);
  for (auto _ : st) {
    char *ip = const_cast<char *>(in.data()), *op = out.data();
    size_t il = in.size(), ol = out.size();
    iconv(cd, nullptr, nullptr, nullptr, nullptr);
    size_t r = iconv(cd, &ip, &il, &op, &ol);
    iconv(cd, nullptr, nullptr, &op, &ol);
    if (r == static_cast<size_t>(-1)) {
      st.SkipWithError("iconv refused the input");
      break;
    }
    benchmark::DoNotOptimize(r);
  }
  iconv_close(cd);
  st.SetBytesProcessed(static_cast<int64_t>(st.iterations() * in.size()));
}

std::string asBytes(const std::u16string &t) { return std::string(reinterpret_cast<const char *>(t.data()), t.size() * 2); }

void toUtf16Icu(benchmark::State &st, const char *name, const std::string &in) {
  UErrorCode err = U_ZERO_ERROR;
  UConverter *c = ucnv_open(name, &err);
  std::vector<UChar> out(in.size() + 16);
  for (auto _ : st) {
    err = U_ZERO_ERROR;
    int32_t n = ucnv_toUChars(c, out.data(), static_cast<int32_t>(out.size()), in.data(),
                              static_cast<int32_t>(in.size()), &err);
    benchmark::DoNotOptimize(n);
  }
  ucnv_close(c);
  st.SetBytesProcessed(static_cast<int64_t>(st.iterations() * in.size()));
}

void fromUtf16Icu(benchmark::State &st, const char *name, const std::u16string &in) {
  UErrorCode err = U_ZERO_ERROR;
  UConverter *c = ucnv_open(name, &err);
  std::vector<char> out(in.size() * 4 + 16);
  for (auto _ : st) {
    err = U_ZERO_ERROR;
    int32_t n = ucnv_fromUChars(c, out.data(), static_cast<int32_t>(out.size()), in.data(),
                                static_cast<int32_t>(in.size()), &err);
    benchmark::DoNotOptimize(n);
  }
  ucnv_close(c);
  st.SetBytesProcessed(static_cast<int64_t>(st.iterations() * in.size() * 2));
}

// Code page to code page: the streaming engine, one call over the whole text.
void pairOurs(benchmark::State &st, uint16_t to, uint16_t from) {
  Loaded &s = g_pages[from], &t = g_pages[to];
  VLConversion *h = VLOpenConversion(&t.locale, &s.locale);
  std::vector<unsigned char> out(s.bytes.size() * 4 + 16);
  for (auto _ : st) {
    h->sourceState = h->targetState = 0;
    unsigned char *o = out.data();
    uint32_t room = static_cast<uint32_t>(out.size());
    auto *p = reinterpret_cast<const unsigned char *>(s.bytes.data());
    uint32_t left = static_cast<uint32_t>(s.bytes.size());
    benchmark::DoNotOptimize(VLConvertBuffer(h, &o, &room, &p, &left, 0));
  }
  VLCloseConversion(h);
  st.SetBytesProcessed(static_cast<int64_t>(st.iterations() * s.bytes.size()));
}

void pairIcu(benchmark::State &st, const char *to, const char *from, const std::string &in) {
  std::vector<char> out(in.size() * 4 + 16);
  for (auto _ : st) {
    UErrorCode err = U_ZERO_ERROR;
    int32_t n = ucnv_convert(to, from, out.data(), static_cast<int32_t>(out.size()), in.data(),
                             static_cast<int32_t>(in.size()), &err);
    benchmark::DoNotOptimize(n);
  }
  st.SetBytesProcessed(static_cast<int64_t>(st.iterations() * in.size()));
}

// The machine's limit: a copy of the row's input bytes.
void viaMemcpy(benchmark::State &st, const std::string &in) {
  std::vector<char> out(in.size());
  for (auto _ : st) {
    std::memcpy(out.data(), in.data(), in.size());
    benchmark::DoNotOptimize(out.data());
    benchmark::ClobberMemory();
  }
  st.SetBytesProcessed(static_cast<int64_t>(st.iterations() * in.size()));
}

// The one-call service layer between code page numbers.
void translateOurs(benchmark::State &st, uint32_t to, uint32_t from, const std::string &in) {
  std::vector<char> out(in.size() * 4 + 16);
  for (auto _ : st) {
    int32_t count = 0;
    uint32_t rc = 0;
    int32_t n = NLS1_TranslateString(to, out.data(), static_cast<int32_t>(out.size()), from, in.data(),
                                     static_cast<int32_t>(in.size()), &count, 0, &rc);
    if (n < 0) {
      st.SkipWithError("NLS1_TranslateString failed");
      break;
    }
    benchmark::DoNotOptimize(n);
  }
  st.SetBytesProcessed(static_cast<int64_t>(st.iterations() * in.size()));
}

// ---- Summary --------------------------------------------------------------------------

class Summary : public benchmark::ConsoleReporter {
 public:
  void ReportRuns(const std::vector<Run> &runs) override {
    ConsoleReporter::ReportRuns(runs);
    for (const Run &r : runs) {
      auto it = r.counters.find("bytes_per_second");
      if (r.error_occurred || it == r.counters.end()) continue;
      // With repetitions, the median stands for the row.
      if (r.run_type == Run::RT_Aggregate && r.aggregate_name != "median") continue;
      std::string name = r.run_name.str();
      size_t slash = name.rfind('/');
      auto &cell = rows_[name.substr(0, slash)][name.substr(slash + 1)];
      if (r.run_type == Run::RT_Aggregate || cell == 0) cell = it->second.value / 1e6;
      if (std::find(order_.begin(), order_.end(), name.substr(0, slash)) == order_.end())
        order_.push_back(name.substr(0, slash));
    }
  }
  void print() const {
    std::printf("\n%-24s %10s %10s %10s %10s %8s %10s\n", "row (MB/s of input)", "veltrin", "iconv", "libc", "icu",
                "ratio", "memcpy");
    for (const std::string &row : order_) {
      const auto &m = rows_.at(row);
      auto get = [&](const char *k) { return m.count(k) ? m.at(k) : 0.0; };
      double best = std::max({get("iconv"), get("libc"), get("icu")});
      std::printf("%-24s %10.0f %10.0f %10.0f %10.0f %8.2f %10.0f\n", row.c_str(), get("veltrin"), get("iconv"),
                  get("libc"), get("icu"), best > 0 ? get("veltrin") / best : 0.0, get("memcpy"));
    }
  }

 private:
  std::map<std::string, std::map<std::string, double>> rows_;
  std::vector<std::string> order_;
};

}  // namespace

int main(int argc, char **argv) {
  benchmark::Initialize(&argc, argv);
  if (!std::filesystem::exists(std::string(VL_TEST_DEFS_DIR) + "/control.nls")) {
    std::fprintf(stderr, "no generated definitions in %s\n", VL_TEST_DEFS_DIR);
    return 1;
  }
  if (VLInit(VL_TEST_DEFS_DIR, nullptr, nullptr, 0, VL_OPT_NOBUILTIN) != 0) return 1;
  constexpr size_t kUnits = 512 * 1024;
  for (const Page &pg : kPages) {
    uint32_t rc;
    VLObjEntry *e = VLGetObjFromID(vlglobals->objManager, VL_OBJ_CODEPAGE, pg.id, 0, &rc);
    UErrorCode err = U_ZERO_ERROR;
    UConverter *icu = ucnv_open(pg.icu, &err);
    if (!e || U_FAILURE(err)) {
      std::fprintf(stderr, "%s: skipped (%s)\n", pg.row, e ? "ICU has no such converter" : "not generated");
      if (icu) ucnv_close(icu);
      continue;
    }
    uint16_t key = pg.key ? pg.key : pg.id;
    Loaded &p = g_pages[key];
    p.locale = localeFor(e);
    p.text = makeText(&p.locale, icu, pg.mix, kUnits);
    ucnv_close(icu);
    std::vector<char> b(p.text.size() * 4 + 16);
    int32_t n = VLUnicodeToStringEx(&p.locale, b.data(), 0, static_cast<int32_t>(b.size()),
                                    reinterpret_cast<const VLUChar *>(p.text.data()), static_cast<int32_t>(p.text.size()),
                                    VL_OPT_NULLTERM);
    p.bytes.assign(b.data(), static_cast<size_t>(std::max(n - 1, 0)));
    std::string row = pg.row, u16 = asBytes(p.text);
    const Loaded &lp = p;
    benchmark::RegisterBenchmark((row + ">UTF16/veltrin").c_str(), toUtf16Ours, key);
    benchmark::RegisterBenchmark((row + ">UTF16/memcpy").c_str(), viaMemcpy, lp.bytes);
    benchmark::RegisterBenchmark((row + ">UTF16/iconv").c_str(), viaIconv, "UTF-16LE", pg.iconv, lp.bytes);
    benchmark::RegisterBenchmark((row + ">UTF16/icu").c_str(), toUtf16Icu, pg.icu, lp.bytes);
    benchmark::RegisterBenchmark(("UTF16>" + row + "/veltrin").c_str(), fromUtf16Ours, key);
    benchmark::RegisterBenchmark(("UTF16>" + row + "/memcpy").c_str(), viaMemcpy, u16);
    benchmark::RegisterBenchmark(("UTF16>" + row + "/iconv").c_str(), viaIconv, pg.iconv, "UTF-16LE", u16);
    benchmark::RegisterBenchmark(("UTF16>" + row + "/icu").c_str(), fromUtf16Icu, pg.icu, lp.text);
    if (vl::cp::maxLen(e) == 1) {
      std::string prim = "VLCpUnicodeToStr " + row;
      benchmark::RegisterBenchmark((prim + "/veltrin").c_str(), fromUtf16Prim, key);
      benchmark::RegisterBenchmark((prim + "/iconv").c_str(), viaIconv, pg.iconv, "UTF-16LE", u16);
      benchmark::RegisterBenchmark((prim + "/icu").c_str(), fromUtf16Icu, pg.icu, lp.text);
    }
  }
  // One pair without UTF-16 on either side: Japanese from the PC page to EUC.
  if (g_pages.count(932) && g_pages.count(954)) {
    // The Japanese text of the EUC row, kept to what the PC page also round-trips.
    UErrorCode err = U_ZERO_ERROR;
    UConverter *icu = ucnv_open("ibm-943_P15A-2003", &err);
    std::u16string both;
    for (char16_t c : g_pages[954].text)
      if (roundTrips(&g_pages[932].locale, c, icu)) both += c;
    ucnv_close(icu);
    std::vector<char> b(both.size() * 4 + 16);
    int32_t n = VLUnicodeToString(&g_pages[932].locale, b.data(), static_cast<int32_t>(b.size()),
                                  reinterpret_cast<const VLUChar *>(both.data()), static_cast<int32_t>(both.size()),
                                  0);
    static std::string in;
    in.assign(b.data(), static_cast<size_t>(n));
    g_pages[1].bytes = in;  // the engine row reads its input from here
    g_pages[1].locale = g_pages[932].locale;
    benchmark::RegisterBenchmark("MS932>JapanEUC/veltrin", pairOurs, 954, 1);
    benchmark::RegisterBenchmark("MS932>JapanEUC/iconv", viaIconv, "EUC-JP", "WINDOWS-31J", in);
    benchmark::RegisterBenchmark("MS932>JapanEUC/icu", pairIcu, "ibm-33722_P12A_P12A-2009_U2", "ibm-943_P15A-2003", in);
  }
  // The service layer, against iconv on the same bytes.
  if (g_pages.count(932) && g_pages.count(930) && g_pages.count(1252) && g_pages.count(37)) {
    static std::string sjis, u16, latin;
    sjis = g_pages[932].bytes;
    u16 = asBytes(g_pages[930].text);
    // Text of the EBCDIC row (Latin-1 letters), which the Windows page holds too.
    const std::u16string &t = g_pages[37].text;
    std::vector<char> b(t.size() + 16);
    int32_t n = VLUnicodeToString(&g_pages[1252].locale, b.data(), static_cast<int32_t>(b.size()),
                                  reinterpret_cast<const VLUChar *>(t.data()), static_cast<int32_t>(t.size()), 0);
    latin.assign(b.data(), static_cast<size_t>(std::max(n, 0)));
    const struct {
      const char *row;
      uint32_t to, from;
      const char *iconvTo, *iconvFrom;
      const std::string *in;
    } rows[] = {{"NLS1 MS932>1200", 1200, 932, "UTF-16LE", "WINDOWS-31J", &sjis},
                {"NLS1 1200>IBM930", 930, 1200, "IBM930", "UTF-16LE", &u16},
                {"NLS1 MS1252>EBCDIC37", 37, 1252, "IBM037", "CP1252", &latin}};
    for (const auto &r : rows) {
      std::string row = r.row;
      benchmark::RegisterBenchmark((row + "/veltrin").c_str(), translateOurs, r.to, r.from, *r.in);
      benchmark::RegisterBenchmark((row + "/memcpy").c_str(), viaMemcpy, *r.in);
      benchmark::RegisterBenchmark((row + "/iconv").c_str(), viaIconv, r.iconvTo, r.iconvFrom, *r.in);
    }
  }
  Summary summary;
  benchmark::RunSpecifiedBenchmarks(&summary);
  summary.print();
  benchmark::Shutdown();
  VLTerm();
  return 0;
}
