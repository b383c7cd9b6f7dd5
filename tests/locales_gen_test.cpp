// Languages and territories generated from the C library's locale sources.
#include <gtest/gtest.h>
#include <langinfo.h>
#include <locale.h>
#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <map>
#include <set>
#include <span>

#include "locale/native.h"
#include "locales.h"
#include "locsrc_parse.h"
#include "locsrc_pattern.h"
#include "support/gendefs.h"

namespace {

using mkdefs::DefObject;
namespace fs = std::filesystem;
using mkdefs::locsrc::fromUtf8;
using mkdefs::locsrc::toUtf8;

const char *kSrc = "/usr/share/i18n/locales";

using NatRow = vl::nat::Row;
const std::span<const NatRow> kNat(vl::nat::kRows, vl::nat::kRowCount);

const std::map<std::string, uint16_t> kCpIds = {
    {"US-ASCII", 367}, {"Latin1", 819},     {"ISO-8859-2", 912}, {"ISO-8859-5", 915},
    {"MS949", 1363},   {"MS950", 1370},     {"JapanEUC", 954},   {"UTF-8", 1208},
    {"ISO-8859-13", 921}, {"KOI8-U", 1168},
};
uint16_t cpId(const std::string &name) {
  auto it = kCpIds.find(name);
  return it == kCpIds.end() ? 0 : it->second;
}

uint16_t word(const DefObject &o, size_t w) {
  const auto &b = o.sections.at(0);
  return static_cast<uint16_t>(b.at(w * 2) << 8 | b.at(w * 2 + 1));
}

// The UTF-16 text whose offset word w holds; fails the test when it leaves the body.
std::u32string text(const DefObject &o, size_t w) {
  const auto &b = o.sections.at(0);
  std::u32string s;
  for (size_t at = word(o, w);; at += 2) {
    EXPECT_LT(at + 1, b.size()) << o.name << " word " << w;
    if (at + 1 >= b.size()) return s;
    char32_t u = static_cast<char32_t>(b[at] << 8 | b[at + 1]);
    if (u == 0) return s;
    s += u;
  }
}
std::string text8(const DefObject &o, size_t w) { return toUtf8(text(o, w)); }

class Generated : public ::testing::Test {
 protected:
  static void SetUpTestSuite() {
    if (!fs::exists(kSrc)) return;
    objs_ = new std::vector<DefObject>;
    static mkdefs::UnicodeProps ucd;
    static mkdefs::SpecialCasing sc;
    ok_ = mkdefs::loadUnicode("", &ucd, &err_) && mkdefs::readSpecialCasing("/usr/share/unicode", &sc, &err_);
    static const mkdefs::Casing casing{sc, ucd};
    ok_ = ok_ && mkdefs::buildLanguagesAndTerritories(kSrc, cpId, objs_, &err_, &casing);
  }
  void SetUp() override {
    if (objs_ == nullptr) GTEST_SKIP() << "no locale sources in " << kSrc;
    ASSERT_TRUE(ok_) << err_;
  }
  static const DefObject &get(uint8_t type, const std::string &name) {
    for (const auto &o : *objs_)
      if (o.type == type && o.name == name) return o;
    ADD_FAILURE() << "no object " << name;
    static DefObject none;
    none.sections.assign(1, mkdefs::Bytes(102, 0));
    return none;
  }
  static inline std::vector<DefObject> *objs_ = nullptr;
  static inline bool ok_ = false;
  static inline std::string err_;
};

TEST_F(Generated, EveryLanguageAndTerritoryOnce) {
  std::set<std::string> langs, terrs;
  for (const NatRow &r : kNat) {
    langs.insert(r.language);
    terrs.insert(r.territory);
  }
  std::multiset<std::string> gotLangs, gotTerrs;
  std::set<uint16_t> langIds, terrIds;
  for (const auto &o : *objs_) {
    (o.type == 0 ? gotLangs : gotTerrs).insert(o.name);
    EXPECT_TRUE((o.type == 0 ? langIds : terrIds).insert(o.id).second) << o.name;
    EXPECT_EQ(o.sections.size(), 1u);
  }
  EXPECT_EQ(gotLangs, std::multiset<std::string>(langs.begin(), langs.end()));
  EXPECT_EQ(gotTerrs, std::multiset<std::string>(terrs.begin(), terrs.end()));
  EXPECT_EQ(*langIds.begin(), 1);
  EXPECT_EQ(*langIds.rbegin(), langs.size());
  EXPECT_EQ(get(0, "English").id, 1);
  EXPECT_EQ(get(1, "UnitedStates").id, 840);
  EXPECT_EQ(get(1, "Germany").id, 276);
  EXPECT_EQ(get(1, "Yugoslavia").id, 891);
}

// Ids once given never move: the first table's languages keep their alphabetical
// numbers and the ones added later follow in the order they were added.
TEST_F(Generated, LanguageIdsNeverMove) {
  const std::pair<const char *, uint16_t> ids[] = {
      {"English", 1},     {"Arabic", 2},           {"Bulgarian", 3},    {"Croatian", 4},   {"Czech", 5},
      {"Danish", 6},      {"Dutch", 7},            {"Finnish", 8},      {"French", 9},     {"German", 10},
      {"Greek", 11},      {"Hebrew", 12},          {"Hungarian", 13},   {"Icelandic", 14}, {"Italian", 15},
      {"Japanese", 16},   {"Korean", 17},          {"Macedonian", 18},  {"Norwegian", 19}, {"Polish", 20},
      {"Portuguese", 21}, {"Romanian", 22},        {"Russian", 23},     {"Serbian", 24},
      {"SerboCroatian", 25}, {"SimplifiedChinese", 26}, {"Slovak", 27},    {"Slovenian", 28}, {"Spanish", 29},
      {"Swedish", 30},    {"Thai", 31},            {"TraditionalChinese", 32}, {"Turkish", 33},
      {"Lithuanian", 34}, {"Estonian", 35},        {"Latvian", 36},     {"Ukrainian", 37}, {"Catalan", 38},
  };
  for (const auto &[name, id] : ids) EXPECT_EQ(get(0, name).id, id) << name;
  const std::pair<const char *, uint16_t> territories[] = {
      {"Lithuania", 440}, {"Estonia", 233}, {"Latvia", 428}, {"Ukraine", 804}, {"Spain", 724}};
  for (const auto &[name, id] : territories) EXPECT_EQ(get(1, name).id, id) << name;
  // Spain stays read from the Spanish row, not from the Catalan one listed before it.
  EXPECT_EQ(text8(get(1, "Spain"), 20), "%d/%m/%y");
}

// What the compiled en_US does not report; its names and patterns are compared below.
TEST_F(Generated, EnglishAndUnitedStates) {
  const DefObject &en = get(0, "English");
  EXPECT_EQ(word(en, 0), 840);
  EXPECT_EQ(word(en, 1), 367);
  EXPECT_EQ(word(en, 2), 0);
  EXPECT_EQ(text8(en, 5), "en");
  EXPECT_EQ(text8(en, 6), "English");
  const DefObject &us = get(1, "UnitedStates");
  const std::pair<size_t, uint16_t> usWords[] = {{0, '.'}, {1, ','}, {3, '.'}, {4, ','}, {5, 2}, {6, 2},
                                                 {7, 2},   {8, 0x0101}, {9, 840}, {10, 0x0A}};
  for (const auto &[w, want] : usWords) EXPECT_EQ(word(us, w), want) << "word " << w;
  const std::pair<size_t, const char *> usTexts[] = {
      {11, "US"}, {12, "United States"}, {13, "3;3;0"}, {14, "3;3;0"}, {17, ""}, {18, "-"}};
  for (const auto &[w, want] : usTexts) EXPECT_EQ(text8(us, w), want) << "word " << w;
}

TEST_F(Generated, LanguageDefaultsAndTellingValues) {
  struct Want {
    const char *language;
    uint16_t territory;
    const char *codePage, *code;
  };
  const Want wants[] = {
      {"German", 276, "Latin1", "de"},      {"Swedish", 752, "Latin1", "sv"},
      {"Japanese", 392, "JapanEUC", "ja"},  {"Korean", 410, "MS949", "ko"},
      {"TraditionalChinese", 158, "MS950", "zh"}, {"SerboCroatian", 891, "ISO-8859-2", "sh"},
      {"Russian", 643, "ISO-8859-5", "ru"}, {"Arabic", 682, "ISO-8859-6", "ar"},
      {"Lithuanian", 440, "ISO-8859-13", "lt"}, {"Estonian", 233, "Latin1", "et"},
      {"Latvian", 428, "ISO-8859-13", "lv"},    {"Ukrainian", 804, "KOI8-U", "uk"},
      {"Catalan", 724, "Latin1", "ca"},
  };
  for (const Want &w : wants) {
    const DefObject &o = get(0, w.language);
    EXPECT_EQ(word(o, 0), w.territory) << w.language;
    EXPECT_EQ(word(o, 1), cpId(w.codePage)) << w.language;  // 0 for names the fake does not know
    EXPECT_EQ(text8(o, 5), w.code) << w.language;
  }
  EXPECT_EQ(word(get(1, "France"), 0), ',');
  EXPECT_EQ(word(get(1, "Germany"), 1), '.');
  for (size_t w = 21; w <= 32; ++w) EXPECT_FALSE(text(get(0, "Japanese"), w).empty());
}

// Every body keeps its texts inside, and every pattern is one the formatter can expand
// from its 32-byte pattern buffer.
TEST_F(Generated, BodiesAreWellFormed) {
  for (const auto &o : *objs_) {
    const auto &b = o.sections[0];
    ASSERT_LE(b.size(), 65535u) << o.name;
    if (o.type == 0) {
      EXPECT_LE(word(o, 49) + 8u * word(o, 3), b.size()) << o.name;
      EXPECT_LE(word(o, 50) + 8u * word(o, 4), b.size()) << o.name;
      for (size_t w = 5; w <= 48; ++w) text(o, w);
      EXPECT_TRUE(text(o, 33).empty() && text(o, 46).empty()) << o.name;
      continue;
    }
    for (size_t w = 11; w <= 18; ++w) text(o, w);
    for (size_t w : {13, 14}) {
      std::string g = text8(o, w);
      EXPECT_TRUE(g.find_first_not_of("0123456789;") == std::string::npos && !g.empty() && g.back() != ';')
          << o.name << " " << g;
    }
    for (size_t w = 19; w <= 21; ++w) {
      std::string p = text8(o, w);
      EXPECT_LT(p.size(), 32u) << o.name << " " << p;
      for (size_t i = 0; i < p.size(); ++i) {
        if (p[i] != '%') continue;
        size_t k = i + 1 < p.size() && p[i + 1] == '#' ? i + 2 : i + 1;
        ASSERT_LT(k, p.size()) << o.name << " " << p;
        EXPECT_NE(std::string("aAbBdHIjmMpSUwWyY%").find(p[k]), std::string::npos) << o.name << " " << p;
        i = k;
      }
    }
  }
}

// Compiles a few locales with the C library's own compiler and compares what it reports
// with the generated objects: names, separators, currency, and the patterns (rewritten by
// the same rules, so that this checks the reading of the sources).
TEST_F(Generated, AgreesWithCompiledLocales) {
  fs::path dir = fs::temp_directory_path() / ("vl_locgen_" + std::to_string(getpid()));
  fs::create_directories(dir);
  const char *sources[] = {"en_US", "de_DE", "ja_JP", "zh_TW", "lt_LT", "et_EE", "lv_LV", "uk_UA", "ca_ES", "es_ES"};
  for (const char *s : sources)
    if (!ts::localedef(s, "UTF-8", (dir / (std::string(s) + ".UTF-8")).string())) {
      fs::remove_all(dir);
      GTEST_SKIP() << "localedef unavailable";
    }
  std::map<std::string, locale_t> loc;
  {
    ts::EnvScope locpath("LOCPATH", dir.c_str());
    for (const char *s : sources) loc[s] = newlocale(LC_ALL_MASK, (std::string(s) + ".UTF-8").c_str(), nullptr);
  }
  fs::remove_all(dir);

  auto info = [&](const std::string &s, nl_item item) { return fromUtf8(nl_langinfo_l(item, loc[s])); };
  const std::pair<const char *, const char *> languages[] = {
      {"English", "en_US"},    {"German", "de_DE"},  {"Japanese", "ja_JP"},  {"TraditionalChinese", "zh_TW"},
      {"Lithuanian", "lt_LT"}, {"Estonian", "et_EE"}, {"Latvian", "lv_LV"}, {"Ukrainian", "uk_UA"},
      {"Catalan", "ca_ES"}};
  for (const auto &[name, s] : languages) {
    ASSERT_NE(loc[s], nullptr) << s;
    const DefObject &o = get(0, name);
    for (int i = 0; i < 7; ++i) {
      EXPECT_EQ(text(o, 7 + i), info(s, DAY_1 + i)) << name;
      EXPECT_EQ(text(o, 14 + i), info(s, ABDAY_1 + i)) << name;
    }
    for (int i = 0; i < 12; ++i) {
      EXPECT_EQ(text(o, 21 + i), info(s, MON_1 + i)) << name;
      EXPECT_EQ(text(o, 34 + i), info(s, ABMON_1 + i)) << name;
    }
    EXPECT_EQ(text(o, 47), info(s, AM_STR)) << name;
    EXPECT_EQ(text(o, 48), info(s, PM_STR)) << name;
  }
  const std::pair<const char *, const char *> territories[] = {
      {"UnitedStates", "en_US"}, {"Germany", "de_DE"}, {"Japan", "ja_JP"},  {"Taiwan", "zh_TW"}, {"Lithuania", "lt_LT"},
      {"Estonia", "et_EE"},      {"Latvia", "lv_LV"},  {"Ukraine", "uk_UA"}, {"Spain", "es_ES"}};
  for (const auto &[name, s] : territories) {
    ASSERT_NE(loc[s], nullptr) << s;
    const DefObject &o = get(1, name);
    mkdefs::locsrc::TimeFormats tf{info(s, D_FMT), info(s, T_FMT), info(s, D_T_FMT), info(s, T_FMT_AMPM),
                                   info(s, _DATE_FMT)};
    EXPECT_EQ(text(o, 19), mkdefs::locsrc::translatePattern(tf.tFmt, tf)) << name;
    EXPECT_EQ(text(o, 20), mkdefs::locsrc::translatePattern(tf.dFmt, tf)) << name;
    EXPECT_EQ(text(o, 21), mkdefs::locsrc::longDatePattern(tf)) << name;
    EXPECT_EQ(std::u32string(1, word(o, 0)), info(s, RADIXCHAR)) << name;
    EXPECT_EQ(text(o, 15), info(s, CURRENCY_SYMBOL)) << name;
    EXPECT_EQ(text8(o, 16) + " ", toUtf8(info(s, INT_CURR_SYMBOL))) << name;
    EXPECT_EQ(word(o, 6), *nl_langinfo_l(FRAC_DIGITS, loc[s])) << name;
    EXPECT_EQ(word(o, 8) >> 8, *nl_langinfo_l(P_SIGN_POSN, loc[s])) << name;
  }
  for (auto &[s, l] : loc)
    if (l) freelocale(l);
}

TEST(LocaleSource, ReaderFollowsTheFormat) {
  fs::path dir = fs::temp_directory_path() / ("vl_locsrc_" + std::to_string(getpid()));
  fs::create_directories(dir);
  std::ofstream(dir / "top") << "comment_char %\nescape_char /\n"
                                "% a comment \"with a quote\n"
                                "LC_TIME\n"
                                "abday \"a<U00E4>b\";\"x//y\" % trailing comment\n"
                                "day \"Son/\nntag\";/\n    \"Mon\"\n"
                                "mon \"Jan\"; % first /\n  \"Feb\" % last\n"
                                "t_fmt \"%H:%M\"\n"
                                "END LC_TIME\n"
                                "LC_NUMERIC\ncopy \"base\"\nEND LC_NUMERIC\n"
                                "LC_MONETARY\ncopy \"missing\"\nEND LC_MONETARY\n";
  std::ofstream(dir / "base") << "LC_NUMERIC\ndecimal_point \",\"\ngrouping 3;-1\nEND LC_NUMERIC\n";
  mkdefs::locsrc::SourceSet set(dir.string());
  std::string err;
  auto strings = [&](const char *cat, const char *key) {
    std::vector<std::string> out;
    if (const auto *v = set.find("top", cat, key, &err))
      for (const auto &val : *v) out.push_back(toUtf8(val.text));
    return out;
  };
  EXPECT_EQ(strings("LC_TIME", "abday"), (std::vector<std::string>{"a\u00E4b", "x/y"}));
  EXPECT_EQ(strings("LC_TIME", "day"), (std::vector<std::string>{"Sonntag", "Mon"}));
  EXPECT_EQ(strings("LC_TIME", "t_fmt"), (std::vector<std::string>{"%H:%M"}));
  EXPECT_EQ(strings("LC_NUMERIC", "decimal_point"), (std::vector<std::string>{","}));
  EXPECT_EQ(strings("LC_NUMERIC", "grouping"), (std::vector<std::string>{"3", "-1"}));
  EXPECT_EQ(strings("LC_TIME", "mon"), (std::vector<std::string>{"Jan", "Feb"}));
  EXPECT_TRUE(strings("LC_TIME", "abmon").empty());
  EXPECT_EQ(err, "");
  EXPECT_TRUE(strings("LC_MONETARY", "frac_digits").empty());
  EXPECT_NE(err, "");
  err.clear();
  EXPECT_EQ(set.find("../etc/passwd", "LC_TIME", "day", &err), nullptr);
  EXPECT_NE(err, "");
  fs::remove_all(dir);
}

TEST(LocaleSource, PatternsUseTheFormattersDirectives) {
  mkdefs::locsrc::TimeFormats tf{U"%d.%m.%Y", U"%T", U"%a %x %X %Z", U"", U""};
  const std::pair<const char32_t *, const char32_t *> cases[] = {
      {U"%e.%-m.%y", U"%#d.%#m.%y"},
      {U"%k:%M %P", U"%#H:%M %p"},
      {U"%D %R", U"%m/%d/%y %H:%M"},
      {U"%r", U"%I:%M:%S %p"},
      {U"%c", U"%a %d.%m.%Y %H:%M:%S"},
      {U"%a %d %b %Y %T %Z", U"%a %d %b %Y %H:%M:%S"},
      {U"%d/%m/%Ey", U"%d/%m/%Y"},
      {U"%EC %Ey", U"%Y"},
      {U"%C%y %C", U"%Y"},
      {U"%Od%h%%", U"%d%b%%"},
      {U"100%", U"100%%"},
  };
  for (const auto &[src, want] : cases)
    EXPECT_EQ(toUtf8(mkdefs::locsrc::translatePattern(src, tf)), toUtf8(want)) << toUtf8(src);

  const std::pair<mkdefs::locsrc::TimeFormats, const char32_t *> longDates[] = {
      {{U"%m/%d/%Y", U"%r", U"", U"%I:%M:%S %p", U"%a %b %e %r %Z %Y"}, U"%A %B %#d %Y"},
      {{U"%d.%m.%Y", U"%T", U"%a %d %b %Y %T", U"", U""}, U"%A %d %B %Y"},
      {{U"%Y-%m-%d", U"%T", U"", U"", U"%A, %d. %B %Y, %H:%M"}, U"%A, %d. %B %Y"},
      {{U"%Y-%m-%d", U"%T", U"", U"", U"%Y\u5E74%m\u6708%d\u65E5%H\u6642"}, U"%Y\u5E74%m\u6708%d\u65E5"},
      {{U"%d.%m.%Y", U"%T", U"%T", U"", U"%T"}, U"%d.%m.%Y"},
  };
  for (const auto &[fmts, want] : longDates)
    EXPECT_EQ(toUtf8(mkdefs::locsrc::longDatePattern(fmts)), toUtf8(want)) << toUtf8(fmts.dateFmt);
}

}  // namespace

namespace {

struct Entry {
  std::u16string key, result;
};
std::vector<Entry> specialTable(const DefObject &o, int table) {
  const auto &b = o.sections[0];
  std::vector<Entry> t;
  size_t at = word(o, table == 44 ? 49 : 50);
  for (size_t i = 0; i < word(o, table == 44 ? 3 : 4); ++i, at += 8) {
    auto u = [&](size_t k) { return static_cast<char16_t>(b.at(at + k) << 8 | b.at(at + k + 1)); };
    Entry e;
    for (size_t k : {0, 2})
      if (u(k) || k == 0) e.key += u(k);
    for (size_t k : {4, 6})
      if (u(k) || k == 4) e.result += u(k);
    t.push_back(e);
  }
  return t;
}

std::u16string bmp(const std::u32string &s) { return std::u16string(s.begin(), s.end()); }

}  // namespace

// Each language's tables against SpecialCasing.txt: every entry comes from a rule of the
// language or of all languages, every unconditional rule that fits is there unless the
// language has its own for that key, and the flag says whether anything is.
TEST_F(Generated, SpecialCasingFollowsTheFile) {
  mkdefs::SpecialCasing sc;
  std::string err;
  ASSERT_TRUE(mkdefs::readSpecialCasing("/usr/share/unicode", &sc, &err)) << err;
  size_t languages = 0;
  for (const auto &o : *objs_) {
    if (o.type != 0) continue;
    ++languages;
    const std::string code = text8(o, 5);
    for (int table : {44, 45}) {
      const bool up = table == 44;
      std::map<std::u16string, std::u16string> got;
      for (const Entry &e : specialTable(o, table)) {
        EXPECT_TRUE(got.emplace(e.key, e.result).second) << o.name << " key repeated";
        bool traced = false;
        for (const auto &r : sc.rules) {
          if (!r.language.empty() && r.language != code) continue;
          const std::u16string want = bmp(up ? r.upper : r.lower);
          if (e.key == bmp({r.code}) && e.result == want) traced = true;
          if (r.context == "After_Soft_Dotted" && e.key.size() == 2 && e.key[1] == r.code) traced = true;
        }
        EXPECT_TRUE(traced) << o.name << " table " << table << " key U+" << std::hex << int(e.key[0]);
      }
      for (const auto &r : sc.rules) {
        const std::u32string &res = up ? r.upper : r.lower;
        if (!r.language.empty() || !r.context.empty() || res.size() != 2) continue;
        const bool own = std::any_of(sc.rules.begin(), sc.rules.end(),
                                     [&](const auto &x) { return x.language == code && x.code == r.code; });
        if (!own) {
          EXPECT_EQ(got[bmp({r.code})], bmp(res)) << o.name << " U+" << std::hex << int(r.code);
        }
      }
    }
    EXPECT_EQ(word(o, 51), word(o, 3) || word(o, 4) ? 1 : 0) << o.name;
  }
  EXPECT_GT(languages, 20u);

  // Beyond the rules above: a language's rule whose result the simple mapping gives is left
  // out, and a rule with a context is taken. (German sharp s and the Turkish i's are read
  // through the library in MapString.GeneratedLanguagesCaseSpecially.)
  const auto table = [&](const char *lang, int t) {
    std::map<std::u16string, std::u16string> m;
    for (const Entry &e : specialTable(get(0, lang), t)) m[e.key] = e.result;
    return m;
  };
  EXPECT_EQ(table("Turkish", 45).count(u"\u0130"), 0u);
  EXPECT_EQ(table("Lithuanian", 44)[u"i\u0307"], u"I");
}
