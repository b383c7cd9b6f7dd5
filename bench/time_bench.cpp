// Writing and reading a full date and time: this library against the C library's
// strftime/strptime in the same locale and ICU's udat_format/udat_parse, same times, same
// run. A summary after the run gives CPU nanoseconds a call (the machine may be shared)
// and the ratio to each peer (above 1: this library is faster).
#include <benchmark/benchmark.h>
#include <locale.h>
#include <unicode/udat.h>
#include <unicode/ustring.h>

#include <cstdio>
#include <cstring>
#include <ctime>
#include <filesystem>
#include <map>
#include <string>
#include <vector>

#include "veltrin.h"

namespace {

// A weekday, day, month name, year and the time: the C library's and ICU's spelling of
// the same text.
constexpr const char *kOurs = "%A %#d %B %Y %H:%M:%S";
constexpr const char *kLibc = "%A %-d %B %Y %H:%M:%S";
constexpr const char *kIcu = "EEEE d MMMM y HH:mm:ss";

struct Case {
  const char *row, *locale, *native, *icu;
};
const Case kCases[] = {
    {"English", "English_UnitedStates.US-ASCII", "C", "en_US"},
    {"German.UTF-8", "German_Germany.UTF-8", "C.UTF-8", "de_DE"},
};

std::vector<std::tm> times() {
  std::vector<std::tm> v;
  for (int d = 0; d < 64; ++d) {
    std::time_t s = 1700000000 + d * 86400 * 5 + d * 3671;
    std::tm t;
    gmtime_r(&s, &t);
    v.push_back(t);
  }
  return v;
}
const std::vector<std::tm> kTimes = times();

VLLocale *ours(const Case &c) {
  static std::map<std::string, VLLocale *> open;
  VLLocale *&l = open[c.locale];
  uint32_t rc;
  if (!l) l = VLGetLocale(c.locale, 0, &rc);
  return l;
}

void formatOurs(benchmark::State &st, Case c) {
  VLLocale *l = ours(c);
  char b[128];
  size_t i = 0;
  for (auto _ : st) {
    int32_t n = VLTimeToString(l, &kTimes[i++ & 63], b, sizeof b, kOurs, -1, 0);
    benchmark::DoNotOptimize(n);
  }
}
void parseOurs(benchmark::State &st, Case c) {
  VLLocale *l = ours(c);
  std::vector<std::string> texts;
  for (const std::tm &t : kTimes) {
    char b[128];
    texts.emplace_back(b, VLTimeToString(l, &t, b, sizeof b, kOurs, -1, 0));
  }
  size_t i = 0;
  for (auto _ : st) {
    std::tm t{};
    const std::string &s = texts[i++ & 63];
    benchmark::DoNotOptimize(VLStringToTime(l, &t, s.data(), static_cast<int32_t>(s.size()), kOurs, -1, 0));
  }
}

// The C library in the locale the sources share (de_DE needs localedef; C.UTF-8 stands
// in with English names when it is absent, so the row still measures the same work).
locale_t nativeLocale(const Case &c) {
  const char *want = std::strcmp(c.row, "English") ? "de_DE.UTF-8" : "C";
  locale_t l = newlocale(LC_ALL_MASK, want, nullptr);
  return l ? l : newlocale(LC_ALL_MASK, c.native, nullptr);
}
void formatLibc(benchmark::State &st, Case c) {
  locale_t l = nativeLocale(c);
  char b[128];
  size_t i = 0;
  for (auto _ : st) benchmark::DoNotOptimize(strftime_l(b, sizeof b, kLibc, &kTimes[i++ & 63], l));
  freelocale(l);
}
void parseLibc(benchmark::State &st, Case c) {
  locale_t l = nativeLocale(c);
  std::vector<std::string> texts;
  for (const std::tm &t : kTimes) {
    char b[128];
    texts.emplace_back(b, strftime_l(b, sizeof b, kLibc, &t, l));
  }
  // strptime has no _l form: the thread's locale is switched for the run.
  locale_t old = uselocale(l);
  size_t i = 0;
  for (auto _ : st) {
    std::tm t{};
    benchmark::DoNotOptimize(strptime(texts[i++ & 63].c_str(), "%A %d %B %Y %H:%M:%S", &t));
  }
  uselocale(old);
  freelocale(l);
}

UDateFormat *icuFormat(const Case &c) {
  UErrorCode err = U_ZERO_ERROR;
  UChar pat[64], zone[8];
  u_uastrcpy(pat, kIcu);
  u_uastrcpy(zone, "UTC");
  UDateFormat *f = udat_open(UDAT_PATTERN, UDAT_PATTERN, c.icu, zone, -1, pat, -1, &err);
  return U_FAILURE(err) ? nullptr : f;
}
UDate icuDate(const std::tm &t) {
  std::tm c = t;
  return static_cast<UDate>(timegm(&c)) * 1000.0;
}
void formatIcu(benchmark::State &st, Case c) {
  UDateFormat *f = icuFormat(c);
  if (!f) return st.SkipWithError("no ICU format");
  UChar b[128];
  size_t i = 0;
  for (auto _ : st) {
    UErrorCode err = U_ZERO_ERROR;
    benchmark::DoNotOptimize(udat_format(f, icuDate(kTimes[i++ & 63]), b, 128, nullptr, &err));
  }
  udat_close(f);
}
void parseIcu(benchmark::State &st, Case c) {
  UDateFormat *f = icuFormat(c);
  if (!f) return st.SkipWithError("no ICU format");
  std::vector<std::u16string> texts;
  for (const std::tm &t : kTimes) {
    UChar b[128];
    UErrorCode err = U_ZERO_ERROR;
    int32_t n = udat_format(f, icuDate(t), b, 128, nullptr, &err);
    texts.emplace_back(reinterpret_cast<char16_t *>(b), static_cast<size_t>(n));
  }
  size_t i = 0;
  for (auto _ : st) {
    UErrorCode err = U_ZERO_ERROR;
    const std::u16string &s = texts[i++ & 63];
    benchmark::DoNotOptimize(
        udat_parse(f, reinterpret_cast<const UChar *>(s.data()), static_cast<int32_t>(s.size()), nullptr, &err));
  }
  udat_close(f);
}

class Summary : public benchmark::ConsoleReporter {
 public:
  void ReportRuns(const std::vector<Run> &runs) override {
    ConsoleReporter::ReportRuns(runs);
    for (const Run &r : runs) {
      if (r.error_occurred) continue;
      std::string name = r.benchmark_name();
      size_t slash = name.rfind('/');
      std::string row = name.substr(0, slash);
      rows_[row][name.substr(slash + 1)] = r.GetAdjustedCPUTime();
      if (std::find(order_.begin(), order_.end(), row) == order_.end()) order_.push_back(row);
    }
  }
  void print() const {
    std::printf("\n%-22s %9s %9s %9s %9s %9s\n", "row (CPU ns a call)", "veltrin", "libc", "icu", "vs libc", "vs icu");
    for (const std::string &row : order_) {
      const auto &m = rows_.at(row);
      auto get = [&](const char *k) { return m.count(k) ? m.at(k) : 0.0; };
      double v = get("veltrin");
      std::printf("%-22s %9.0f %9.0f %9.0f %9.2f %9.2f\n", row.c_str(), v, get("libc"), get("icu"),
                  v > 0 ? get("libc") / v : 0.0, v > 0 ? get("icu") / v : 0.0);
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
  for (const Case &c : kCases) {
    std::string row = c.row;
    benchmark::RegisterBenchmark((row + " format/veltrin").c_str(), formatOurs, c);
    benchmark::RegisterBenchmark((row + " format/libc").c_str(), formatLibc, c);
    benchmark::RegisterBenchmark((row + " format/icu").c_str(), formatIcu, c);
    benchmark::RegisterBenchmark((row + " parse/veltrin").c_str(), parseOurs, c);
    benchmark::RegisterBenchmark((row + " parse/libc").c_str(), parseLibc, c);
    benchmark::RegisterBenchmark((row + " parse/icu").c_str(), parseIcu, c);
  }
  Summary summary;
  benchmark::RunSpecifiedBenchmarks(&summary);
  summary.print();
  benchmark::Shutdown();
  VLTerm();
  return 0;
}
