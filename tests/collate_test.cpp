// Collation over a hand-made sort object: levels, backward secondaries, the fourth level,
// combinations, expansions, ignorable and arithmetic blocks; keys against comparisons.
#include <gtest/gtest.h>

#include <cstring>
#include <functional>
#include <random>
#include <string>
#include <vector>

#include "support/defdir.h"
#include "support/hooks.h"
#include "support/sortmem.h"
#include "veltrin.h"

namespace {

using U16 = std::u16string;

mkdefs::SortBody withBackward() {
  mkdefs::SortBody b = sortmem::sampleBody();
  b.weights[0xE4] = {0x120, 6, 1, 0xB << 10};  // a with another backward secondary
  b.weights[' '] = {0x110, 1, 1, 0xF << 10};    // blanks weigh, so dropping them shows
  b.blocks[0x30] = {0x02, 0xF, 0x3000};
  return b;
}

class Collate : public ::testing::Test {
 protected:
  void SetUp() override {
    ts::DefDir d = ts::DefDir::standard();
    mkdefs::Bytes body;
    std::string err;
    ASSERT_TRUE(withBackward().bytes(&body, &err)) << err;
    d.add(3, 1, "Sample", {body});
    d.write(dir_.path);
    lib_ = std::make_unique<ts::Library>(dir_.path.c_str());
    uint32_t rc;
    l_ = VLGetLocale("English_UnitedStates.Latin1@Sample", 0, &rc);
    ASSERT_NE(l_, nullptr) << rc;
  }
  void TearDown() override {
    VLReleaseLocale(l_);
    lib_.reset();
  }
  std::string keyU(const U16 &s, int32_t len = -2) {
    if (len == -2) len = static_cast<int32_t>(s.size());
    char k[256];
    int32_t n = VLStrxfrmU(l_, k, sizeof k, reinterpret_cast<const VLUChar *>(s.data()), len, 0);
    EXPECT_GT(n, 0);
    return std::string(k, static_cast<size_t>(n));
  }
  int collU(const U16 &a, const U16 &b) {
    return VLStrcollU(l_, reinterpret_cast<const VLUChar *>(a.data()), static_cast<int32_t>(a.size()),
                      reinterpret_cast<const VLUChar *>(b.data()), static_cast<int32_t>(b.size()), 0);
  }
  ts::TempDir dir_;
  std::unique_ptr<ts::Library> lib_;
  VLLocale *l_ = nullptr;
};

int sign(int v) { return (v > 0) - (v < 0); }

TEST_F(Collate, OrderOfTheSampleRules) {
  struct Case {
    const char *why;
    U16 a, b;
    int order;
  } cases[] = {
      {"letters by primary", u"ab", u"b", -1},
      {"case only on the third level", u"ab", u"Ab", -1},
      {"case loses to a letter difference", u"Ab", u"ac", -1},
      {"ch combines between h and i", u"ch", u"h", 1},
      {"ch before i", u"chz", u"i", -1},
      {"c then z stays two elements", u"cz", u"ch", -1},
      {"expansion of \u00e6 as a then e, third level apart", u"ae", u"\u00e6", -1},
      {"expansion of \u00e6 before af", u"\u00e6", u"af", -1},
      {"backward secondaries compare from the end", u"\u00e4\u00e5", u"\u00e5\u00e4", -1},
      {"fourth-level-only hyphen orders last", u"ab", u"a-b", -1},
      {"hyphen position counts on the fourth level", u"a-b", u"ab-", -1},
      {"ignorable block weighs nothing", u"a\u0301b", u"ab", 0},
      {"missing expansion entry weighs nothing", u"a\u00e7", u"a", 0},
      {"only ignorables equal the empty string", u"\u0300\u0301", u"", 0},
      {"arithmetic primaries follow the code", u"\u4e00", u"\u4e01", -1},
      {"arithmetic fourth level follows the code", u"a\u2000", u"a\u2001", -1},
      {"digits before letters", u"9", u"a", -1},
  };
  for (const Case &c : cases) {
    EXPECT_EQ(sign(collU(c.a, c.b)), c.order) << c.why;
    EXPECT_EQ(sign(collU(c.b, c.a)), -c.order) << c.why << " (swapped)";
    const std::string ka = keyU(c.a), kb = keyU(c.b);
    EXPECT_EQ(sign(ka.compare(kb)), c.order) << c.why << " (keys)";
  }
}

// The plain, Ex (a page without shifts passes through), W and UTF-16 forms order the same
// Latin-1 words alike, and their keys are the same bytes.
TEST_F(Collate, FormsAgree) {
  const std::vector<std::string> words = {"ab", "Ab", "ach", "ah", "ai", "a-b", "\xe6", "ae", "\xe5\xe4", "\xe4\xe5", "9", ""};
  auto wide = [](const std::string &s) {
    std::vector<VLWChar> w;
    for (unsigned char c : s) w.push_back(c);
    w.push_back(0);
    return w;
  };
  auto utf16 = [](const std::string &s) {
    std::vector<VLUChar> u;
    for (unsigned char c : s) u.push_back(c);
    u.push_back(0);
    return u;
  };
  for (const std::string &a : words) {
    for (const std::string &b : words) {
      const auto la = static_cast<int32_t>(a.size()), lb = static_cast<int32_t>(b.size());
      const int plain = sign(VLStrcoll(l_, a.data(), la, b.data(), lb, 0));
      EXPECT_EQ(sign(VLStrcollEx(l_, a.data(), 0, la, b.data(), 0, lb, 0)), plain) << a << " " << b;
      EXPECT_EQ(sign(VLWcscoll(l_, wide(a).data(), la, wide(b).data(), lb, 0)), plain) << a << " " << b;
      EXPECT_EQ(sign(VLStrcollU(l_, utf16(a).data(), la, utf16(b).data(), lb, 0)), plain) << a << " " << b;
    }
    char k1[128], k2[128], k3[128], k4[128];
    const auto la = static_cast<int32_t>(a.size());
    const int32_t n = VLStrxfrm(l_, k1, sizeof k1, a.data(), la, 0);
    ASSERT_EQ(VLStrxfrmEx(l_, k2, sizeof k2, a.data(), 0, la, 0), n);
    ASSERT_EQ(VLWcsxfrm(l_, k3, sizeof k3, wide(a).data(), la, 0), n);
    ASSERT_EQ(VLStrxfrmU(l_, k4, sizeof k4, utf16(a).data(), la, 0), n);
    EXPECT_EQ(std::memcmp(k1, k2, static_cast<size_t>(n)) | std::memcmp(k1, k3, static_cast<size_t>(n)) |
                  std::memcmp(k1, k4, static_cast<size_t>(n)),
              0)
        << a;
  }
}

// Random pairs sharing a beginning, over combinations, expansions, ignorables, fourth-level
// and backward-secondary characters: every form orders them as their keys do.
TEST_F(Collate, ComparisonAgreesWithKeysOnRandomPairs) {
  const char16_t alphabet[] = u"abchzA-\u00e6\u00e4\u00e5\u00e7\u0301 9\u2000\u4e00";
  std::mt19937 rng(7);
  auto word = [&](size_t max) {
    U16 s;
    for (size_t n = rng() % (max + 1); n--;) s += alphabet[rng() % (std::size(alphabet) - 1)];
    return s;
  };
  for (int i = 0; i < 4000; ++i) {
    const U16 head = word(3), a = head + word(4), b = head + word(4);
    const int want = sign(keyU(a).compare(keyU(b)));
    ASSERT_EQ(sign(collU(a, b)), want) << i;
    ASSERT_EQ(sign(collU(b, a)), -want) << i;
    if (a.find_first_of(u"\u0301\u2000\u4e00") != U16::npos || b.find_first_of(u"\u0301\u2000\u4e00") != U16::npos)
      continue;  // not Latin-1
    const std::string pa(a.begin(), a.end()), pb(b.begin(), b.end());
    const std::vector<VLWChar> wa(a.c_str(), a.c_str() + a.size() + 1), wb(b.c_str(), b.c_str() + b.size() + 1);
    ASSERT_EQ(sign(VLStrcoll(l_, pa.data(), static_cast<int32_t>(pa.size()), pb.data(), static_cast<int32_t>(pb.size()), 0)), want) << i;
    ASSERT_EQ(sign(VLWcscoll(l_, wa.data(), static_cast<int32_t>(a.size()), wb.data(), static_cast<int32_t>(b.size()), 0)), want) << i;
  }
}

TEST_F(Collate, KeysInPlaceAllocatedShortAndEmpty) {
  const U16 s = u"Ch\u00e6-ab\u00e5\u4e00";
  const auto *u = reinterpret_cast<const VLUChar *>(s.data());
  const auto n = static_cast<int32_t>(s.size());
  unsigned char big[512], exact[64];
  std::memset(big, 0xAA, sizeof big);
  const int32_t len = VLStrGenSortKey(l_, big, sizeof big, u, n);
  ASSERT_GT(len, 3);
  ASSERT_LT(len, static_cast<int32_t>(sizeof exact));
  for (size_t i = static_cast<size_t>(len); i < sizeof big - 8; ++i) ASSERT_EQ(big[i], 0) << "rest not cleared";
  // A buffer of just the key's length is too small for the work area: built aside.
  std::memset(exact, 0xAA, sizeof exact);
  EXPECT_EQ(VLStrGenSortKey(l_, exact, len, u, n), len);
  EXPECT_EQ(std::memcmp(big, exact, static_cast<size_t>(len)), 0);
  // One byte short: the length, and not one byte written.
  std::memset(exact, 0xAA, sizeof exact);
  EXPECT_EQ(VLStrGenSortKey(l_, exact, len - 1, u, n), len);
  for (unsigned char c : exact) EXPECT_EQ(c, 0xAA);
  // Unaligned destinations give the same key at dst itself.
  alignas(8) unsigned char odd[520];
  EXPECT_EQ(VLStrGenSortKey(l_, odd + 3, 500, u, n), len);
  EXPECT_EQ(std::memcmp(big, odd + 3, static_cast<size_t>(len)), 0);
  // The empty string.
  unsigned char e[4] = {9, 9, 9, 9};
  EXPECT_EQ(VLStrGenSortKey(l_, e, 4, u, 0), 3);
  EXPECT_EQ(std::string(reinterpret_cast<char *>(e), 4), std::string("\0\0\0\x09", 4));
  char x[8] = {9, 9, 9, 9};
  EXPECT_EQ(VLStrxfrm(l_, x, 2, "", 0, 0), 3);
  EXPECT_EQ(x[0] | x[1], 0);
  EXPECT_EQ(x[2], 9);
  EXPECT_EQ(VLStrxfrm(l_, x, sizeof x, "a", 1, 0x12), -1);
}

TEST_F(Collate, CombinationSplitByTheCountedLength) {
  EXPECT_EQ(keyU(u"ch", 1), keyU(u"c"));
  EXPECT_NE(keyU(u"ch", 2), keyU(u"c") + "h");
  EXPECT_EQ(VLStrcoll(l_, "ch", 1, "c", 1, 0), 0);
  EXPECT_GT(VLStrcoll(l_, "ch", 2, "h", 1, 0), 0);
}

TEST_F(Collate, StepsElementByElement) {
  const char *s = "ach\xe6";  // a, ch, ae
  const char *p = s;
  int32_t rem = 4;
  uint32_t counter = 0;
  uint16_t pending = VL_COLL_NOPENDING, p1, p2, q1, q2;
  uint8_t s1, t1, s2, t2, cls;
  std::vector<int> got;
  while (rem > 0 || pending != VL_COLL_NOPENDING) {
    int n = VLStrGetNextWeight(l_, &p, &rem, &counter, &p1, &s1, &t1, &q1, &p2, &s2, &t2, &q2, &cls, &pending);
    got.push_back(n);
    got.push_back(p1);
    if (n == 2) got.push_back(p2);
  }
  EXPECT_EQ(got, (std::vector<int>{1, 0x120, 1, 0x12F, 2, 0x120, 0x128}));
  EXPECT_EQ(counter, 4u);
}

// Trailing blanks, the option words each form takes, and code order through the comparison
// family, which also gives case-blind searches there their folding.
TEST_F(Collate, OptionWordsBlanksAndCodeOrder) {
  uint32_t rc;
  VLLocale *code = VLGetLocale("English_UnitedStates.Latin1@Binary", 0, &rc);
  ASSERT_TRUE(code && (code->flags & VL_LF_BINARY));
  enum Form { Plain, W };
  struct Case {
    const char *why;
    Form form;
    VLLocale *l;
    std::string a, b;
    uint32_t options;
    int order, code;
  } cases[] = {
      {"0x01 drops trailing blanks", Plain, l_, "ab  ", "ab", 0x01, 0, 0},
      {"blanks count without it", Plain, l_, "ab  ", "ab", 0, 1, 0},
      {"0x01 clears 0x00200000", Plain, l_, "ab ", "ab", 0x00200001, 0, 0},
      {"0x00200000 without 0x01 is refused", Plain, l_, "a", "b", 0x00200000, 0, 2},
      {"the comparison family's blank-blind word passes", Plain, l_, "AB ", "ab", 0x80200041, 0, 0},
      {"its case-blind word lacks 0x01 and is refused", Plain, l_, "AB", "ab", 0x80200040, 0, 2},
      {"an unknown bit is refused", Plain, l_, "a", "b", 0x12, 0, 2},
      {"W drops blanks on 0x00200000", W, l_, "ab  ", "ab", 0x00200000, 0, 0},
      {"W keeps them on 0x01", W, l_, "ab  ", "ab", 0x01, 1, 0},
      {"code order is exact without options", Plain, code, "ABC", "abc", 0, -1, 0},
      {"code order folds case as the comparison does", Plain, code, "ABC", "abc", VL_COLL_IGNORECASE, 0, 0},
      {"code order drops blanks on 0x00200000", Plain, code, "ab  ", "ab", 0x00200000, 0, 0},
      {"W code order folds case", W, code, "ABC", "abc", VL_COLL_IGNOREWIDTH, 0, 0},
  };
  for (const Case &c : cases) {
    int r;
    if (c.form == Plain) {
      r = VLStrcoll(c.l, c.a.data(), static_cast<int32_t>(c.a.size()), c.b.data(), static_cast<int32_t>(c.b.size()),
                    c.options);
    } else {
      const std::vector<VLWChar> wa(c.a.begin(), c.a.end()), wb(c.b.begin(), c.b.end());
      r = VLWcscoll(c.l, wa.data(), static_cast<int32_t>(wa.size()), wb.data(), static_cast<int32_t>(wb.size()),
                    c.options);
    }
    EXPECT_EQ(sign(r), c.order) << c.why;
    EXPECT_EQ(VLGetError(c.l), c.code) << c.why;
  }
  const VLUChar str[] = {'x', 'A', 'b', 'D', 0}, sub[] = {'a', 'B', 'd', 0};
  const char *hay = "xAbD";
  EXPECT_EQ(VLStrstr(code, hay, -1, "aBd", -1, VL_COLL_IGNORECASE), hay + 1) << "folded as VLStrcmp folds";
  EXPECT_EQ(VLStrstrU(code, str, -1, sub, -1, VL_COLL_IGNORECASE), str + 1) << "UTF-16 folds case in code order";
  EXPECT_EQ(VLStrstrU(code, str, -1, sub, -1, 0), nullptr);
  VLReleaseLocale(code);
}

}  // namespace

namespace {

TEST_F(Collate, SubstringSearchInFourForms) {
  struct Case {
    const char *why, *str, *sub;
    uint32_t options;
    int at;  // -1: no match
  } cases[] = {
      {"exact match after a near miss", "abcabd", "abd", 0, 3},
      {"the empty substring matches at the start", "abc", "", 0, 0},
      {"a longer substring never matches", "ab", "abc", 0, -1},
      {"no match", "abcabc", "abd", 0, -1},
      {"case counts without options", "xxABd", "abd", 0, -1},
      {"case-blind match", "xxABd", "abd", VL_COLL_IGNORECASE, 2},
      {"case- and width-blind match", "xAbD", "abd", VL_COLL_IGNOREWIDTH, 1},
      {"case-blind still needs the letters", "xxABe", "abd", VL_COLL_IGNORECASE, -1},
  };
  for (const Case &c : cases) {
    const auto n = static_cast<int32_t>(std::strlen(c.str)), m = static_cast<int32_t>(std::strlen(c.sub));
    const char *p = VLStrstr(l_, c.str, n, c.sub, m, c.options);
    EXPECT_EQ(p ? static_cast<int>(p - c.str) : -1, c.at) << c.why;
    const char *x = VLStrstrEx(l_, c.str, 0, -1, c.sub, 0, -1, c.options);
    EXPECT_EQ(x ? static_cast<int>(x - c.str) : -1, c.at) << c.why << " (Ex)";
    std::vector<VLUChar> us(c.str, c.str + n + 1), ub(c.sub, c.sub + m + 1);
    const VLUChar *u = VLStrstrU(l_, us.data(), n, ub.data(), m, c.options);
    EXPECT_EQ(u ? static_cast<int>(u - us.data()) : -1, c.at) << c.why << " (U)";
    std::vector<VLWChar> ws(c.str, c.str + n + 1), wb(c.sub, c.sub + m + 1);
    const VLWChar *w = VLWcsstr(l_, ws.data(), -1, wb.data(), -1, c.options);
    EXPECT_EQ(w ? static_cast<int>(w - ws.data()) : -1, c.at) << c.why << " (W)";
  }
  EXPECT_EQ(VLStrstr(l_, "abc", 3, "b", 1, 0x10), nullptr);
  EXPECT_EQ(VLGetError(l_), 2);
}

}  // namespace

namespace {

// Each allocation a call makes fails in turn: code 20, the documented result, no leak.
TEST_F(Collate, AllocationFailures) {
  // Pairs that differ in a primary are decided without a work area: these differ in case.
  const std::string longer(200, 'a'), other = "A" + std::string(199, 'a');
  const U16 units(100, u'a');
  struct Case {
    const char *why;
    int failing;  // which allocation of the call fails
    std::function<bool()> failed;
    bool setsCode = true;
  } cases[] = {
      {"key units", 1, [&] { char k[8]; return VLStrxfrm(l_, k, sizeof k, longer.data(), 200, 0) == -1; }},
      {"key work area", 2, [&] { char k[8]; return VLStrxfrm(l_, k, sizeof k, longer.data(), 200, 0) == -1; }},
      {"comparison work area", 1,
       [&] { return VLStrcoll(l_, longer.data(), 200, other.data(), 200, 0) == 0; }},
      {"generated key work area", 1, [&] {
         unsigned char k[8];
         return VLStrGenSortKey(l_, k, sizeof k, reinterpret_cast<const VLUChar *>(units.data()), 100) == -1;
       }, false},
  };
  for (const Case &c : cases) {
    const long live = ts::hooks.live;
    ts::hooks.failAt = ts::hooks.allocs + c.failing;
    EXPECT_TRUE(c.failed()) << c.why;
    ts::hooks.failAt = -1;
    EXPECT_EQ(ts::hooks.live, live) << c.why << " leaked";
    if (c.setsCode) {
      EXPECT_EQ(VLGetError(l_), 20) << c.why;
    }
  }
  EXPECT_LT(VLStrcoll(l_, longer.data(), 200, other.data(), 200, 0), 0);
}

}  // namespace
