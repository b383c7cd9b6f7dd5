// The native locale table: shape, telling rows, and the spread of code pages and sorts.
#include <gtest/gtest.h>

#include <map>
#include <set>
#include <string>

namespace {

// Column sizes as the library stores them; an over-long name fails to compile. Native
// names use all 11 bytes of their column at most ("ja_JP.eucJP"), so the terminator needs
// one more here.
struct NatRow {
  char native[12];
  char language[32];
  char territory[32];
  char codePage[32];
  char sort[32];
};
const NatRow kNat[] = {
#include "locale/nattab.inc"
};

std::string prefix(const std::string &native) { return native.substr(0, native.find_first_of(".@")); }

TEST(NativeTable, RowsAreUniqueAndConsistent) {
  ASSERT_EQ(std::size(kNat), 117u);
  std::set<std::string> natives;
  std::map<std::string, std::string> langOfPrefix, terrOfPrefix, langCodeOf;
  for (const NatRow &r : kNat) {
    std::string n = r.native;
    EXPECT_TRUE(natives.insert(n).second) << n;
    for (const char *col : {r.language, r.territory, r.codePage, r.sort})
      EXPECT_EQ(std::string(col).find(' '), std::string::npos) << n;
    bool unicode = n.find(".utf8") != std::string::npos || n.find("@euro") != std::string::npos;
    EXPECT_EQ(unicode, std::string(r.codePage) == "UTF-8") << n;
    // Every form of one native locale names the same language and territory.
    auto [l, lnew] = langOfPrefix.emplace(prefix(n), r.language);
    auto [t, tnew] = terrOfPrefix.emplace(prefix(n), r.territory);
    EXPECT_EQ(l->second, r.language) << n;
    EXPECT_EQ(t->second, r.territory) << n;
    // One language name stands for one language code.
    if (n != "C" && n != "POSIX" && n.substr(0, 2) != "zh") {
      auto [c, cnew] = langCodeOf.emplace(r.language, n.substr(0, 2));
      EXPECT_EQ(c->second, n.substr(0, 2)) << n;
    }
  }
}

TEST(NativeTable, CodePageAndSortCounts) {
  std::map<std::string, int> cps, sorts;
  for (const NatRow &r : kNat) {
    ++cps[r.codePage];
    ++sorts[r.sort];
  }
  EXPECT_EQ(cps["UTF-8"], 60);
  EXPECT_EQ(cps["Latin1"], 28);
  EXPECT_EQ(cps["ISO-8859-2"], 9);
  EXPECT_EQ(cps["ISO-8859-5"], 3);
  const std::set<std::string> rare = {"US-ASCII", "ISO-8859-6", "ISO-8859-7", "ISO-8859-8", "ISO-8859-9",
                                      "MS874",    "MS932",      "MS936",      "MS949",      "MS950",
                                      "MS1251",   "JapanEUC",   "EUC-TW",     "ISO-8859-13", "KOI8-U"};
  for (const auto &[cp, n] : cps) {
    if (cp == "UTF-8" || cp == "Latin1" || cp == "ISO-8859-2" || cp == "ISO-8859-5") continue;
    EXPECT_TRUE(rare.count(cp)) << cp;
    EXPECT_TRUE(n == 1 || n == 2) << cp << " " << n;
  }
  EXPECT_EQ(sorts["Default"], 61);
  EXPECT_EQ(sorts["Binary"], 12);
}

TEST(NativeTable, TellingRows) {
  struct Want {
    const char *native, *language, *territory, *codePage, *sort;
  };
  const Want wants[] = {
      {"C", "English", "UnitedStates", "US-ASCII", "Binary"},
      {"POSIX", "English", "UnitedStates", "US-ASCII", "Binary"},
      {"ar_SA", "Arabic", "SaudiArabia", "ISO-8859-6", "Default"},
      {"ar_SA.utf8", "Arabic", "SaudiArabia", "UTF-8", "Default"},
      {"bg_BG", "Bulgarian", "Bulgaria", "MS1251", "Default"},
      {"cs_CZ", "Czech", "CzechRepublic", "ISO-8859-2", "Czech"},
      {"da_DK", "Danish", "Denmark", "Latin1", "Danish"},
      {"de_DE", "German", "Germany", "Latin1", "Default"},
      {"de_DE@euro", "German", "Germany", "UTF-8", "Default"},
      {"ca_ES", "Catalan", "Spain", "Latin1", "Spanish"},
      {"et_EE", "Estonian", "Estonia", "Latin1", "Estonian"},
      {"lt_LT", "Lithuanian", "Lithuania", "ISO-8859-13", "Lithuanian"},
      {"lv_LV.utf8", "Latvian", "Latvia", "UTF-8", "Latvian"},
      {"uk_UA", "Ukrainian", "Ukraine", "KOI8-U", "Ukrainian"},
      {"zh_CN.utf8", "SimplifiedChinese", "China", "UTF-8", "Binary"},
      {"zh_TW", "TraditionalChinese", "Taiwan", "MS950", "Binary"},
      {"zh_TW.euctw", "TraditionalChinese", "Taiwan", "EUC-TW", "Binary"},
  };
  for (const Want &w : wants) {
    const NatRow *found = nullptr;
    for (const NatRow &r : kNat)
      if (std::string(r.native) == w.native) found = &r;
    ASSERT_NE(found, nullptr) << w.native;
    EXPECT_STREQ(found->language, w.language) << w.native;
    EXPECT_STREQ(found->territory, w.territory) << w.native;
    EXPECT_STREQ(found->codePage, w.codePage) << w.native;
    EXPECT_STREQ(found->sort, w.sort) << w.native;
  }
  EXPECT_STREQ(kNat[0].native, "C");
  EXPECT_STREQ(kNat[116].native, "zh_TW.utf8");
}

}  // namespace
