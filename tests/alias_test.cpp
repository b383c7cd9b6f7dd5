// Code page aliases: the file's rules and limits, the list they build, and lookups;
// language special-case tables.
#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <string>
#include <utility>
#include <vector>

#include "store/store.h"
#include "support/defdir.h"
#include "support/hooks.h"

namespace {

using List = std::vector<std::pair<std::string, std::string>>;

List aliases() {
  List l;
  for (const VLAlias *a = vlglobals->objManager->aliases; a; a = a->next) l.emplace_back(a->codePage, a->alias);
  return l;
}

class Alias : public ::testing::Test {
 protected:
  void SetUp() override {
    ts::DefDir::standard().write(dir_.path);
    lib_ = std::make_unique<ts::Library>(dir_.path.c_str());
    ASSERT_EQ(lib_->rc, 0u);
  }
  void TearDown() override {
    lib_.reset();
    EXPECT_EQ(ts::hooks.live, 0);
  }
  // Rebuilds the manager's list from the given file text.
  int rebuild(const std::string &text) {
    std::ofstream(dir_.file("alias.txt"), std::ios::trunc) << text;
    VLDestroyAliasList(vlglobals->objManager);
    return VLBuildAliasList(vlglobals->objManager);
  }
  ts::TempDir dir_;
  std::unique_ptr<ts::Library> lib_;
};

TEST_F(Alias, FileRulesAndLimits) {
  const std::string a64(64, 'a'), a65(65, 'b'), n32(32, 'N'), n33(33, 'M');
  struct Case {
    std::string text;
    int rc;
    List expect;
  } cases[] = {
      // The first failure stops the build; what came before it stays.
      {"IBM-850 cp850\t850\n  PC-850\n# IBM-437 cp437\n\n \t \nLatin1 iso-8859-1\n", 0,
       {{"IBM-850", "CP850"}, {"IBM-850", "850"}, {"IBM-850", "PC-850"}, {"Latin1", "ISO-8859-1"}}},
      {"X " + a64 + " " + a65 + " after\nY y\n", 1, {{"X", std::string(64, 'A')}}},
      {n32 + " a\n" + n33 + " b\nY c\n", 1, {{n32, "A"}}},
      {"  lonely\nX a\n", 1, {}},
      {"\tlonely\n", 1, {}},
      {"X\n  a b\nY\n", 0, {{"X", "A"}, {"X", "B"}}},  // a name alone, then its aliases
      {"", 0, {}},
  };
  for (const Case &c : cases) {
    SCOPED_TRACE(c.text.substr(0, 40));
    EXPECT_EQ(rebuild(c.text), c.rc);
    EXPECT_EQ(aliases(), c.expect);
  }
  std::remove(dir_.file("alias.txt").c_str());
  VLDestroyAliasList(vlglobals->objManager);
  int rc = VLBuildAliasList(vlglobals->objManager);
  if (!std::getenv("TRC1_FLAGS")) {
    EXPECT_EQ(rc, 0) << "no file, no tracing: no error";
  }
  EXPECT_TRUE(aliases().empty());
}

TEST_F(Alias, Lookup) {
  ASSERT_EQ(rebuild("IBM-850 cp850 PC-850\nLatin1 ISO-8859-1\n  l1\n"), 0);
  VLObjManager *m = vlglobals->objManager;
  const std::pair<const char *, const char *> cases[] = {
      {"pc-850", "IBM-850"}, {"PC-850", "IBM-850"}, {"Cp850", "IBM-850"}, {"L1", "Latin1"},
      {"PC-85", nullptr},    {"PC-8500", nullptr},  {"IBM-850", nullptr}, {"", nullptr},
  };
  for (auto [name, want] : cases) {
    const char *got = VLGetCodepageFromAlias(m, name);
    if (want)
      EXPECT_STREQ(got, want) << name;
    else
      EXPECT_EQ(got, nullptr) << name;
  }
}

// Special-case tables 44 and 45 of a language body: entries of key pair and result pair.
TEST(LangSpecial, Tables) {
  ts::TempDir dir;
  ts::DefDir d = ts::DefDir::standard();
  ts::Bytes b = ts::languageBody(840, 367, 0, u"tr", u"Turkish");
  const uint16_t t44[][4] = {{0x69, 0, 0x130, 0}, {0xDF, 0, 0x53, 0x53}, {0x69, 0x307, 0x49, 0}, {0x69, 0, 0x49, 0}};
  const uint16_t t45[][4] = {{0x49, 0, 0x131, 0}};
  mkdefs::set16(b, 6, 4);
  mkdefs::set16(b, 8, 1);
  mkdefs::set16(b, 98, static_cast<uint16_t>(b.size()));
  for (auto &e : t44)
    for (uint16_t v : e) mkdefs::put16(b, v);
  mkdefs::set16(b, 100, static_cast<uint16_t>(b.size()));
  for (auto &e : t45)
    for (uint16_t v : e) mkdefs::put16(b, v);
  d.objects[0].sections[0] = b;
  d.write(dir.path);
  ts::Library lib(dir.path.c_str());
  uint32_t rc;
  const VLObjEntry *lang = VLGetObjFromID(vlglobals->objManager, 0, 1, 0, &rc);
  ASSERT_NE(lang, nullptr);
  struct Case {
    VLUChar first, second;
    int table, result;
    VLUChar out1, out2;
  } cases[] = {
      {0x69, 0, 44, 1, 0x130, 0},  // the first matching entry wins
      {0xDF, 0, 44, 2, 0x53, 0x53}, {0x69, 0x307, 44, 1, 0x49, 0}, {0x49, 0, 45, 1, 0x131, 0},
      {0x49, 0, 44, 0, 0, 0},       {0x69, 0, 45, 0, 0, 0},        {0x69, 0, 46, 0, 0, 0},
  };
  for (const Case &c : cases) {
    VLUChar o1 = 0, o2 = 0;
    EXPECT_EQ(VLLangGetSpecial(lang, c.first, c.second, &o1, &o2, c.table), c.result) << c.first << " " << c.table;
    EXPECT_EQ(o1, c.out1);
    EXPECT_EQ(o2, c.out2);
  }
}

}  // namespace
