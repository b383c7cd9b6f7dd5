// Definition store: control file, lookups, loading, corrupt input, first-generation pages.
#include <gtest/gtest.h>

#include <functional>
#include <thread>

#include "codepage/cpbody.h"
#include "store/store.h"
#include "support/defdir.h"
#include "support/hooks.h"

namespace {

VLObjManager *manager() { return vlglobals->objManager; }

class Store : public ::testing::Test {
 protected:
  static void SetUpTestSuite() {
    dir_ = new ts::TempDir;
    ts::DefDir::standard().write(dir_->path);
  }
  static void TearDownTestSuite() { delete dir_; }
  // Every block the library took came back: also proves that nothing loaded twice.
  void TearDown() override { EXPECT_EQ(ts::hooks.live, 0); }
  static ts::TempDir *dir_;
};
ts::TempDir *Store::dir_;

TEST_F(Store, LookupsByNameAndId) {
  ts::Library lib(dir_->path.c_str());
  ASSERT_EQ(lib.rc, 0u);
  uint32_t rc;
  struct Case {
    uint16_t type;
    const char *name;
    int32_t len;
    int expectId;  // -1: not found (37); 0: no object, no error
  } cases[] = {
      {0, "german", 6, 2},    {0, "GERMAN", 7, 2},  // a length that counts the terminator
      {0, "Germa", 5, -1},    {1, "unitedstates", 12, 840}, {2, "latin1", 6, 819},
      {3, "binary", 6, 0},    {3, "BiNaRy", 7, 0},  {0, "BINARY", 6, -1}, {3, "Default", 7, -1},
      {7, "English", 7, -1},
  };
  for (const auto &c : cases) {
    VLObjEntry *e = VLGetObjFromName(manager(), c.type, c.name, c.len, 1, &rc);
    if (c.expectId > 0) {
      ASSERT_NE(e, nullptr) << c.name;
      EXPECT_EQ(e->id, c.expectId);
      EXPECT_EQ(rc, 0u);
    } else {
      EXPECT_EQ(e, nullptr) << c.name;
      EXPECT_EQ(rc, c.expectId ? VL_RC_NOTFOUND : 0u) << c.name;
    }
  }
  EXPECT_EQ(VLGetObjFromID(manager(), 1, 276, 1, &rc)->id, 276);
  EXPECT_EQ(VLGetObjFromID(manager(), 1, 277, 1, &rc), nullptr);
  EXPECT_EQ(rc, VL_RC_NOTFOUND);
  EXPECT_EQ(VLGetObjFromID(manager(), 3, 0, 0, &rc), nullptr);
  EXPECT_EQ(rc, 0u);
  // Loading happens on demand and once.
  VLObjEntry *e = VLGetObjFromID(manager(), 2, 932, 1, &rc);
  EXPECT_EQ(e->section[0], nullptr);
  EXPECT_EQ(VLGetObjFromID(manager(), 2, 932, 0, &rc), e);
  EXPECT_NE(e->section[0], nullptr);
  EXPECT_NE(e->section[1], nullptr);
  EXPECT_EQ(vl::cp::maxLen(e), 2);
}

TEST_F(Store, PartialRecordsAreIgnored) {
  ts::TempDir d;
  ts::DefDir::standard().write(d.path);
  // Append 20 bytes to section 0 of the control file by rewriting its size.
  ts::Bytes c = ts::readFile(d.file("control.nls"));
  uint16_t size = static_cast<uint16_t>(c[10] << 8 | c[11]);
  c.insert(c.end(), 20, 'z');
  size = static_cast<uint16_t>(size + 20);
  c[10] = static_cast<uint8_t>(size >> 8);
  c[11] = static_cast<uint8_t>(size);
  ts::writeBytes(d.file("control.nls"), c);
  ts::Library lib(d.path.c_str());
  EXPECT_EQ(lib.rc, 0u);
  EXPECT_EQ(manager()->typeStart[4], ts::DefDir::standard().objects.size());
}

// Each corruption of one object makes its load fail with its code and the entry fall back
// to the built-in body of its type (or fail outright with the no-fallback option).
TEST_F(Store, BrokenObjectFilesFallBack) {
  struct Case {
    const char *what;
    uint8_t type;
    uint16_t id;
    std::function<void(ts::Bytes &)> damage;
    uint32_t code;
  };
  auto at16 = [](ts::Bytes &b, size_t off, uint16_t v) {
    b[off] = static_cast<uint8_t>(v >> 8);
    b[off + 1] = static_cast<uint8_t>(v);
  };
  const size_t body = 76;  // first section follows the header
  std::vector<Case> cases = {
      {"missing", 0, 2, nullptr, VL_RC_FILE_MISSING},
      {"bad magic", 0, 2, [](ts::Bytes &b) { b[0] ^= 0xFF; }, VL_RC_BADMAGIC},
      {"truncated", 1, 276, [](ts::Bytes &b) { b.resize(b.size() - 10); }, VL_RC_FILE_IO},
      {"no sections", 1, 276, [&](ts::Bytes &b) { at16(b, 8, 0); }, VL_RC_BADMAGIC},
      {"text offset outside", 1, 276, [&](ts::Bytes &b) { at16(b, body + 2 * 15, 0xFFF0); }, VL_RC_BADMAGIC},
      {"odd text offset", 0, 2, [&](ts::Bytes &b) { at16(b, body + 2 * 5, 103); }, VL_RC_BADMAGIC},
      {"lead length 0", 2, 932, [&](ts::Bytes &b) { b[body + vl::cp::kLenTable + 0x81] = 0; }, VL_RC_BADMAGIC},
      {"max length 5", 2, 932, [&](ts::Bytes &b) { b[body + vl::cp::kMaxLen] = 5; }, VL_RC_BADMAGIC},
      {"type records cut", 2, 932, [&](ts::Bytes &b) {
         // The records table must hold what the trie indexes: move its start to the end.
         size_t recs = body + vl::cp::kTypeRecOff;
         uint16_t size0 = static_cast<uint16_t>(b[10] << 8 | b[11]);
         at16(b, recs, static_cast<uint16_t>((size0 - 8) & ~3));
       }, VL_RC_BADMAGIC},
      {"index entry past low table", 2, 819, [&](ts::Bytes &b) {
         size_t e = body + vl::cp::kIndex + 8 * 0x00;
         b[e + 1] = 0xFF;
         b[e + 2] = 0;
         b[e + 3] = 0xFF;
         at16(b, e + 4, 0xFF00);
       }, VL_RC_BADMAGIC},
  };
  for (const auto &c : cases) {
    for (uint32_t options : {0u, VL_OPT_NOBUILTIN}) {
      ts::TempDir d;
      ts::DefDir::standard().write(d.path);
      std::string path = ts::objectPath(d.path, c.type, c.id);
      if (c.damage) {
        ts::Bytes b = ts::readFile(path);
        c.damage(b);
        ts::writeBytes(path, b);
      } else {
        std::remove(path.c_str());
      }
      ts::Library lib(d.path.c_str(), options);
      ASSERT_EQ(lib.rc, 0u) << c.what;
      uint32_t rc = 0;
      VLObjEntry *e = VLGetObjFromID(manager(), c.type, c.id, 0, &rc);
      EXPECT_EQ(rc, c.code) << c.what;
      if (options == VL_OPT_NOBUILTIN) {
        EXPECT_EQ(e, nullptr) << c.what;
        continue;
      }
      ASSERT_NE(e, nullptr) << c.what;
      EXPECT_TRUE(e->flags & 0x01) << c.what;
      const void *builtin[] = {VLDefaultLanguage, VLDefaultTerritory, VLDefaultCodePage};
      EXPECT_EQ(e->section[0], builtin[c.type]) << c.what;
    }
  }
}

TEST_F(Store, BrokenControlFileMeansBuiltins) {
  struct Case {
    const char *what;
    std::function<void(ts::Bytes &)> damage;
  } cases[] = {
      {"magic", [](ts::Bytes &b) { b[1] ^= 1; }},
      {"unsorted", [](ts::Bytes &b) { std::swap_ranges(b.begin() + 76, b.begin() + 76 + 38, b.begin() + 76 + 38); }},
      {"type 9", [](ts::Bytes &b) { b[76 + 2] = 9; }},
      {"truncated", [](ts::Bytes &b) { b.resize(100); }},
  };
  for (const auto &c : cases) {
    ts::TempDir d;
    ts::DefDir::standard().write(d.path);
    ts::Bytes b = ts::readFile(d.file("control.nls"));
    c.damage(b);
    ts::writeBytes(d.file("control.nls"), b);
    ts::Library lib(d.path.c_str());
    EXPECT_EQ(lib.rc, VL_RC_DEFAULTS) << c.what;
    EXPECT_EQ(manager()->typeStart[4], 3) << c.what;
    EXPECT_TRUE(manager()->noBuiltinFallback);
  }
}

TEST_F(Store, FirstGenerationCodePageUpgradesOnLoad) {
  ts::TempDir d;
  ts::DefDir defs;
  defs.add(0, 1, "English", {ts::languageBody(840, 932, 0, u"en", u"English")});
  defs.add(1, 840, "UnitedStates", {ts::territoryBody(u"$", u"US")});
  defs.addCodePage(ts::doubleByteSource(932, "MS932"));
  defs.addCodePage(ts::doubleByteSource(933, "Old932"), true);
  defs.addCodePage(ts::singleByteSource(819, "Latin1"));
  defs.addCodePage(ts::singleByteSource(820, "OldLatin1"), true);
  defs.write(d.path);
  ts::Library lib(d.path.c_str());
  uint32_t rc;
  for (auto [now, old] : {std::pair<uint16_t, uint16_t>{932, 933}, {819, 820}}) {
    VLObjEntry *a = VLGetObjFromID(manager(), 2, now, 0, &rc);
    VLObjEntry *b = VLGetObjFromID(manager(), 2, old, 0, &rc);
    ASSERT_EQ(rc, 0u);
    ASSERT_NE(b, nullptr);
    EXPECT_TRUE(b->flags & 0x02);
    // The upgrade keeps no variable tables of a single-byte page: its one-byte type
    // records are gone, and the upgraded body is the header alone.
    const bool single = now == 819;
    ASSERT_EQ(b->sectionSize[0], single ? vl::cp::kHeader : a->sectionSize[0]);
    EXPECT_EQ(std::memcmp(a->section[0], b->section[0], single ? vl::cp::kFullOff : vl::cp::kValueOff), 0);
    // Every character converts the same through both.
    unsigned char s[2];
    for (int lead = 0x81; lead <= 0x9F && now == 932; ++lead)
      for (int t = 0x30; t < 0x100; ++t) {
        s[0] = static_cast<uint8_t>(lead);
        s[1] = static_cast<uint8_t>(t);
        ASSERT_EQ(VLCpMbToUnicode(a, s), VLCpMbToUnicode(b, s)) << lead << " " << t;
      }
    for (int u = 0; u < 0x10000; u += 7) {
      unsigned char x[4], y[4];
      int n = VLCpUnicodeToChar(a, static_cast<VLUChar>(u), x);
      ASSERT_EQ(n, VLCpUnicodeToChar(b, static_cast<VLUChar>(u), y));
      ASSERT_EQ(std::memcmp(x, y, static_cast<size_t>(n)), 0);
    }
  }
}

TEST_F(Store, ConcurrentFirstUseLoadsOnce) {
  ts::Library lib(dir_->path.c_str());
  std::vector<std::thread> threads;
  std::vector<VLObjEntry *> got(8);
  for (int i = 0; i < 8; ++i)
    threads.emplace_back([&, i] {
      uint32_t rc;
      got[static_cast<size_t>(i)] = VLGetObjFromID(manager(), 2, 930, 0, &rc);
    });
  for (auto &t : threads) t.join();
  for (auto *e : got) EXPECT_EQ(e, got[0]);
  // A second load would have left blocks behind: the library's teardown checks that.
}

}  // namespace
