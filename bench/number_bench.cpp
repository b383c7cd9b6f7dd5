// Number speed: this library against the C library (snprintf "%'d" and "%'.2f", strtol,
// strtod, under the same locale built with localedef) and ICU (unum_format*, unum_parse*)
// on the same values in the same run. Each iteration handles 1024 values; a table after
// the run gives millions of values per second and the ratio to the best peer.
// Run alone with --benchmark_filter=Number.
#include <benchmark/benchmark.h>
#include <unicode/unum.h>

#include <ctime>
#include <clocale>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <cstring>
#include <map>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "veltrin.h"

namespace {

constexpr size_t kValues = 1024;

struct Fixture {
  bool ok = false;
  std::string why;
  std::string dir;  // the C library's locale, built for the run
  VLLocale *l = nullptr;
  UNumberFormat *icu = nullptr;
  std::vector<int32_t> ints;
  std::vector<double> doubles;
  // Each formatter's own text of the values, for its parser.
  std::vector<std::u16string> oursInt, oursDouble, icuInt, icuDouble;
  std::vector<std::string> libcInt, libcDouble;
};

// Values per second of the last (reported) run of each row and peer.
std::map<std::string, std::map<std::string, double>> g_rate;
std::vector<std::string> g_order;
std::string g_dir;  // removed with the table, after the run

// Formats in the C library's locale for the scope, and restores the one before.
struct LibcLocale {
  std::string saved;
  explicit LibcLocale(const std::string &dir) : saved(std::setlocale(LC_ALL, nullptr)) {
    setenv("LOCPATH", dir.c_str(), 1);
    std::setlocale(LC_ALL, "de_DE.UTF-8");
  }
  ~LibcLocale() {
    std::setlocale(LC_ALL, saved.c_str());
    unsetenv("LOCPATH");
  }
};

Fixture &fx() {
  static Fixture f = [] {
    Fixture x;
    char tmpl[] = "/tmp/numbenchXXXXXX";
    if (!mkdtemp(tmpl)) return x.why = "no temporary directory", x;
    x.dir = g_dir = tmpl;
    std::string cmd = "localedef -c -i de_DE -f UTF-8 " + x.dir + "/de_DE.UTF-8 >/dev/null 2>&1";
    if (std::system(cmd.c_str()) != 0 && !std::filesystem::exists(x.dir + "/de_DE.UTF-8/LC_NUMERIC"))
      return x.why = "localedef could not build de_DE", x;
    uint32_t rc = 0;
    x.l = VLGetLocale("German_Germany.UTF-8", 0, &rc);
    if (!x.l) return x.why = "no German_Germany.UTF-8", x;
    UErrorCode err = U_ZERO_ERROR;
    x.icu = unum_open(UNUM_DECIMAL, nullptr, 0, "de_DE", nullptr, &err);
    if (U_FAILURE(err)) return x.why = "ICU has no de_DE", x;
    unum_setAttribute(x.icu, UNUM_MIN_FRACTION_DIGITS, 2);
    unum_setAttribute(x.icu, UNUM_MAX_FRACTION_DIGITS, 2);
    unum_setAttribute(x.icu, UNUM_ROUNDING_MODE, UNUM_ROUND_DOWN);  // cut, as this library does
    std::mt19937 rng(11);
    for (size_t i = 0; i < kValues; ++i) {
      x.ints.push_back(static_cast<int32_t>(rng()) >> (i % 24));
      x.doubles.push_back(static_cast<double>(static_cast<int32_t>(rng()) >> (i % 24)) / 100.0);
    }
    LibcLocale c(x.dir);
    for (size_t i = 0; i < kValues; ++i) {
      VLUChar u[64];
      UChar iu[64];
      char b[64];
      int32_t n = VLLongToStringU(x.l, x.ints[i], u, 64, 0);
      x.oursInt.emplace_back(reinterpret_cast<char16_t *>(u), n);
      n = VLDoubleToStringU(x.l, x.doubles[i], u, 64, 0);
      x.oursDouble.emplace_back(reinterpret_cast<char16_t *>(u), n);
      n = unum_format(x.icu, x.ints[i], iu, 64, nullptr, &err);
      x.icuInt.emplace_back(reinterpret_cast<char16_t *>(iu), n);
      n = unum_formatDouble(x.icu, x.doubles[i], iu, 64, nullptr, &err);
      x.icuDouble.emplace_back(reinterpret_cast<char16_t *>(iu), n);
      // strtol and strtod read no group separators: the C library parses its plain forms.
      std::snprintf(b, sizeof b, "%d", x.ints[i]);
      x.libcInt.push_back(b);
      std::snprintf(b, sizeof b, "%.2f", x.doubles[i]);
      x.libcDouble.push_back(b);
    }
    x.ok = U_SUCCESS(err);
    if (!x.ok) x.why = "ICU failed";
    return x;
  }();
  return f;
}


using Body = void (*)(Fixture &);

void measure(benchmark::State &st, const char *row, const char *peer, Body body) {
  Fixture &f = fx();
  if (!f.ok) {
    st.SkipWithError(f.why.c_str());
    return;
  }
  // Processor time: the machine may be shared, and each row runs on one thread.
  const std::clock_t t0 = std::clock();
  for (auto _ : st) body(f);
  const double s = static_cast<double>(std::clock() - t0) / CLOCKS_PER_SEC;
  st.SetItemsProcessed(static_cast<int64_t>(st.iterations() * kValues));
  if (!g_rate.count(row)) g_order.push_back(row);
  g_rate[row][peer] = s > 0 ? static_cast<double>(st.iterations() * kValues) / s / 1e6 : 0;
}

// Each row's three peers; the C library's run in its locale.
struct Row {
  const char *row, *peer;
  Body body;
};
const Row kRows[] = {
    {"int format", "veltrin",
     [](Fixture &f) {
       VLUChar u[64];
       for (int32_t v : f.ints) benchmark::DoNotOptimize(VLLongToStringU(f.l, v, u, 64, 0));
     }},
    {"int format", "libc",
     [](Fixture &f) {
       char b[64];
       for (int32_t v : f.ints) benchmark::DoNotOptimize(std::snprintf(b, sizeof b, "%'d", v));
     }},
    {"int format", "icu",
     [](Fixture &f) {
       UChar u[64];
       UErrorCode err = U_ZERO_ERROR;
       for (int32_t v : f.ints) benchmark::DoNotOptimize(unum_format(f.icu, v, u, 64, nullptr, &err));
     }},
    {"int parse", "veltrin",
     [](Fixture &f) {
       for (const auto &s : f.oursInt)
         benchmark::DoNotOptimize(VLStringToLongU(f.l, reinterpret_cast<const VLUChar *>(s.data()),
                                                  static_cast<int32_t>(s.size()), nullptr, 10, 0));
     }},
    {"int parse", "libc",
     [](Fixture &f) {
       for (const auto &s : f.libcInt) benchmark::DoNotOptimize(std::strtol(s.c_str(), nullptr, 10));
     }},
    {"int parse", "icu",
     [](Fixture &f) {
       UErrorCode err = U_ZERO_ERROR;
       for (const auto &s : f.icuInt)
         benchmark::DoNotOptimize(unum_parse(f.icu, reinterpret_cast<const UChar *>(s.data()),
                                             static_cast<int32_t>(s.size()), nullptr, &err));
     }},
    {"double format", "veltrin",
     [](Fixture &f) {
       VLUChar u[64];
       for (double v : f.doubles) benchmark::DoNotOptimize(VLDoubleToStringU(f.l, v, u, 64, 0));
     }},
    {"double format", "libc",
     [](Fixture &f) {
       char b[64];
       for (double v : f.doubles) benchmark::DoNotOptimize(std::snprintf(b, sizeof b, "%'.2f", v));
     }},
    {"double format", "icu",
     [](Fixture &f) {
       UChar u[64];
       UErrorCode err = U_ZERO_ERROR;
       for (double v : f.doubles) benchmark::DoNotOptimize(unum_formatDouble(f.icu, v, u, 64, nullptr, &err));
     }},
    {"double parse", "veltrin",
     [](Fixture &f) {
       for (const auto &s : f.oursDouble)
         benchmark::DoNotOptimize(VLStringToDoubleU(f.l, reinterpret_cast<const VLUChar *>(s.data()),
                                                    static_cast<int32_t>(s.size()), nullptr, 0));
     }},
    {"double parse", "libc",
     [](Fixture &f) {
       for (const auto &s : f.libcDouble) benchmark::DoNotOptimize(std::strtod(s.c_str(), nullptr));
     }},
    {"double parse", "icu",
     [](Fixture &f) {
       UErrorCode err = U_ZERO_ERROR;
       for (const auto &s : f.icuDouble)
         benchmark::DoNotOptimize(unum_parseDouble(f.icu, reinterpret_cast<const UChar *>(s.data()),
                                                   static_cast<int32_t>(s.size()), nullptr, &err));
     }},
};

void run(benchmark::State &st, const Row *r) {
  std::unique_ptr<LibcLocale> c;
  if (!std::strcmp(r->peer, "libc")) c = std::make_unique<LibcLocale>(fx().dir);
  measure(st, r->row, r->peer, r->body);
}

const int g_registered = [] {
  for (const Row &r : kRows)
    benchmark::RegisterBenchmark((std::string("Number/") + r.row + "/" + r.peer).c_str(), run, &r);
  return 0;
}();

// The table, once the run is over.
struct Table {
  ~Table() {
    if (g_order.empty()) return;
    std::printf("\n%-22s %10s %10s %10s %8s\n", "row (M values/s)", "veltrin", "libc", "icu", "ratio");
    for (const std::string &row : g_order) {
      auto &m = g_rate[row];
      const double best = std::max(m["libc"], m["icu"]);
      std::printf("%-22s %10.2f %10.2f %10.2f %8.2f\n", row.c_str(), m["veltrin"], m["libc"], m["icu"],
                  best > 0 ? m["veltrin"] / best : 0.0);
    }
    if (!g_dir.empty()) std::filesystem::remove_all(g_dir);
  }
} g_table;

}  // namespace
