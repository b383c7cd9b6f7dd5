// The vector run loops against the scalar one: same output, same run lengths, nothing
// written past the run, for runs of every length around the vector widths at every
// alignment; and whole conversions giving the same bytes at every level.
#include <gtest/gtest.h>

#include <filesystem>
#include <random>
#include <string>
#include <vector>

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

}  // namespace
