// Native locale names: mapping (simple, composite, unknown), handles from native names,
// the default locale, enumeration, the reverse mapping, the user's locale, and the
// conventions copied from platform locales built with localedef.
#include <gtest/gtest.h>

#include <clocale>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <string>
#include <vector>

#include "support/defdir.h"
#include "support/gendefs.h"
#include "veltrin.h"

namespace {


std::string mapped(const char *native, int32_t size = 132) {
  char out[132];
  std::memset(out, 'x', sizeof out);
  EXPECT_EQ(VLMapNativeLocale(native, out, size), out);
  return out;
}

TEST(NativeNames, MapSimpleAndCompositeNames) {
  struct Case {
    const char *native;
    const char *name;
  } cases[] = {
      {"de_DE@euro", "German_Germany.UTF-8@Default"},
      {"C", "English_UnitedStates.US-ASCII@Binary"},
      {"POSIX", "English_UnitedStates.US-ASCII@Binary"},
      {"zh_TW.euctw", "TraditionalChinese_Taiwan.EUC-TW@Binary"},
      {"ja_JP.eucJP", "Japanese_Japan.JapanEUC@Binary"},
      {"de_DE.UTF-8", "Unknown"},  // the table spells it ".utf8"
      {"de_de", "Unknown"},        // exact, case-sensitive
      {"de_DE.utf8.extra.long", "Unknown"},
      {"", "Unknown"},
      {"LC_CTYPE=ja_JP.sjis;LC_NUMERIC=de_DE;LC_TIME=fr_FR;LC_COLLATE=es_ES;LC_MONETARY=C",
       "French_Germany.MS932@Spanish"},
      {"LC_CTYPE=xx_XX;LC_NUMERIC=de_DE;LC_TIME=C;LC_COLLATE=C", "English_Germany.Unknown@Binary"},
      {"LC_CTYPE=C;LC_NUMERIC=C", "Unknown_UnitedStates.US-ASCII@Unknown"},
  };
  for (const Case &c : cases) EXPECT_EQ(mapped(c.native), c.name) << c.native;
  EXPECT_EQ(mapped("de_DE@euro", 8), "German_");
  EXPECT_EQ(mapped("nowhere", 4), "Unk");
  EXPECT_EQ(mapped("C", 1), "");
}

using Native = ts::DefsTest;

std::string nameOf(const VLLocale *l) {
  return std::string(l->language->name) + "_" + l->territory->name + "." + l->codePage->name + "@" +
         (l->sort ? l->sort->name : "Binary");
}

TEST_F(Native, HandlesFromNativeNames) {
  struct Case {
    const char *native;
    uint32_t options, rc;
    const char *name;  // null: no handle
  } cases[] = {
      {"C", 0, 0, "English_UnitedStates.US-ASCII@Binary"},
      {"POSIX", 1, 0, "English_UnitedStates.US-ASCII@Binary"},
      {"de_DE.UTF-8", 0, VL_RC_NOLANGUAGE, nullptr},
      {"de_DE.UTF-8", 4, 0, "English_UnitedStates.US-ASCII@Default"},
      {"de_DE@euro", 4, 0, "German_Germany.UTF-8@Default"},  // the language's own sort
      {"C", 2, VL_RC_BADARG, nullptr},
      {"C", 8, VL_RC_BADARG, nullptr},
  };
  for (const Case &c : cases) {
    uint32_t rc = 99;
    VLLocale *l = VLConvertNativeLocale(c.native, c.options, &rc);
    EXPECT_EQ(rc, c.rc) << c.native;
    ASSERT_EQ(l != nullptr, c.name != nullptr) << c.native;
    if (!l) continue;
    EXPECT_EQ(nameOf(l), c.name);
    VLReleaseLocale(l);
  }
}

TEST_F(Native, SetLocaleReplacesTheDefaultOnlyOnSuccess) {
  EXPECT_EQ(VLSetLocale("German_Germany", 0), 0u);
  ASSERT_NE(vlglocale, nullptr);
  EXPECT_EQ(nameOf(vlglocale), "German_Germany.Latin1@Default");
  EXPECT_EQ(VLSetLocale("Klingon", 0), VL_RC_NOLANGUAGE);
  EXPECT_EQ(nameOf(vlglocale), "German_Germany.Latin1@Default");
  const VLWChar w[] = {'E', 'n', 'g', 'l', 'i', 's', 'h', 0};
  EXPECT_EQ(VLSetLocaleW(w, 0), 0u);
  EXPECT_EQ(nameOf(vlglocale), "English_UnitedStates.US-ASCII@Default");
  const VLUChar u[] = {'G', 'e', 'r', 'm', 'a', 'n', '.', 'M', 'S', '9', '3', '2', 0};
  EXPECT_EQ(VLSetLocaleU(u, 0), 0u);
  EXPECT_EQ(nameOf(vlglocale), "German_Germany.MS932@Default");
  EXPECT_EQ(VLSetLocale("x", 1), VL_RC_BADARG);
}

// Names seen by an enumeration; the walk stops after `stopAfter` of them.
struct Seen {
  std::vector<std::pair<int, std::string>> names;
  size_t stopAfter = SIZE_MAX;
  template <class Char>
  static int add(void *c, int type, const Char *n) {
    auto *s = static_cast<Seen *>(c);
    std::string name;
    while (*n) name += static_cast<char>(*n++);
    s->names.emplace_back(type, name);
    return s->names.size() < s->stopAfter ? 1 : 0;
  }
};

TEST_F(Native, EnumerationInTableOrderInThreeForms) {
  Seen bytes, wide, utf16, once;
  once.stopAfter = 1;
  EXPECT_EQ(VLEnumLocales(Seen::add<char>, &bytes), 0);
  VLEnumLocales(Seen::add<char>, &once);
  VLEnumLocalesW(Seen::add<VLWChar>, &wide);
  VLEnumLocalesU(Seen::add<VLUChar>, &utf16);
  ASSERT_GT(bytes.names.size(), 100u);
  EXPECT_EQ(once.names.size(), 1u);
  EXPECT_EQ(wide.names, bytes.names);
  EXPECT_EQ(utf16.names, bytes.names);
  EXPECT_EQ(bytes.names.front(), std::make_pair(0, std::string("English")));
  for (size_t i = 1; i < bytes.names.size(); ++i) EXPECT_LE(bytes.names[i - 1].first, bytes.names[i].first);
}

TEST_F(Native, ReverseMapping) {
  struct Case {
    const char *name;
    int32_t size;
    const char *native;  // null: nothing written
  } cases[] = {
      {"English_UnitedStates.US-ASCII", 16, "C"},
      {"German_Germany.UTF-8", 16, "de_DE.utf8"},  // before "de_DE@euro"
      {"German_Germany.Latin1", 16, "de_DE"},
      {"Japanese_Japan.MS932", 16, "ja_JP.sjis"},
      {"German_Germany.UTF-8", 10, nullptr},  // no room for the 0
      {"German_UnitedStates.MS932", 16, nullptr},
  };
  for (const Case &c : cases) {
    VLLocale *l = loc(c.name);
    ASSERT_NE(l, nullptr);
    char out[16] = "unchanged";
    EXPECT_EQ(VLConvertLocale(l, out, c.size), c.native ? 1 : 0) << c.name;
    EXPECT_STREQ(out, c.native ? c.native : "unchanged") << c.name;
  }
}

using ts::EnvScope;

TEST(NativeUser, UserLocaleFromTheEnvironment) {
  const std::string before = std::setlocale(LC_ALL, nullptr);
  char out[132];
  {
    EnvScope lang("VL_LANG", "German_Germany.Latin1");
    EXPECT_EQ(VLGetUserLocale(out, sizeof out), 1);
    EXPECT_STREQ(out, "German_Germany.Latin1");
    EXPECT_EQ(VLGetUserLocale(out, 7), 1);
    EXPECT_STREQ(out, "German");
  }
  EnvScope lang("VL_LANG", nullptr), all("LC_ALL", "C");
  EXPECT_EQ(VLGetUserLocale(out, sizeof out), 2);
  EXPECT_STREQ(out, "English_UnitedStates.US-ASCII@Binary");
  EXPECT_EQ(before, std::setlocale(LC_ALL, nullptr));
}

// ---- Conventions from platform locales --------------------------------------------------

// Builds de_DE in ISO-8859-1 with localedef into a directory of its own.
class NativeInfo : public Native {
 protected:
  static void SetUpTestSuite() {
    dir_ = new ts::TempDir;
    built_ = ts::localedef("de_DE", "ISO-8859-1", dir_->file("de_DE"));
  }
  static void TearDownTestSuite() { delete dir_; }
  void SetUp() override {
    if (!built_) GTEST_SKIP() << "localedef could not build de_DE";
    locpath_ = std::make_unique<EnvScope>("LOCPATH", dir_->path.c_str());
    Native::SetUp();
    // The platform is the oracle: what it reports for de_DE.
    std::string saved = std::setlocale(LC_ALL, nullptr);
    ASSERT_NE(std::setlocale(LC_ALL, "de_DE"), nullptr);
    lc_ = *std::localeconv();
    decimal_ = lc_.decimal_point;
    thousands_ = lc_.thousands_sep;
    currency_ = lc_.currency_symbol;
    std::setlocale(LC_ALL, saved.c_str());
  }
  void TearDown() override {
    Native::TearDown();
    locpath_.reset();
  }
  std::string text(VLLocale *l, int item) {
    char b[64] = {0};
    VLGetLocaleTextInfo(l, item, b, sizeof b, 0);
    return b;
  }
  static inline ts::TempDir *dir_ = nullptr;
  static inline bool built_ = false;
  std::unique_ptr<EnvScope> locpath_;
  lconv lc_;
  std::string decimal_, thousands_, currency_;
};

// The platform's conventions are always taken; its separators and texts only into a handle
// whose code page is the platform locale's own.
TEST_F(NativeInfo, ConventionsAlwaysSeparatorsAndTextsInTheSameCodePage) {
  const std::string before = std::setlocale(LC_ALL, nullptr);
  ASSERT_EQ(decimal_.size(), 1u);
  for (auto [name, same] : {std::pair{"German_Germany.Latin1", true}, {"English_UnitedStates.MS1252", false}}) {
    SCOPED_TRACE(name);
    VLLocale *l = loc(name);
    ASSERT_NE(l, nullptr);
    const uint8_t decimal = same ? static_cast<uint8_t>(decimal_[0]) : l->chars[2];
    const std::string currency = same && !currency_.empty() ? currency_ : text(l, 64);
    VLMapNativeInfo("de_DE", l, 0);
    EXPECT_EQ(before, std::setlocale(LC_ALL, nullptr));
    EXPECT_EQ(l->chars[2], decimal);
    EXPECT_EQ(l->wchars[0], decimal);
    if (same && thousands_.size() == 1) {
      EXPECT_EQ(l->chars[3], static_cast<uint8_t>(thousands_[0]));
    }
    EXPECT_EQ(text(l, 64), currency);
    EXPECT_EQ(l->num[1], lc_.frac_digits);
    EXPECT_EQ(l->num[2], lc_.int_frac_digits);
    EXPECT_EQ((l->flags & 0x1) != 0, lc_.p_cs_precedes != 0);
    EXPECT_EQ((l->flags & 0x2) != 0, lc_.p_sep_by_space != 0);
    EXPECT_EQ(l->chars[1], lc_.n_sign_posn);
    EXPECT_EQ(text(l, 62), "3;3;0");
    // A native name the platform does not know changes nothing.
    l->num[1] = 9;
    VLMapNativeInfo("xx_NOWHERE", l, 0);
    EXPECT_EQ(l->num[1], 9);
  }
}

TEST_F(NativeInfo, UserLocaleFromThePlatformTakesItsConventions) {
  EnvScope lang("VL_LANG", nullptr), all("LC_ALL", "de_DE");
  uint32_t rc = 99;
  VLLocale *l = VLGetLocale(nullptr, VL_LOCALE_USER | VL_LOCALE_FALLBACK, &rc);
  ASSERT_NE(l, nullptr);
  EXPECT_EQ(rc, 0u);
  EXPECT_EQ(nameOf(l), "German_Germany.Latin1@Default");
  EXPECT_EQ(l->chars[2], static_cast<uint8_t>(decimal_[0]));
  EXPECT_EQ(VLGetError(l), 0);
  VLReleaseLocale(l);
}

}  // namespace
