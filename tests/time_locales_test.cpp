// Every generated locale's own patterns: a year of times written and read back in the
// locale's code page and in UTF-16; and against the C library's strftime in the same
// locale built with localedef, whose sources the patterns were generated from.
#include <gtest/gtest.h>
#include <langinfo.h>
#include <locale.h>

#include <cstdlib>
#include <cstring>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <map>
#include <memory>
#include <set>
#include <span>
#include <string>
#include <vector>

#include "locale/native.h"
#include "support/defdir.h"
#include "support/gendefs.h"
#include "veltrin.h"

namespace {

namespace fs = std::filesystem;

using NatRow = vl::nat::Row;
const std::span<const NatRow> kNat(vl::nat::kRows, vl::nat::kRowCount);

std::tm at(int year, int yday, int hour) {
  std::tm t{};
  t.tm_year = year - 1900;
  t.tm_mday = 1 + yday;
  t.tm_hour = hour;
  t.tm_min = (yday * 7 + hour) % 60;
  t.tm_sec = (yday * 13 + hour) % 60;
  std::time_t s = timegm(&t);
  gmtime_r(&s, &t);
  return t;
}

using TimeLocales = ts::DefsTest;

// Every field set to a value no directive stores.
std::tm blank() {
  std::tm t{};
  t.tm_year = t.tm_mon = t.tm_mday = t.tm_hour = t.tm_min = t.tm_sec = t.tm_wday = t.tm_yday = -55;
  return t;
}

// Writes t by the pattern in the byte form and the U form and reads each back: what was
// read writes the same text again. Checking the text rather than the fields lets two
// names that are alike (a month and its abbreviation) read back as either.
void roundTrip(VLLocale *l, const std::string &name, int item, const std::tm &t) {
  char pb[256], b[256], again[256];
  ASSERT_GT(VLGetLocaleTextInfo(l, item, pb, sizeof pb, 0), 0);
  const int32_t nb = VLTimeToString(l, &t, b, sizeof b, pb, -1, 0);
  ASSERT_GT(nb, 0) << name << " item " << item << " rc " << VLGetError(l);
  std::tm got = blank();
  ASSERT_EQ(VLStringToTime(l, &got, b, nb, pb, -1, 0), nb)
      << name << " item " << item << " '" << std::string(b, nb) << "' rc " << VLGetError(l);
  const int32_t na = VLTimeToString(l, &got, again, sizeof again, pb, -1, 0);
  ASSERT_EQ(std::string(again, na > 0 ? na : 0), std::string(b, nb)) << name << " item " << item;

  VLUChar pu[128], u[256], uagain[256];
  ASSERT_GT(VLGetLocaleTextInfoU(l, item, pu, 128, 0), 0);
  const int32_t nu = VLTimeToStringU(l, &t, u, 256, pu, -1, 0);
  ASSERT_GT(nu, 0) << name << " item " << item;
  got = blank();
  ASSERT_EQ(VLStringToTimeU(l, &got, u, nu, pu, -1, 0), nu) << name << " item " << item << " rc " << VLGetError(l);
  const int32_t nua = VLTimeToStringU(l, &got, uagain, 256, pu, -1, 0);
  EXPECT_EQ(std::u16string(uagain, uagain + (nua > 0 ? nua : 0)), std::u16string(u, u + nu))
      << name << " item " << item << " (UTF-16)";
}

TEST_F(TimeLocales, EveryLocalesPatternsReadBackWhatTheyWrote) {
  std::vector<std::string> names;
  for (const NatRow &r : kNat) names.push_back(std::string(r.language) + "_" + r.territory + "." + r.codePage);
  for (const char *extra : {"Japanese_Japan.IBM930", "Japanese_Japan.IBM939", "Korean_Korea.IBM933",
                            "SimplifiedChinese_China.IBM935", "TraditionalChinese_Taiwan.IBM937",
                            "German_Germany.IBM273", "English_UnitedStates.IBM037"})
    names.push_back(extra);
  std::set<std::string> seen;
  int locales = 0;
  for (const std::string &name : names) {
    if (!seen.insert(name).second) continue;
    uint32_t rc = 0;
    VLLocale *l = VLGetLocale(name.c_str(), 0, &rc);
    if (!l) continue;  // a code page the host's iconv did not give
    ++locales;
    for (int day = 0; day < 366 && !HasFatalFailure(); ++day)
      for (int hour : {0, 11, 12, 23})
        for (int item : {79, 80, 81}) roundTrip(l, name, item, at(1996, day, (hour + day) % 24 == 5 ? 5 : hour));
    VLReleaseLocale(l);
    if (HasFatalFailure()) return;
  }
  EXPECT_GT(locales, 100);
}

// ---- Against the C library -------------------------------------------------------------

// Rewrites of the generator that make a pattern write other text than its source (each
// listed with its reason in README): blank padding (%e %k %l %_X), case (%P %^X), fields
// the formatter lacks (%Z %z %s %C, eras %E, alternative digits %O), and the ISO week
// forms (%g %G %V %u).
bool hasListedRewrite(const std::string &src) {
  for (size_t i = 0; i + 1 < src.size(); ++i) {
    if (src[i] != '%') continue;
    size_t k = i + 1;
    while (k < src.size() && std::strchr("_^0#-", src[k])) {
      if (src[k] == '_' || src[k] == '^' || src[k] == '#') return true;
      ++k;
    }
    if (k < src.size() && src[k] >= '1' && src[k] <= '9') return true;  // a field width
    if (k >= src.size()) return false;
    if (std::strchr("ekKlPZzsCgGVuEO", src[k])) return true;
    i = k;
  }
  return false;
}

// A rewritten pattern back in strftime's spelling, for the long date that has no source
// of its own.
std::string toStrftime(const std::string &p) {
  std::string out;
  for (size_t i = 0; i < p.size(); ++i) {
    out += p[i];
    if (p[i] == '%' && i + 1 < p.size() && p[i + 1] == '#') {
      out += '-';
      ++i;
    }
  }
  return out;
}

// The source of the first row that names a territory ("de_DE" of "de_DE.utf8").
std::string firstSource(const char *territory) {
  for (const NatRow &r : kNat)
    if (!std::strcmp(r.territory, territory)) {
      std::string n = r.native;
      if (n == "C" || n == "POSIX") return "en_US.";  // read from en_US
      return n.substr(0, n.find_first_of(".@")) + ".";
    }
  return "";
}

class TimeNative : public TimeLocales {
 protected:
  static void SetUpTestSuite() {
    // A few locales by default; VL_TIME_ALL_LOCALES=1 builds every UTF-8 one.
    const bool all = std::getenv("VL_TIME_ALL_LOCALES") != nullptr;
    const std::set<std::string> some = {"de_DE", "en_US", "fr_FR", "ja_JP", "ru_RU", "zh_CN", "ko_KR", "fi_FI",
                                        "hu_HU", "pt_BR", "ar_SA", "th_TH"};
    dir_ = new ts::TempDir;
    std::ofstream list(dir_->file("list"));
    for (const NatRow &r : kNat) {
      std::string n = r.native;
      if (n.size() < 6 || n.substr(n.size() - 5) != ".utf8") continue;
      std::string src = n.substr(0, n.size() - 5);
      if (!fs::exists("/usr/share/i18n/locales/" + src) || (!all && !some.count(src))) continue;
      rows_->push_back(&r);
      list << src << "\n";
    }
    list.close();
    std::string cmd = "xargs -P 2 -I{} sh -c 'localedef -c -i {} -f UTF-8 " + dir_->path + "/{}.utf8 >/dev/null 2>&1' < " +
                      dir_->file("list");
    (void)std::system(cmd.c_str());
  }
  static void TearDownTestSuite() { delete dir_; }
  static inline ts::TempDir *dir_ = nullptr;
  static inline std::vector<const NatRow *> *rows_ = new std::vector<const NatRow *>;
};

TEST_F(TimeNative, PatternsWriteWhatStrftimeWritesInTheSourceLocale) {
  ts::EnvScope locpath("LOCPATH", dir_->path.c_str());
  std::map<std::string, int> rewritten;
  int compared = 0, skipped = 0;
  for (const NatRow *r : *rows_) {
    locale_t nat = newlocale(LC_ALL_MASK, r->native, nullptr);
    if (!nat) {
      ++skipped;
      continue;
    }
    const std::string name = std::string(r->language) + "_" + r->territory + ".UTF-8";
    uint32_t rc = 0;
    VLLocale *l = VLGetLocale(name.c_str(), 0, &rc);
    ASSERT_NE(l, nullptr) << name;
    // Names or patterns from another locale's sources (a language is read from its primary
    // row, a territory from the first row that names it) differ for that reason alone.
    bool sameNames = std::string(r->native).rfind(firstSource(r->territory), 0) == 0;
    const nl_item kNames[] = {DAY_1, ABDAY_1, MON_1, ABMON_1, AM_STR};
    const int kFirst[] = {16, 23, 30, 43, 56}, kCount[] = {7, 7, 12, 12, 2};
    for (int g = 0; g < 5; ++g)
      for (int k = 0; k < kCount[g]; ++k) {
        char b[128];
        VLGetLocaleTextInfo(l, kFirst[g] + k, b, sizeof b, 0);
        sameNames = sameNames && std::string(b) == nl_langinfo_l(kNames[g] + k, nat);
      }
    if (!sameNames) {
      ++skipped;
      VLReleaseLocale(l);
      freelocale(nat);
      continue;
    }
    struct Pair {
      int item;
      std::string source;
    } pairs[] = {{79, nl_langinfo_l(T_FMT, nat)}, {80, nl_langinfo_l(D_FMT, nat)}, {81, ""}};
    char p81[128];
    VLGetLocaleTextInfo(l, 81, p81, sizeof p81, 0);
    pairs[2].source = toStrftime(p81);
    for (const Pair &p : pairs) {
      char mine[128];
      ASSERT_GT(VLGetLocaleTextInfo(l, p.item, mine, sizeof mine, 0), 0);
      const bool listed = hasListedRewrite(p.source);
      bool differed = false;
      for (int day = 0; day < 366; day += 5) {
        std::tm t = at(2024, day, (day * 5) % 24);
        char want[256], got[256];
        size_t nw = strftime_l(want, sizeof want, p.source.c_str(), &t, nat);
        int32_t ng = VLTimeToString(l, &t, got, sizeof got, mine, -1, 0);
        ASSERT_GE(ng, 0) << name << " " << mine;
        if (std::string(want, nw) == std::string(got, ng)) continue;
        differed = true;
        EXPECT_TRUE(listed) << name << " item " << p.item << ": '" << mine << "' wrote '" << std::string(got, ng)
                            << "', strftime '" << p.source << "' wrote '" << std::string(want, nw) << "'";
        break;
      }
      ++compared;
      if (differed) ++rewritten[p.source];
    }
    VLReleaseLocale(l);
    freelocale(nat);
  }
  std::printf("  %d patterns compared, %d locales skipped (names or patterns from another locale, or not built)\n", compared,
              skipped);
  for (const auto &[src, n] : rewritten) std::printf("  differs by a listed rewrite: '%s' (%d)\n", src.c_str(), n);
  EXPECT_GT(compared, 0);
}

}  // namespace
