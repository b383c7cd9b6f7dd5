// The vector run loops against the scalar one: same output, same run lengths, nothing
// written past the run, for runs of every length around the vector widths at every
// alignment; and whole conversions giving the same bytes at every level.
#include <gtest/gtest.h>

#include <cstring>
#include <filesystem>
#include <map>
#include <random>
#include <tuple>
#include <string>
#include <vector>

#include "codepage/cpbody.h"
#include "codepage/simd.h"
#include "support/hooks.h"

namespace {

namespace simd = vl::simd;

struct LevelGuard {
  ~LevelGuard() { simd::capLevel(-1); }
};

std::vector<int> levels() {
  simd::capLevel(-1);
  std::vector<int> v;
  for (int l = simd::kScalar; l <= simd::level(); ++l) v.push_back(l);
  return v;
}

// A buffer of `off` filler bytes, a run of `len` plain bytes, then a value that ends the
// run (unless the run is the whole tail), then more text.
struct Case {
  std::vector<uint8_t> bytes;
  size_t off, len;
};

Case make(std::mt19937 &rng, size_t off, size_t len, unsigned lim, bool atEnd) {
  Case c{{}, off, len};
  for (size_t i = 0; i < off; ++i) c.bytes.push_back(static_cast<uint8_t>(rng()));
  for (size_t i = 0; i < len; ++i) c.bytes.push_back(static_cast<uint8_t>(rng() % lim));
  if (!atEnd) {
    c.bytes.push_back(static_cast<uint8_t>(0x80 + rng() % 0x80));
    for (int i = 0; i < 40; ++i) c.bytes.push_back(static_cast<uint8_t>(rng()));
  }
  return c;
}

TEST(Simd, EveryLevelCopiesTheSameRuns) {
  LevelGuard guard;
  std::mt19937 rng(11);
  for (bool atEnd : {false, true})
    for (size_t len = 0; len <= 70; ++len)
      for (size_t off = 0; off < 32; ++off) {
        Case c = make(rng, off, len, 0x80, atEnd);
        const uint8_t *s = c.bytes.data() + off;
        size_t n = c.bytes.size() - off;
        std::vector<VLUChar> units(s, s + n);
        // Units past 0xFF end a run of either kind.
        if (!atEnd) units[len] = static_cast<VLUChar>(0x100 + rng() % 0xFF00);
        struct Out {
          size_t wide, narrow, copy, wideAll, wideRun, narrowRun;
          std::vector<VLUChar> w, wAll;
          std::vector<uint8_t> nb, cb;
        };
        std::vector<Out> outs;
        for (int l : levels()) {
          simd::capLevel(l);
          Out o{0, 0, 0, 0, 0, 0, std::vector<VLUChar>(n + 1, 0xAAAA), std::vector<VLUChar>(n + 1, 0xAAAA),
                std::vector<uint8_t>(n + 1, 0xAA), std::vector<uint8_t>(n + 1, 0xAA)};
          // The in-line first block: same runs and bytes as the calls.
          std::vector<VLUChar> wr(n + 1, 0xAAAA);
          std::vector<uint8_t> nr(n + 1, 0xAA);
          o.wideRun = simd::widenRun(s, wr.data(), n, 0x80);
          o.narrowRun = simd::narrowRun(units.data(), nr.data(), n, 0x80);
          o.wide = simd::widen(s, o.w.data(), n, 0x80);
          o.wideAll = simd::widen(s, o.wAll.data(), n, 0x100);
          o.narrow = simd::narrow(units.data(), o.nb.data(), n, 0x80);
          o.copy = simd::copy(s, o.cb.data(), n, 0x80);
          EXPECT_EQ(wr, o.w);
          EXPECT_EQ(nr, o.nb);
          outs.push_back(std::move(o));
        }
        const Out &ref = outs[0];
        ASSERT_EQ(ref.wide, len) << "scalar widening stops at the first high byte";
        ASSERT_EQ(ref.wideAll, n);
        for (size_t k = 1; k < outs.size(); ++k) {
          const Out &o = outs[k];
          std::string at = "level " + std::to_string(k) + " run " + std::to_string(len) + " offset " +
                           std::to_string(off) + (atEnd ? " at the end" : "");
          EXPECT_EQ(o.wide, ref.wide) << at;
          EXPECT_EQ(o.wideAll, ref.wideAll) << at;
          EXPECT_EQ(o.narrow, ref.narrow) << at;
          EXPECT_EQ(o.copy, ref.copy) << at;
          EXPECT_EQ(o.wideRun, ref.wide) << at;
          EXPECT_EQ(o.narrowRun, ref.narrow) << at;
          // Whole buffers: nothing may be written past the run.
          EXPECT_EQ(o.w, ref.w) << at;
          EXPECT_EQ(o.wAll, ref.wAll) << at;
          EXPECT_EQ(o.nb, ref.nb) << at;
          EXPECT_EQ(o.cb, ref.cb) << at;
        }
      }
}

// Table mapping, with units that fit a byte (one table half) and units that do not.
TEST(Simd, EveryLevelMapsBytesThroughTheTable) {
  LevelGuard guard;
  std::mt19937 rng(3);
  for (unsigned top : {0x100u, 0x10000u}) {
    std::vector<uint16_t> table(256);
    for (auto &u : table) u = static_cast<uint16_t>(rng() % top);
    std::vector<uint8_t> bytes(160);
    for (auto &b : bytes) b = static_cast<uint8_t>(rng());
    for (int l : levels()) {
      simd::capLevel(l);
      for (size_t off = 0; off < 32; ++off)
        for (size_t n = 0; n <= 96; ++n) {
          std::vector<VLUChar> d(n + 1, 0xAAAA);
          size_t k = simd::mapBytes(bytes.data() + off, d.data(), n, reinterpret_cast<const uint8_t *>(table.data()));
          ASSERT_TRUE(k <= n && (l == simd::kAvx2 ? k == n - n % 32 : k == 0)) << "level " << l << " n " << n;
          for (size_t j = 0; j <= n; ++j)
            ASSERT_EQ(d[j], j < k ? table[bytes[off + j]] : 0xAAAA) << "level " << l << " n " << n << " at " << j;
        }
    }
  }
}

// Whole conversions over text with runs broken at every distance, at every level.
class SimdConvert : public ::testing::Test {
 protected:
  void SetUp() override {
    if (!std::filesystem::exists(std::string(VL_TEST_DEFS_DIR) + "/control.nls"))
      GTEST_SKIP() << "no generated definitions";
    ASSERT_EQ(VLInit(VL_TEST_DEFS_DIR, ts::countingAlloc, ts::countingFree, 0, VL_OPT_NOBUILTIN), 0u);
  }
  void TearDown() override {
    simd::capLevel(-1);
    if (std::filesystem::exists(std::string(VL_TEST_DEFS_DIR) + "/control.nls")) VLTerm();
  }
};

TEST_F(SimdConvert, EveryLevelGivesTheSameBytes) {
  std::mt19937 rng(5);
  // Text: ASCII runs of 1..70 with one other character between them.
  const char32_t others[] = {0xE9, 0xFC, 0x20AC, 0x3042, 0x65E5, 0xDF, 0x4E02};
  std::u16string text;
  for (int k = 0; k < 400; ++k) {
    size_t run = 1 + rng() % 70;
    for (size_t i = 0; i < run; ++i) text.push_back(static_cast<char16_t>(0x20 + rng() % 0x5F));
    text.push_back(static_cast<char16_t>(others[rng() % std::size(others)]));
  }
  for (const char *name : {"English_UnitedStates.UTF-8", "English_UnitedStates.MS1252", "English_UnitedStates.MS932",
                           "English_UnitedStates.JapanEUC"}) {
    uint32_t rc;
    VLLocale *l = VLGetLocale(name, 0, &rc);
    ASSERT_NE(l, nullptr) << name;
    std::vector<std::vector<char>> bytes;
    std::vector<std::u16string> back;
    for (int lv : levels()) {
      simd::capLevel(lv);
      for (size_t off = 0; off < 32; off += 7) {
        auto *u = reinterpret_cast<const VLUChar *>(text.data() + off);
        int32_t n = static_cast<int32_t>(text.size() - off);
        std::vector<char> b(4 * text.size() + 8);
        int32_t m = VLUnicodeToString(l, b.data(), static_cast<int32_t>(b.size()), u, n, 0);
        ASSERT_GT(m, 0) << name;
        b.resize(static_cast<size_t>(m));
        std::u16string r(text.size() + 8, u'\0');
        int32_t k = VLStringToUnicode(reinterpret_cast<VLUChar *>(r.data()), static_cast<int32_t>(r.size()), l,
                                      b.data(), m, 0);
        ASSERT_GE(k, 0) << name;
        r.resize(static_cast<size_t>(k));
        bytes.push_back(std::move(b));
        back.push_back(std::move(r));
      }
    }
    size_t per = bytes.size() / levels().size();
    for (size_t i = per; i < bytes.size(); ++i) {
      EXPECT_EQ(bytes[i], bytes[i % per]) << name << " level " << i / per;
      EXPECT_EQ(back[i], back[i % per]) << name << " level " << i / per;
    }
    VLReleaseLocale(l);
  }
}

// Random units and bytes soured with stray bytes, through pages of every block kind, with
// the output cut at every size around the block widths and the input at every alignment:
// each level returns the same count and leaves the same whole buffer.
TEST_F(SimdConvert, EveryLevelAgreesOnMixedTextAndCutOutput) {
  std::mt19937 rng(9);
  const std::pair<char16_t, char16_t> ranges[] = {{0x20, 0x7E}, {0x20, 0x7E}, {0x20, 0x7E}, {0x80, 0xFF},
                                                  {0x100, 0x7FF}, {0x800, 0xFFFF}, {0x3041, 0x30FF},
                                                  {0x4E00, 0x9FA5}, {0xFF61, 0xFF9F}};
  std::u16string units;
  while (units.size() < 3000) {
    auto [lo, hi] = ranges[rng() % std::size(ranges)];
    for (size_t k = 1 + rng() % 20; k--;) units.push_back(static_cast<char16_t>(lo + rng() % (hi - lo + 1)));
  }
  units += u"\u4E00z";  // ends on one byte after two
  // Double-byte pages: Japanese with three-byte characters (954), four-byte ones (964),
  // trail bytes in the ASCII range (932, 950) and none (936, 949).
  for (uint16_t id : {57352, 1252, 850, 37, 932, 954, 964, 936, 949, 950}) {
    uint32_t rc;
    VLObjEntry *e = VLGetObjFromID(vlglobals->objManager, VL_OBJ_CODEPAGE, id, 0, &rc);
    ASSERT_NE(e, nullptr) << id;
    VLLocale l{};
    l.codePage = e;
    l.flags = vl::cp::maxLen(e) == 1 ? VL_LF_SINGLEBYTE : 0;
    std::vector<char> bytes(units.size() * 3);
    auto *text = reinterpret_cast<const VLUChar *>(units.data());
    int32_t nb = VLUnicodeToString(&l, bytes.data(), static_cast<int32_t>(bytes.size()), text,
                                   static_cast<int32_t>(units.size()), 0);
    ASSERT_GT(nb, 0);
    bytes.resize(static_cast<size_t>(nb));
    // Stray bytes: lone leads, leads before ASCII, three- and four-byte leads out of place.
    for (size_t k = 0; k < bytes.size() / 50; ++k)
      bytes[rng() % bytes.size()] = static_cast<char>(k % 4 ? 0x80 + rng() % 0x80 : 0x8E + k / 4 % 2);
    // (level, offset, size) -> count and buffer, compared with the scalar level's.
    std::map<std::tuple<int, size_t, int32_t>, std::pair<int32_t, std::vector<char>>> seen;
    for (int lv : levels()) {
      simd::capLevel(lv);
      for (size_t off = 0; off < 32; ++off)
        for (int32_t size : {0, 7, 16, 31, 32, 33, 47, 48, 64, 65, 100, 127, 128, 129, 4000, 9000}) {
          std::vector<char> b(static_cast<size_t>(size) + 1, 'x');
          std::vector<VLUChar> u(static_cast<size_t>(size) + 1, 0x5555);
          int32_t m = VLUnicodeToString(&l, b.data(), size, text + off, static_cast<int32_t>(units.size() - off), 0);
          int32_t k = VLStringToUnicode(u.data(), size, &l, bytes.data() + off,
                                        static_cast<int32_t>(bytes.size() - off), 0);
          if (size == 9000 && m < size) {  // the primitive trusts the caller's size: give it no more than it needs
            std::vector<unsigned char> exact(static_cast<size_t>(m) + 1);
            EXPECT_EQ(VLCpUnicodeToStr(e, text + off, static_cast<int32_t>(units.size() - off), 0, exact.data()), m);
            EXPECT_EQ(0, std::memcmp(exact.data(), b.data(), static_cast<size_t>(m))) << id;
          }
          // Nothing changes past the output, whatever a writer stores at once.
          for (int32_t j = m; j < size && j < m + 4; ++j) ASSERT_EQ(b[static_cast<size_t>(j)], 'x') << id << " " << size;
          for (int32_t j = k; j < size && j < k + 4; ++j) ASSERT_EQ(u[static_cast<size_t>(j)], 0x5555) << id << " " << size;
          b.insert(b.end(), reinterpret_cast<char *>(u.data()), reinterpret_cast<char *>(u.data() + u.size()));
          auto at = seen.find({simd::kScalar, off, size});
          if (at == seen.end()) {
            seen[{lv, off, size}] = {m * 100000 + k, b};
            continue;
          }
          std::string where = "page " + std::to_string(id) + " level " + std::to_string(lv) + " offset " +
                              std::to_string(off) + " size " + std::to_string(size);
          EXPECT_EQ(m * 100000 + k, at->second.first) << where;
          EXPECT_TRUE(b == at->second.second) << where;
        }
    }
  }
}

}  // namespace
