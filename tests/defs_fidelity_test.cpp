// Every generated code page against the C library's iconv, through the library's
// primitives: each mapping iconv has in either direction, the round trips, the type words
// and the case deltas. Also the names and aliases the definitions directory gives them.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>

#include "codepage/cpbody.h"
#include "codepage/mapfam.h"
#include "frame/frame.h"
#include "iconvcp.h"
#include "support/defdir.h"
#include "ucd.h"

namespace {

using namespace mkdefs;

class DefsGenerated : public ::testing::Test {
 protected:
  static void SetUpTestSuite() {
    if (!std::filesystem::exists(std::string(VL_TEST_DEFS_DIR) + "/control.nls")) return;
    rc_ = VLInit(VL_TEST_DEFS_DIR, nullptr, nullptr, 0, VL_OPT_NOBUILTIN);
    up_ = true;
  }
  static void TearDownTestSuite() {
    if (up_) VLTerm();
    up_ = false;
  }
  void SetUp() override {
    if (!up_) GTEST_SKIP() << "no generated definitions in " << VL_TEST_DEFS_DIR;
    ASSERT_EQ(rc_, 0u);
  }
  static VLObjManager *manager() { return vlglobals->objManager; }
  static const UnicodeProps &ucd() { return ts::unicode(); }
  static inline bool up_ = false;
  static inline uint32_t rc_ = 0;
};

uint32_t packW(const std::string &s) {
  uint32_t w = 0;
  for (unsigned char c : s) w = w << 8 | c;
  return w;
}

std::string hex(const std::string &s) {
  std::string out;
  char b[4];
  for (unsigned char c : s) {
    std::snprintf(b, sizeof b, "%02X", c);
    out += b;
  }
  return out;
}

// Mismatches of one code page, counted, with the first few spelled out.
struct Tally {
  size_t count = 0;
  std::string first;
  void bad(const std::string &what) {
    if (count++ < 5) first += "\n  " + what;
  }
};

TEST_F(DefsGenerated, EveryCodePageMatchesIconv) {
  for (const CodePageDef &def : codeCodePageDefs()) {
    SCOPED_TRACE(def.name);
    Extracted iconvView, built;
    std::string err;
    ASSERT_TRUE(extractCodePage(def, &iconvView, &err)) << err;
    built = iconvView;
    CpSections sections;
    ASSERT_TRUE(buildFitted(&built, ucd(), &sections, &err)) << err;
    // Only EUC-TW holds more than one section can: its sparse upper planes are left out.
    EXPECT_EQ(built.droppedGroups.empty(), def.id != 964);

    // The directory holds exactly this object: generation is repeatable.
    Bytes file;
    ASSERT_TRUE(containerFile(sections.sections, 2, &file, &err));
    std::ifstream in(std::string(VL_TEST_DEFS_DIR) + "/" + objectFileName(2, def.id), std::ios::binary);
    EXPECT_TRUE(Bytes(std::istreambuf_iterator<char>(in), {}) == file);

    uint32_t rc = 0;
    const VLCodePage *cp = VLGetObjFromID(manager(), VL_OBJ_CODEPAGE, def.id, 0, &rc);
    ASSERT_TRUE(cp) << rc;
    const CpSource &s = iconvView.src;
    const bool utf8 = def.id == VL_CP_UTF8;
    const bool typeTrie = vl::cp::off(cp, vl::cp::kTypeTrieOff) != 0;
    auto dropped = [&](const std::string &bytes) {
      for (const std::string &g : built.droppedGroups)
        if (bytes.size() >= 3 && bytes.rfind(g, 0) == 0) return true;
      return false;
    };
    auto decode = [&](const std::string &bytes) -> uint16_t {
      if (bytes.size() == 1) return vl::cp::sbcsUni(cp, static_cast<uint8_t>(bytes[0]));
      const std::string z = bytes + std::string(4, '\0');
      return VLCpMbToUnicode(cp, reinterpret_cast<const unsigned char *>(z.data()));
    };
    auto encode = [&](uint16_t u) {
      unsigned char out[8];
      const int n = VLCpUnicodeToChar(cp, u, out);
      return std::string(reinterpret_cast<char *>(out), static_cast<size_t>(n));
    };
    auto roundTrip = [&](uint16_t u) -> std::optional<std::string> {
      auto f = s.fromUni.find(u);
      if (f == s.fromUni.end() || dropped(f->second)) return std::nullopt;
      auto t = s.toUni.find(f->second);
      return t != s.toUni.end() && t->second == u ? std::optional(f->second) : std::nullopt;
    };

    Tally dec, enc, types, cases;
    size_t iconvTrips = 0, libTrips = 0;
    for (const auto &[bytes, u] : s.toUni) {
      const uint16_t want = dropped(bytes) ? 0xFFFD : u;
      if (decode(bytes) != want) dec.bad(hex(bytes) + " decodes to " + std::to_string(decode(bytes)));
      if (want == 0xFFFD) continue;
      const bool single = bytes.size() == 1;
      if (single && vl::cp::sbcsType(cp, static_cast<uint8_t>(bytes[0])) != ucd().typeWord[u])
        types.bad("single byte " + hex(bytes));
      if (!typeTrie) continue;
      const std::string z = bytes + std::string(4, '\0');
      const VLCtypeRecord *r = single ? VLGetMbCtypeW(cp, packW(bytes))
                                      : VLGetMbCtype(cp, reinterpret_cast<const unsigned char *>(z.data()));
      if (r->type != ucd().typeWord[u]) types.bad(hex(bytes));
      // The case delta leads to the other case where it lives in this code page (in a
      // shift code page, in the same state), and nowhere otherwise.
      const uint32_t word = ucd().typeWord[u];
      const uint32_t mask = (word & 0x002) && ucd().lower[u] != u ? 0x002 : (word & 0x004) && ucd().upper[u] != u ? 0x004 : 0;
      if (!mask) continue;
      const auto other = roundTrip(mask == 0x002 ? ucd().lower[u] : ucd().upper[u]);
      const uint32_t want2 = other && (!s.shift || other->size() == bytes.size()) ? packW(*other) : packW(bytes);
      if (VLCpMbCaseConvW(cp, packW(bytes), mask) != want2) cases.bad(hex(bytes));
    }
    for (const auto &[u, bytes] : s.fromUni) {
      if (encode(u) != bytes) enc.bad("U+" + std::to_string(u) + " encodes to " + hex(encode(u)));
      if (roundTrip(u)) {
        ++iconvTrips;
        libTrips += decode(encode(u)) == u;
      }
    }
    // The single-byte case tables: the other case of each byte where that is one byte too.
    Tally folds;
    for (unsigned b = 0; b < 256; ++b) {
      const uint16_t u = vl::cp::sbcsUni(cp, static_cast<uint8_t>(b));
      for (const auto &[at, map] : {std::pair{vl::cp::kSbcsUpper, &UnicodeProps::upper},
                                    std::pair{vl::cp::kSbcsLower, &UnicodeProps::lower}}) {
        unsigned want = b;
        if (u != 0xFFFD && vl::cp::charLen(cp, static_cast<uint8_t>(b)) == 1) {
          const uint16_t other = (ucd().*map)[u];
          const std::string o = encode(other);
          if (o.size() == 1 && decode(o) == other) want = static_cast<uint8_t>(o[0]);
        }
        if (vl::cp::body(cp)[at + b] != want) folds.bad("byte " + std::to_string(b) + " at " + std::to_string(at));
      }
      // Comparison folds W values below 256 through the table in place of the mapping.
      if (vl::cp::body(cp)[vl::cp::kSbcsUpper + b] != vl::map::CpPage{cp}.upper(b)) folds.bad("mapped " + std::to_string(b));
    }
    EXPECT_EQ(folds.count, 0u) << folds.first;
    EXPECT_EQ(dec.count, 0u) << dec.first;
    EXPECT_EQ(enc.count, 0u) << enc.first;
    EXPECT_EQ(types.count, 0u) << types.first;
    EXPECT_EQ(cases.count, 0u) << cases.first;
    EXPECT_EQ(libTrips, iconvTrips);
    EXPECT_GT(iconvTrips, utf8 ? 60000u : 90u);
  }
}

TEST_F(DefsGenerated, FamilyConventions) {
  struct Row {
    uint16_t id;
    uint8_t subst, lf, maxLen;
    uint16_t flags;
    uint32_t fullA;  // full-width form of the byte for "A", 0 when none
  };
  const Row rows[] = {
      {367, 0x1A, 0x0A, 1, 0x0001, 0},      {819, 0x1A, 0x0A, 1, 0x0001, 0},
      {37, 0x3F, 0x25, 1, 0x0000, 0},       {1047, 0x3F, 0x25, 1, 0x0000, 0},
      {932, 0x1A, 0x0A, 2, 0x0001, 0x8260}, {954, 0x1A, 0x0A, 3, 0x0001, 0xA3C1},
      {964, 0x1A, 0x0A, 4, 0x0001, 0xA4C1}, {930, 0x3F, 0x25, 2, 0x0002, 0x42C1},
      {57352, 0x1A, 0x0A, 3, 0x0001, 0xEFBCA1},
  };
  for (const Row &r : rows) {
    uint32_t rc = 0;
    const VLCodePage *cp = VLGetObjFromID(manager(), VL_OBJ_CODEPAGE, r.id, 0, &rc);
    ASSERT_TRUE(cp) << r.id;
    EXPECT_EQ(vl::cp::subst(cp), r.subst) << r.id;
    EXPECT_EQ(vl::cp::body(cp)[vl::cp::kLf], r.lf) << r.id;
    EXPECT_EQ(vl::cp::maxLen(cp), r.maxLen) << r.id;
    EXPECT_EQ(vl::cp::flags(cp) & ~vl::cp::kFlagOneByteTypes, r.flags) << r.id;
    // UTF-8 has no type trie (it is classified and mapped as Unicode).
    EXPECT_EQ((vl::cp::flags(cp) & vl::cp::kFlagOneByteTypes) != 0, r.id != VL_CP_UTF8) << r.id;
    if (r.flags & 0x0002) {
      EXPECT_EQ(vl::cp::shiftOut(cp) * 256 + vl::cp::shiftIn(cp), 0x0E0F) << r.id;
    }
    const uint8_t a = r.flags & 0x0001 ? 0x41 : 0xC1;
    if (r.fullA) {
      EXPECT_EQ(VLCpMbHalfToFullW(cp, a), r.fullA) << r.id;
    }
  }
}

TEST_F(DefsGenerated, NamesAndAliases) {
  for (const CodePageDef &def : codeCodePageDefs()) {
    uint32_t rc = 0;
    const VLObjEntry *e = VLGetObjFromName(manager(), VL_OBJ_CODEPAGE, def.name.c_str(),
                                           static_cast<int32_t>(def.name.size()), 1, &rc);
    ASSERT_TRUE(e) << def.name;
    EXPECT_EQ(e->id, def.id);
    for (const std::string &alias : def.aliases) {
      std::string lower = alias;
      for (char &c : lower) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
      const char *name = VLGetCodepageFromAlias(manager(), lower.c_str());
      EXPECT_STREQ(name, def.name.c_str()) << alias;
    }
  }
}

}  // namespace
