// The special-casing reader on its own, for languages the generated set does not hold,
// and the generated tables as the library reads them.
#include <gtest/gtest.h>

#include <filesystem>

#include "specialcase.h"
#include "frame/frame.h"
#include "support/hooks.h"

namespace {

using mkdefs::SpecialEntry;

class SpecialCasingFile : public ::testing::Test {
 protected:
  static void SetUpTestSuite() {
    std::string err;
    ok_ = mkdefs::loadUnicode("", &ucd_, &err) && mkdefs::readSpecialCasing("/usr/share/unicode", &sc_, &err);
    err_ = err;
  }
  void SetUp() override { ASSERT_TRUE(ok_) << err_; }
  static bool has(const std::vector<SpecialEntry> &t, SpecialEntry e) {
    return std::find(t.begin(), t.end(), e) != t.end();
  }
  static const SpecialEntry *find(const std::vector<SpecialEntry> &t, uint16_t k1, uint16_t k2 = 0) {
    for (const SpecialEntry &e : t)
      if (e.key1 == k1 && e.key2 == k2) return &e;
    return nullptr;
  }
  static inline mkdefs::UnicodeProps ucd_;
  static inline mkdefs::SpecialCasing sc_;
  static inline bool ok_ = false;
  static inline std::string err_;
};

TEST_F(SpecialCasingFile, LanguageRulesComeFirstAndClaimTheirKeys) {
  struct Row {
    const char *lang;
    bool upper;
    SpecialEntry entry;
  } rows[] = {
      {"az", true, {'i', 0, 0x130, 0}},
      {"az", false, {'I', 0, 0x131, 0}},
      {"lt", true, {'i', 0x307, 'I', 0}},       // the dot above goes with upper case
      {"lt", true, {'j', 0x307, 'J', 0}},
      {"lt", true, {0x12F, 0x307, 0x12E, 0}},
      {"lt", true, {0xDF, 0, 'S', 'S'}},
      {"xx", false, {0x130, 0, 'i', 0x307}},
      {"xx", true, {0x1F80, 0, 0x1F08, 0x399}},
  };
  for (const Row &r : rows) {
    auto t = mkdefs::specialTablesFor(sc_, r.lang, ucd_);
    EXPECT_TRUE(has(r.upper ? t.upper : t.lower, r.entry)) << r.lang << " U+" << std::hex << r.entry.key1;
  }
  auto tr = mkdefs::specialTablesFor(sc_, "tr", ucd_);
  EXPECT_EQ(find(tr.lower, 0x130), nullptr) << "the language's rule is the simple one and claims the key";
  EXPECT_EQ(find(tr.lower, 'I', 0x307), nullptr) << "shadowed by the single key, so reported";
  auto lt = mkdefs::specialTablesFor(sc_, "lt", ucd_);
  EXPECT_EQ(find(lt.lower, 0xCC), nullptr) << "three units";
  EXPECT_EQ(find(lt.lower, 'I'), nullptr) << "needs the mark that follows";
}

// What the tables cannot carry is named, and nothing equal to the simple mapping is kept.
TEST_F(SpecialCasingFile, ReportsWhatDoesNotFitAndKeepsNoSimpleMapping) {
  auto lt = mkdefs::specialTablesFor(sc_, "lt", ucd_);
  auto named = [&](const std::string &what) {
    for (const std::string &u : lt.unfit)
      if (u.find(what) != std::string::npos) return true;
    return false;
  };
  EXPECT_TRUE(named("U+00CC lower: 3 units"));
  EXPECT_TRUE(named("U+FB03 upper: 3 units"));
  EXPECT_TRUE(named("More_Above"));
  EXPECT_TRUE(named("Final_Sigma"));
  for (const auto *t : {&lt.upper, &lt.lower})
    for (const SpecialEntry &e : *t) {
      const bool up = t == &lt.upper;
      if (e.key2 || e.res2) continue;
      EXPECT_NE(e.res1, up ? ucd_.upper[e.key1] : ucd_.lower[e.key1]) << std::hex << e.key1;
    }
}

TEST(SpecialCasingRead, RefusesAMalformedFile) {
  namespace fs = std::filesystem;
  fs::path dir = fs::temp_directory_path() / ("vl_sc_" + std::to_string(getpid()));
  fs::create_directories(dir);
  {
    std::FILE *f = std::fopen((dir / "SpecialCasing.txt").c_str(), "w");
    std::fputs("00DF; 00DF; 0053 0073; 0053 0053; # ok\n0130; zz; 0130; 0130;\n", f);
    std::fclose(f);
  }
  mkdefs::SpecialCasing sc;
  std::string err;
  EXPECT_FALSE(mkdefs::readSpecialCasing(dir.string(), &sc, &err));
  EXPECT_NE(err.find("SpecialCasing.txt:2"), std::string::npos) << err;
  fs::remove_all(dir);
}

// The generated Turkish language through the library's own lookup.
TEST(SpecialCasingGenerated, TurkishThroughTheLibrary) {
  if (!std::filesystem::exists(std::string(VL_TEST_DEFS_DIR) + "/control.nls")) GTEST_SKIP();
  ts::Library lib(VL_TEST_DEFS_DIR, VL_OPT_NOBUILTIN);
  ASSERT_EQ(lib.rc, 0u);
  uint32_t rc = 0;
  VLObjEntry *tr = VLGetObjFromName(vlglobals->objManager, VL_OBJ_LANGUAGE, "Turkish", 7, 0, &rc);
  ASSERT_NE(tr, nullptr) << rc;
  VLUChar a = 0, b = 0;
  EXPECT_EQ(VLLangGetSpecial(tr, 'i', 0, &a, &b, 44), 1);
  EXPECT_EQ(a, 0x130);
  EXPECT_EQ(VLLangGetSpecial(tr, 0xDF, 0, &a, &b, 44), 2);
  EXPECT_EQ(a, 'S');
  EXPECT_EQ(b, 'S');
  EXPECT_EQ(VLLangGetSpecial(tr, 'I', 0, &a, &b, 45), 1);
  EXPECT_EQ(a, 0x131);
}

}  // namespace
