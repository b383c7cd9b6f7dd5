// Definition store: control file, lookups, loading, corrupt input, first-generation pages.
#include <gtest/gtest.h>

#include <atomic>
#include <filesystem>
#include <functional>
#include <thread>

#include "codepage/cpbody.h"
#include "iconvcp.h"
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
  static inline ts::TempDir *dir_ = nullptr;
};

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
  // Rewrites the index entry of Unicode row 0: kind, mask, bounds and low-table offset.
  auto row0 = [&](ts::Bytes &b, uint8_t kind, uint8_t mask, uint8_t lo, uint8_t hi, uint16_t low) {
    const uint8_t head[] = {kind, mask, lo, hi};
    std::copy(head, head + 4, b.begin() + body + vl::cp::kIndex);
    at16(b, body + vl::cp::kIndex + 4, low);
  };
  std::vector<Case> cases = {
      {"missing", 0, 2, nullptr, VL_RC_FILE_IO},
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
      {"index entry past low table", 2, 819,
       [&](ts::Bytes &b) { row0(b, b[body + vl::cp::kIndex], 0xFF, 0, 0xFF, 0xFF00); }, VL_RC_BADMAGIC},
      // Writers size their output from the maximum length: no table may yield more.
      {"index kind yields two bytes in a single-byte page", 2, 819,
       [&](ts::Bytes &b) { row0(b, 1, 0x3F, 0x40, 0x7F, 0); }, VL_RC_BADMAGIC},
      {"a single-byte body under the UTF-8 id", 2, VL_CP_UTF8, nullptr, VL_RC_BADMAGIC},
  };
  for (const auto &c : cases) {
    for (uint32_t options : {0u, VL_OPT_NOBUILTIN}) {
      ts::TempDir d;
      ts::DefDir defs = ts::DefDir::standard();
      // The UTF-8 row files the Latin1 body under the UTF-8 id.
      if (c.id == VL_CP_UTF8)
        for (const ts::Object &o : ts::DefDir::standard().objects)
          if (o.type == VL_OBJ_CODEPAGE && o.id == 819) defs.add(2, VL_CP_UTF8, "UTF-8", o.sections);
      defs.write(d.path);
      std::string path = ts::objectPath(d.path, c.type, c.id);
      if (c.damage) {
        ts::Bytes b = ts::readFile(path);
        c.damage(b);
        ts::writeBytes(path, b);
      } else if (c.id != VL_CP_UTF8) {
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
      if (c.type != VL_OBJ_CODEPAGE) continue;
      // A locale over it converts the territory's texts (three UTF-8 bytes for the euro).
      std::string name = std::string("German_Germany.") + e->name;
      VLReleaseLocale(VLGetLocale(name.c_str(), 0, &rc));
    }
  }
}

// A damaged control file leaves the three built-in objects alone (and no fallback to them
// for the objects it would have named); a partial record at its end is only ignored.
TEST_F(Store, DamagedControlFiles) {
  const size_t all = ts::DefDir::standard().objects.size();
  struct Case {
    const char *what;
    std::function<void(ts::Bytes &)> damage;
    uint32_t rc;
    size_t objects;
  } cases[] = {
      {"partial record", [](ts::Bytes &b) {
         b.insert(b.end(), 20, 'z');  // section 0 grows by 20 bytes: its size is rewritten
         const uint16_t size = static_cast<uint16_t>((b[10] << 8 | b[11]) + 20);
         b[10] = static_cast<uint8_t>(size >> 8);
         b[11] = static_cast<uint8_t>(size);
       }, 0, all},
      {"magic", [](ts::Bytes &b) { b[1] ^= 1; }, VL_RC_DEFAULTS, 3},
      {"unsorted", [](ts::Bytes &b) { std::swap_ranges(b.begin() + 76, b.begin() + 76 + 38, b.begin() + 76 + 38); },
       VL_RC_DEFAULTS, 3},
      {"type 9", [](ts::Bytes &b) { b[76 + 2] = 9; }, VL_RC_DEFAULTS, 3},
      {"truncated", [](ts::Bytes &b) { b.resize(100); }, VL_RC_DEFAULTS, 3},
  };
  for (const auto &c : cases) {
    ts::TempDir d;
    ts::DefDir::standard().write(d.path);
    ts::Bytes b = ts::readFile(d.file("control.nls"));
    c.damage(b);
    ts::writeBytes(d.file("control.nls"), b);
    ts::Library lib(d.path.c_str());
    EXPECT_EQ(lib.rc, c.rc) << c.what;
    EXPECT_EQ(manager()->typeStart[4], c.objects) << c.what;
    EXPECT_EQ(manager()->noBuiltinFallback, c.rc != 0) << c.what;
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

bool haveDefs() { return std::filesystem::exists(std::string(VL_TEST_DEFS_DIR) + "/control.nls"); }

// A real double-byte page written in the first generation: its widened trie outgrows a
// file section, which an upgraded section may do.
TEST_F(Store, FirstGenerationPageMayOutgrowAFileSection) {
  const mkdefs::CodePageDef *def = nullptr;
  for (const auto &d : mkdefs::codeCodePageDefs())
    if (d.id == 949) def = &d;
  ASSERT_NE(def, nullptr);
  mkdefs::Extracted x;
  mkdefs::CpSections v2, v1;
  std::string err;
  ASSERT_TRUE(mkdefs::extractCodePage(*def, &x, &err)) << err;
  ASSERT_TRUE(mkdefs::buildFitted(&x, ts::unicode(), &v2, &err)) << err;
  ASSERT_TRUE(mkdefs::toGeneration1(v2, &v1, &err)) << err;
  ts::TempDir d;
  ts::DefDir defs = ts::DefDir::standard();
  defs.add(2, 949, "MS949", v2.sections);
  defs.add(2, 950, "OldMS949", v1.sections, 1);
  defs.write(d.path);
  ts::Library lib(d.path.c_str(), VL_OPT_NOBUILTIN);
  uint32_t rc = 0;
  VLObjEntry *now = VLGetObjFromID(manager(), 2, 949, 0, &rc);
  VLObjEntry *old = VLGetObjFromID(manager(), 2, 950, 0, &rc);
  ASSERT_EQ(rc, 0u);
  ASSERT_NE(old, nullptr);
  EXPECT_GT(old->sectionSize[1], 0xFFFFu);
  for (int u = 0; u < 0x10000; ++u) {
    unsigned char a[4], b[4];
    int n = VLCpUnicodeToChar(now, static_cast<VLUChar>(u), a);
    ASSERT_EQ(n, VLCpUnicodeToChar(old, static_cast<VLUChar>(u), b)) << u;
    ASSERT_EQ(std::memcmp(a, b, static_cast<size_t>(n)), 0) << u;
    if (n == 2) {
      ASSERT_EQ(VLCpMbToUnicode(now, a), VLCpMbToUnicode(old, a)) << u;
    }
  }
}

// ---- Many threads making the first use of objects at the same moment ----------------------

// What one thread sees of a locale: the code, every item and a round trip through its page.
std::string answer(const char *name) {
  uint32_t rc = 0;
  VLLocale *l = VLGetLocale(name, 0, &rc);
  std::string a = std::to_string(rc) + "|";
  if (!l) return a;
  char buf[300];
  for (int item = 1; item <= VL_ITEM_LAST; ++item) {
    int32_t n = VLGetLocaleTextInfo(l, item, buf, sizeof buf, 0);
    a += std::to_string(n) + ":" + (n > 0 ? std::string(buf, static_cast<size_t>(n)) : "") + "|";
    a += std::to_string(VLGetLocaleNumInfo(l, item, 0)) + "|";
  }
  const VLUChar text[] = {'a', 0x4E9C, 0x00E9, 0x20AC, 0x3042, 0xAC00, 0x0416, 0x4E00, '1', 0};
  char out[64];
  int32_t n = VLUnicodeToString(l, out, sizeof out, text, -1, VL_OPT_NULLTERM);
  VLUChar back[32] = {};
  int32_t m = VLStringToUnicode(back, 32, l, out, -1, VL_OPT_NULLTERM);
  a += std::string(out, static_cast<size_t>(n > 0 ? n : 0)) + "|";
  a += std::string(reinterpret_cast<const char *>(back), static_cast<size_t>(m > 0 ? m : 0) * 2);
  VLReleaseLocale(l);
  return a;
}

// Each row makes one kind of object new: the warm-up loads the other two kinds first.
struct FirstUse {
  const char *kind;
  const char *warm;
  std::vector<std::string> names;
};

std::vector<FirstUse> firstUses() {
  std::vector<FirstUse> rows = {{"code page", "English_UnitedStates.US-ASCII", {}},
                                {"territory", "English_UnitedStates.UTF-8", {}},
                                {"language", "English_UnitedStates.UTF-8", {}}};
  for (const char *cp : {"MS936", "MS949", "MS950", "JapanEUC", "EUC-TW", "IBM930", "IBM937", "IBM939", "UTF-8",
                         "MS1252", "IBM037", "MS932"})
    rows[0].names.push_back(std::string("English_UnitedStates.") + cp);
  for (const char *t : {"Japan", "Taiwan", "Korea", "Germany", "Russia", "China", "France", "Thailand"})
    rows[1].names.push_back(std::string("English_") + t + ".UTF-8");
  for (const char *l : {"Japanese", "TraditionalChinese", "Korean", "Russian", "Arabic", "German", "Thai"})
    rows[2].names.push_back(std::string(l) + "_UnitedStates.UTF-8");
  return rows;
}

TEST(StoreThreads, FirstUseOfEachObjectKindAgreesWithOneThread) {
  if (!haveDefs()) GTEST_SKIP() << "no generated definitions";
  constexpr int kThreads = 16;
  for (const FirstUse &row : firstUses()) {
    SCOPED_TRACE(row.kind);
    std::vector<std::string> want;
    {
      ts::Library lib(VL_TEST_DEFS_DIR);
      ASSERT_EQ(lib.rc, 0u);
      answer(row.warm);
      for (const std::string &n : row.names) want.push_back(answer(n.c_str()));
    }
    // The window is narrow: a few fresh libraries per row.
    for (int round = 0; round < 4; ++round) {
      ts::Library lib(VL_TEST_DEFS_DIR);
      answer(row.warm);
      std::atomic<int> waiting{kThreads}, wrong{0};
      std::string firstWrong;
      std::atomic_flag noted = ATOMIC_FLAG_INIT;
      std::vector<std::thread> threads;
      for (int t = 0; t < kThreads; ++t)
        threads.emplace_back([&] {
          waiting.fetch_sub(1);
          while (waiting.load()) {
          }
          // Every thread takes the names in the same order, so each object is new to all at once.
          for (size_t i = 0; i < row.names.size(); ++i)
            if (answer(row.names[i].c_str()) != want[i]) {
              ++wrong;
              if (!noted.test_and_set()) firstWrong = row.names[i];
            }
        });
      for (auto &th : threads) th.join();
      EXPECT_EQ(wrong.load(), 0) << "first wrong answer for " << firstWrong;
    }
  }
}

}  // namespace
