// Case, width and digit mapping: the unit mappings against the Unicode Character
// Database, and the generated tables against a fresh generation.
#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <sstream>
#include <string>

#include "../tools/mkctype/ctypegen.h"
#include "veltrin.h"

namespace {

const mkdefs::UnicodeProps *database() {
  static mkdefs::UnicodeProps ucd;
  static bool loaded = [] {
    std::string err;
    return mkdefs::loadUnicode("/usr/share/unicode", &ucd, &err);
  }();
  return loaded ? &ucd : nullptr;
}

std::string slurp(const std::string &path) {
  std::ifstream in(path, std::ios::binary);
  std::ostringstream o;
  o << in.rdbuf();
  return o.str();
}

bool within(uint32_t u, std::initializer_list<std::pair<uint32_t, uint32_t>> ranges) {
  for (auto [lo, hi] : ranges)
    if (u >= lo && u <= hi) return true;
  return false;
}

bool inTables(uint32_t u, const char *prefix) {
  for (const mkctype::MapTable &t : mkctype::kMapTables)
    if (std::string(t.name).rfind(prefix, 0) == 0 && u >= t.first && u <= t.last) return true;
  return false;
}

// The committed tables are what the generator makes of the installed database.
TEST(MapTables, CommittedSourcesAreWhatTheDatabaseGives) {
  const mkdefs::UnicodeProps *ucd = database();
  if (!ucd) GTEST_SKIP() << "no Unicode Character Database installed";
  char path[] = "/tmp/uctypeXXXXXX";
  const int fd = mkstemp(path);
  ASSERT_GE(fd, 0);
  close(fd);
  std::string err;
  ASSERT_TRUE(mkctype::writeCtypeSource("/usr/share/unicode", path, &err)) << err;
  const std::string ctype = slurp(path);
  std::remove(path);
  EXPECT_TRUE(ctype == slurp(std::string(VL_SOURCE_DIR) + "/codepage/uctype.cpp"))
      << "codepage/uctype.cpp is stale: rebuild the uctype target";
  EXPECT_TRUE(mkctype::mapSource(*ucd) == slurp(std::string(VL_SOURCE_DIR) + "/codepage/unimap.cpp"))
      << "codepage/unimap.cpp is stale: rebuild the uctype target";
}

// Every BMP unit: inside the covered ranges the simple mapping of the database (with the
// deliberate Georgian exception), outside them the unit itself.
TEST(MapUnits, EveryUnitAgreesWithTheDatabase) {
  const mkdefs::UnicodeProps *ucd = database();
  if (!ucd) GTEST_SKIP() << "no Unicode Character Database installed";
  auto orSelf = [](uint16_t m, uint32_t u) { return m ? m : static_cast<uint16_t>(u); };
  int bad = 0;
  for (uint32_t u = 0; u < 0x10000 && bad < 20; ++u) {
    const auto c = static_cast<VLUChar>(u);
    uint16_t lower = u, upper = u, full = u, half = u;
    if (within(u, {{0x41, 0x5A}, {0xC0, 0xD6}, {0xD8, 0xDE}, {0x531, 0x556}, {0x2160, 0x216F}, {0x24B6, 0x24CF},
                   {0xFF21, 0xFF3A}}) ||
        inTables(u, "VL_UNICODE_Lower"))
      lower = ucd->lower[u];
    if (within(u, {{0x10A0, 0x10C5}})) lower = static_cast<uint16_t>(u + 0x30);  // to Mkhedruli, not Nuskhuri
    if (within(u, {{0x61, 0x7A}, {0xE0, 0xF6}, {0xF8, 0xFF}, {0x561, 0x586}, {0x2170, 0x217F}, {0x24D0, 0x24E9},
                   {0xFF41, 0xFF5A}}) ||
        inTables(u, "VL_UNICODE_Upper"))
      upper = ucd->upper[u];
    if (within(u, {{0x20, 0x7E}, {0x20A9, 0x20A9}}) || inTables(u, "VL_UNICODE_H2F")) full = orSelf(ucd->wide[u], u);
    if (within(u, {{0xFF01, 0xFF5E}, {0x2190, 0x2193}}) || inTables(u, "VL_UNICODE_F2H"))
      half = orSelf(ucd->narrow[u], u);
    bool ok = VLUnicodeToLower(nullptr, c) == lower && VLUnicodeToUpper(nullptr, c) == upper &&
              VLUnicodeToH2F(nullptr, c) == full && VLUnicodeToF2H(nullptr, c) == half;
    if (!ok) {
      ++bad;
      ADD_FAILURE() << std::hex << "U+" << u << ": lower " << VLUnicodeToLower(nullptr, c) << " want " << lower
                    << ", upper " << VLUnicodeToUpper(nullptr, c) << " want " << upper << ", full "
                    << VLUnicodeToH2F(nullptr, c) << " want " << full << ", half " << VLUnicodeToF2H(nullptr, c)
                    << " want " << half;
    }
  }
}

TEST(MapUnits, NamedCases) {
  struct Case {
    const char *what;
    VLUChar (*fn)(VLLocale *, VLUChar);
    VLUChar in, want;
  };
  const Case cases[] = {
      {"multiplication sign stays", VLUnicodeToLower, 0xD7, 0xD7},
      {"division sign stays", VLUnicodeToUpper, 0xF7, 0xF7},
      {"y with diaeresis upper-cases outside Latin-1", VLUnicodeToUpper, 0xFF, 0x178},
      {"Georgian small letter has no upper case", VLUnicodeToUpper, 0x10D0, 0x10D0},
      {"Georgian capital lower-cases to Mkhedruli", VLUnicodeToLower, 0x10A0, 0x10D0},
      {"Greek alpha with tonos lower-cases", VLUnicodeToLower, 0x386, 0x3AC},
      {"Greek small alpha with tonos upper-cases", VLUnicodeToUpper, 0x3AC, 0x386},
      {"entry with no counterpart keeps the unit", VLUnicodeToLower, 0x101, 0x101},
      {"dotted capital I lower-cases to i", VLUnicodeToLower, 0x130, 0x69},
      {"dotless i upper-cases to I", VLUnicodeToUpper, 0x131, 0x49},
      {"space widens to ideographic space", VLUnicodeToH2F, 0x20, 0x3000},
      {"cent sign widens", VLUnicodeToH2F, 0xA2, 0xFFE0},
      {"won sign widens", VLUnicodeToH2F, 0x20A9, 0xFFE6},
      {"half-width katakana wo widens", VLUnicodeToH2F, 0xFF66, 0x30F2},
      {"ideographic comma narrows", VLUnicodeToF2H, 0x3001, 0xFF64},
      {"ideographic space narrows", VLUnicodeToF2H, 0x3000, 0x20},
      {"leftwards arrow narrows", VLUnicodeToF2H, 0x2190, 0xFFE9},
      {"full-width A narrows", VLUnicodeToF2H, 0xFF21, 0x41},
      {"full-width a upper-cases", VLUnicodeToUpper, 0xFF41, 0xFF21},
  };
  for (const Case &c : cases) EXPECT_EQ(c.fn(nullptr, c.in), c.want) << c.what;
}

TEST(MapUnits, DigitTableHoldsEveryDecimalDigit) {
  const mkdefs::UnicodeProps *ucd = database();
  if (!ucd) GTEST_SKIP() << "no Unicode Character Database installed";
  uint32_t want = 0;
  for (uint32_t u = 0; u < 0x10000; ++u) want += ucd->digit[u] <= 9;
  ASSERT_EQ(std::size(VLDigits), want) << "every decimal digit of the database has its pair";
  for (size_t i = 0; i < std::size(VLDigits); ++i) {
    const uint32_t u = VLDigits[i][0];
    if (i) {
      EXPECT_LT(VLDigits[i - 1][0], u) << "ascending at " << i;
    }
    EXPECT_EQ(VLDigits[i][1], '0' + ucd->digit[u]) << std::hex << "U+" << u;
  }
}

TEST(MapUnits, SetLastErrorToZero) {
  VLLocale l{};
  l.lastError = 7;
  VLUnicodeToUpper(&l, 'a');
  EXPECT_EQ(l.lastError, 0);
}

}  // namespace
