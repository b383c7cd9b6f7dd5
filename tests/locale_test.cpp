// Locale handles: names, defaults, fallbacks, codes, and changes of territory or code page.
#include <gtest/gtest.h>

#include "locale/locale.h"
#include "support/defdir.h"
#include "support/hooks.h"

namespace {

class Locale : public ::testing::Test {
 protected:
  static void SetUpTestSuite() {
    dir_ = new ts::TempDir;
    ts::DefDir::standard().write(dir_->path, "Latin1 ISO-8859-1 8859-1\n  CP819\nIBM-930 CP930\n");
  }
  static void TearDownTestSuite() { delete dir_; }
  void SetUp() override { lib_ = std::make_unique<ts::Library>(dir_->path.c_str()); }
  void TearDown() override {
    lib_.reset();
    EXPECT_EQ(ts::hooks.live, 0);
  }
  static inline ts::TempDir *dir_ = nullptr;
  std::unique_ptr<ts::Library> lib_;
};

std::string describe(const VLLocale *l) {
  return std::string(l->language->name) + "_" + l->territory->name + "." + l->codePage->name + "@" +
         (l->sort ? l->sort->name : "Binary");
}

TEST_F(Locale, NamesDefaultsAndCodesInEveryForm) {
  struct Case {
    const char *name;
    uint32_t options;
    uint32_t rc;
    const char *expect;  // null when no handle comes back
  } cases[] = {
      {"", 0, 0, "English_UnitedStates.US-ASCII@Binary"},
      {"German", 0, 0, "German_Germany.Latin1@Binary"},
      {"German_UnitedStates", 0, 0, "German_UnitedStates.Latin1@Binary"},
      {"german_unitedstates.ms932", 0, 0, "German_UnitedStates.MS932@Binary"},
      {"English_UnitedStates.US-ASCII@BINARY", 0, 0, "English_UnitedStates.US-ASCII@Binary"},
      {"English@binary", 0, 0, "English_UnitedStates.US-ASCII@Binary"},
      {"German.ISO-8859-1", 0, 0, "German_Germany.Latin1@Binary"},  // an alias
      {"German.cp819", 0, 0, "German_Germany.Latin1@Binary"},       // a continuation-line alias
      {"Klingon", 0, VL_RC_NOLANGUAGE, nullptr},
      {"Klingon", VL_LOCALE_FALLBACK, 0, "English_UnitedStates.US-ASCII@Binary"},
      {"German_Atlantis", 0, VL_RC_NOTERRITORY, nullptr},
      {"German_Atlantis", VL_LOCALE_FALLBACK, 0, "German_Germany.Latin1@Binary"},
      {"German_Germany.EBCDIC-X", 0, VL_RC_NOCODEPAGE, nullptr},
      {"German_Germany.EBCDIC-X", VL_LOCALE_FALLBACK, 0, "German_Germany.Latin1@Binary"},
      {"German@Phonebook", 0, VL_RC_NOSORT, nullptr},
      {"German@Phonebook", VL_LOCALE_FALLBACK, 0, "German_Germany.Latin1@Binary"},
      {"German", 0x1, VL_RC_BADARG, nullptr},
      {"German", 0x8, VL_RC_BADARG, nullptr},
  };
  for (const auto &c : cases) {
    // The same name in the byte, wide and UTF-16 forms.
    const std::vector<VLWChar> w(c.name, c.name + std::strlen(c.name) + 1);
    const std::vector<VLUChar> u(c.name, c.name + std::strlen(c.name) + 1);
    uint32_t rc[3] = {77, 77, 77};
    VLLocale *forms[] = {VLGetLocale(c.name, c.options, &rc[0]), VLGetLocaleW(w.data(), c.options, &rc[1]),
                         VLGetLocaleU(u.data(), c.options, &rc[2])};
    for (int f = 0; f < 3; ++f) {
      EXPECT_EQ(rc[f], c.rc) << c.name << " form " << f;
      ASSERT_EQ(forms[f] != nullptr, c.expect != nullptr) << c.name << " form " << f;
      if (!forms[f]) continue;
      EXPECT_EQ(describe(forms[f]), c.expect) << c.name << " form " << f;
      EXPECT_EQ(VLGetError(forms[f]), 0);
      EXPECT_EQ(VLReleaseLocale(forms[f]), 0u);
    }
  }
  const VLUChar accented[] = {u'G', 0x0165, 0};  // no such name; low byte must not match anything
  uint32_t rc;
  EXPECT_EQ(VLGetLocaleU(accented, 0, &rc), nullptr);
  EXPECT_EQ(rc, VL_RC_NOLANGUAGE);
}

TEST_F(Locale, ModifiableValuesFollowTerritoryAndCodePage) {
  uint32_t rc;
  VLLocale *l = VLGetLocale("German_Germany.Latin1", 0, &rc);
  ASSERT_NE(l, nullptr);
  EXPECT_EQ(l->chars[2], ',');
  EXPECT_EQ(l->chars[3], '.');
  EXPECT_STREQ(l->texts[1], "\x1A") << "the euro sign is not in this page: substitution";
  EXPECT_EQ(l->textsU[1][0], 0x20AC);
  EXPECT_EQ(l->flags & 0x3F, 0x05);  // flags word 0x0A shifted down by one

  uint32_t crc;
  VLObjEntry *us = VLGetObjFromName(vlglobals->objManager, 1, "UnitedStates", 12, 0, &crc);
  EXPECT_EQ(VLLocaleChangeTerritory(l, us), 0u);
  EXPECT_EQ(l->chars[2], '.');
  EXPECT_STREQ(l->texts[1], "$");

  VLObjEntry *dbcs = VLGetObjFromID(vlglobals->objManager, 2, 932, 0, &crc);
  EXPECT_EQ(VLLocaleChangeCodePage(l, dbcs), 0u);
  EXPECT_EQ(l->flags & (VL_LF_SINGLEBYTE | VL_LF_SHIFT), 0);
  EXPECT_STREQ(l->texts[5], "%H:%M:%S");

  // A group separator that would become double-byte refuses the change, all or nothing.
  VLLocale *fr = VLGetLocale("German_France.Latin1", 0, &rc);
  ASSERT_NE(fr, nullptr);
  EXPECT_EQ(fr->chars[3], 0xA0);
  char *currency = fr->texts[1];
  EXPECT_EQ(VLLocaleChangeCodePage(fr, dbcs), VL_RC_NOSBCSPUNCT);
  EXPECT_STREQ(fr->codePage->name, "Latin1");
  EXPECT_EQ(fr->texts[1], currency);
  EXPECT_EQ(fr->flags & VL_LF_SINGLEBYTE, VL_LF_SINGLEBYTE);
  EXPECT_EQ(VLGetError(fr), static_cast<int32_t>(VL_RC_NOSBCSPUNCT));
  EXPECT_EQ(VLReleaseLocale(fr), 0u);
  EXPECT_EQ(VLReleaseLocale(l), 0u);
}

TEST_F(Locale, ShiftSensitiveTexts) {
  ts::TempDir d;
  ts::DefDir defs = ts::DefDir::standard();
  for (auto &o : defs.objects) {
    if (o.name == "English") o.sections[0] = ts::languageBody(840, 930, 0, u"en", u"English");
    if (o.name == "UnitedStates") o.sections[0] = ts::territoryBody(u"A\u4E00\u4E01B", u"US", ' ', ' ');
  }
  defs.write(d.path);
  lib_.reset();
  ts::Library lib(d.path.c_str());
  uint32_t rc;
  VLLocale *l = VLGetLocale("English", 0, &rc);
  ASSERT_NE(l, nullptr);
  EXPECT_EQ(l->flags & VL_LF_SHIFT, VL_LF_SHIFT);
  EXPECT_STREQ(l->texts[1], "\xC1\x0E\x45\x41\x45\x42\x0F\xC2");
  char out[32];
  VLObjEntry *latin = VLGetObjFromID(vlglobals->objManager, 2, 819, 0, &rc);
  EXPECT_EQ(VLLocaleCnvText(l->codePage, latin, l->texts[1], out), 5);
  EXPECT_STREQ(out, "A\x1A\x1A" "B");
  VLReleaseLocale(l);
}

}  // namespace
