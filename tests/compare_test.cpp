// Comparison in single-byte, double-byte and shift-sensitive pages and in the W and
// UTF-16 forms: the options, the folded paths, special casing and its allocations.
#include <cstring>
#include <random>
#include <string>
#include <vector>

#include "genloc.h"
#include "support/defdir.h"

using gents::B;

namespace {

class Compare : public gents::GenLocales {
 protected:
  int32_t cmp(VLLocale *l, const std::string &a, const std::string &b, uint32_t opts, VLShiftState s1 = 0,
              VLShiftState s2 = 0) {
    if (l == sh_) return VLStrcmpEx(l, a.c_str(), s1, -1, b.c_str(), s2, -1, opts);
    return VLStrcmp(l, a.c_str(), -1, b.c_str(), -1, opts);
  }
};

int sign(int64_t v) { return (v > 0) - (v < 0); }

constexpr uint32_t kCase = VL_CMP_NOCASE, kWidth = VL_CMP_NOWIDTH, kBlanks = VL_CMP_NOBLANKS;

TEST_F(Compare, OptionsInEachPage) {
  struct Case {
    const char *what;
    VLLocale *Compare::*loc;
    std::string a, b;
    uint32_t options;
    int want;  // sign
    VLShiftState s1 = 0, s2 = 0;
  } cases[] = {
      {"a prefix sorts first exactly", &Compare::sb_, "ABC", "ABCD", 0, -1},
      {"a prefix sorts first without case", &Compare::sb_, "ABC", "abcd", kCase, -1},
      {"a prefix sorts first without width", &Compare::sb_, "ABC", "ABCD", kWidth, -1},
      {"case folds", &Compare::sb_, "Stra\xC3\x9F" "e", "sTRA\xC3\x9F" "E", kCase, 0},
      {"width mode leaves single-byte case exact", &Compare::sb_, "a", "A", kWidth, 1},
      {"Latin-1 letters fold", &Compare::sb_, "\xE4\xF6\xFC", "\xC4\xD6\xDC", kCase, 0},
      {"trailing blanks are ignored", &Compare::sb_, "AB  ", "AB", kBlanks, 0},
      {"and counted otherwise", &Compare::sb_, "AB  ", "AB", 0, 1},
      {"trailing blanks without case", &Compare::sb_, "ab  ", "AB", kBlanks | kCase, 0},
      {"the empty string first", &Compare::sb_, "", "abc", 0, -1},
      {"a prefix sorts first in MS932", &Compare::mb_, "ABC", "ABCD", kCase, -1},
      {"full-width letters fold case", &Compare::mb_, B("\x82\x81\x82\x82", 4), B("\x82\x60\x82\x61", 4), kCase, 0},
      {"full-width and half-width are equal without width", &Compare::mb_, B("\x82\x60" "b", 3), "Ab", kWidth, 0},
      {"but not without case alone", &Compare::mb_, B("\x82\x60", 2), "A", kCase, 1},
      {"full-width blanks go with width", &Compare::mb_, B("a\x81\x40", 3), "a", kBlanks | kWidth, 0},
      {"a kanji against a letter", &Compare::mb_, B("\x88\xEA", 2), "a", kCase, 1},
      {"a half-width katakana after a double-byte letter", &Compare::mb_, "\xB1", B("\x82\x60", 2), kCase, 1},
      {"a prefix sorts first in IBM930", &Compare::sh_, "\xC1\xC2\xC3", "\xC1\xC2\xC3\xC4", kCase, -1},
      {"Shift-Out first equals the double-byte state", &Compare::sh_, B("\x0E\x45\x41", 3), B("\x45\x41", 2), 0, 0,
       0, 1},
      {"EBCDIC letters fold", &Compare::sh_, "\x62\x63", "\xC1\xC2", kCase, 0},
      {"double-byte letters fold", &Compare::sh_, B("\x0E\x42\x81\x0F", 4), B("\x0E\x42\xC1\x0F", 4), kCase, 0},
      {"full-width A is A without width", &Compare::sh_, B("\x0E\x42\xC1\x0F\xC2", 5), "\xC1\xC2", kWidth, 0},
      {"a shift byte in the double-byte state sorts first", &Compare::sh_, B("\x0E\x45\x41\x0F\xC1", 5),
       B("\x0E\x45\x41\x45\x42", 5), kCase, -1},
      {"EBCDIC blanks are ignored", &Compare::sh_, "\xC1\x40\x40", "\xC1", kBlanks, 0},
      {"ß is SS in German", &Compare::de_, "STRASSE", "stra\xDF" "e", kCase, 0},
      {"dotted i is İ in Turkish", &Compare::tr_, "i", "\xDD", kCase, 0},
      {"dotless ı is I in Turkish", &Compare::tr_, "\xFD", "I", kCase, 0},
      {"so i and I differ in Turkish", &Compare::tr_, "i", "I", kCase, 1},
  };
  for (const Case &c : cases) {
    VLLocale *l = this->*c.loc;
    EXPECT_EQ(sign(cmp(l, c.a, c.b, c.options, c.s1, c.s2)), c.want) << c.what;
    EXPECT_EQ(sign(cmp(l, c.b, c.a, c.options, c.s2, c.s1)), -c.want) << c.what << " (swapped)";
    EXPECT_EQ(VLGetError(l), 0) << c.what;
  }
  EXPECT_EQ(VLStrcmp(sb_, "", 0, "abc", 3, 0), -3);
}

TEST_F(Compare, LengthsInCharactersAndCutToCharacters) {
  const std::string k2 = B("\x88\xEA\x88\xEB", 4);
  EXPECT_EQ(VLStrcmp(mb_, k2.c_str(), 1, B("\x88\xEA\x88\xEA", 4).c_str(), 1, VL_OPT_CHARLEN), 0);
  EXPECT_EQ(VLStrcmp(mb_, k2.c_str(), 3, B("\x88\xEA\x88\xEA", 4).c_str(), 3, 0), 0) << "3 bytes are one kanji";
  EXPECT_EQ(AdjustLength(mb_, "a\x88\xEA", 0, 2), 1);
  struct {
    std::string s;
    VLShiftState state;
    int32_t len, want;
  } adj[] = {{B("\x0E\x45\x41\x45\x42", 5), 0, 4, 3},
             {B("\x0E\x45\x41\x0F", 4), 0, 4, 4},
             {B("\x45\x41\x45", 3), 1, 3, 2},
             {B("\xC1\xC2", 2), 0, 1, 1}};
  for (auto &c : adj) EXPECT_EQ(AdjustLength(sh_, c.s.data(), c.state, c.len), c.want) << c.len;
}

TEST_F(Compare, WideAndUnitForms) {
  const VLUChar abc[] = {'A', 'B', 'C', 0}, abcd[] = {'a', 'b', 'c', 'd', 0}, fw[] = {0xFF21, 0xFF42, 0x20, 0},
                ab[] = {'A', 'b', 0}, strasse[] = {'S', 'T', 'R', 'A', 'S', 'S', 'E', 0},
                strasze[] = {'s', 't', 'r', 'a', 0xDF, 'e', 0};
  EXPECT_LT(VLStrcmpU(sb_, abc, -1, abcd, -1, 0), 0);
  EXPECT_LT(VLStrcmpU(sb_, abc, -1, abcd, -1, kCase), 0);
  EXPECT_EQ(VLStrcmpU(sb_, abcd, 3, abc, -1, kCase), 0);
  EXPECT_EQ(VLStrcmpU(sb_, fw, -1, ab, -1, kWidth | kBlanks), 0);
  EXPECT_NE(VLStrcmpU(sb_, fw, -1, ab, -1, kWidth), 0);
  EXPECT_EQ(VLStrcmpU(de_, strasse, -1, strasze, -1, kCase), 0);
  EXPECT_NE(VLStrcmpU(de_, strasse, -1, strasze, -1, 0), 0);

  const VLWChar w1[] = {'a', 0x8281, 0x20, 0}, w2[] = {'A', 0x8260, 0}, w3[] = {'A', 0x8260, 'x', 0};
  EXPECT_EQ(VLWcscmp(mb_, w1, -1, w2, -1, kCase | kBlanks), 0);
  EXPECT_LT(VLWcscmp(mb_, w2, -1, w3, -1, kCase), 0);
  EXPECT_GT(VLWcscmp(mb_, w1, -1, w2, -1, 0), 0);
  EXPECT_EQ(VLWcscmp(mb_, w1, 0, w2, 2, 0), -2);
  EXPECT_EQ(VLWcscmp(mb_, w1, 2, w2, 2, VL_OPT_CHARLEN | kCase), 0) << "lengths are values already";
}

TEST_F(Compare, RefusedOptionsGiveZeroWithCode2) {
  struct {
    const char *what;
    uint32_t options;
  } bad[] = {{"an unknown bit", 0x2}, {"the truncation bit", VL_TRUNC_BLANKS}, {"a high bit", 0x40000000}};
  const VLUChar u[] = {'a', 0};
  const VLWChar w[] = {'a', 0};
  for (auto &b : bad) {
    EXPECT_EQ(VLStrcmp(sb_, "a", -1, "b", -1, b.options), 0) << b.what;
    EXPECT_EQ(VLGetError(sb_), 2) << b.what;
    EXPECT_EQ(VLStrcmpEx(sh_, "a", 0, -1, "b", 0, -1, b.options), 0) << b.what;
    EXPECT_EQ(VLGetError(sh_), 2) << b.what;
    EXPECT_EQ(VLStrcmpU(sb_, u, -1, u, -1, b.options), 0) << b.what;
    EXPECT_EQ(VLGetError(sb_), 2) << b.what;
  }
  EXPECT_EQ(VLWcscmp(mb_, w, -1, w, -1, kWidth), 0) << "width folding stays refused in the W form";
  EXPECT_EQ(VLGetError(mb_), 2);
  EXPECT_EQ(VLStrcmp(sb_, "a", -1, "b", -1, 0) < 0, true);
  EXPECT_EQ(VLGetError(sb_), 0);
}

// The special-cased comparison allocates two blocks (as does the mapping of strings too
// long for the stack); either failing gives code 20 and leaves nothing behind.
TEST_F(Compare, AllocationFailureOnTheMappedPath) {
  const VLUChar u1[] = {'s', 0xDF, 0}, u2[] = {'S', 'S', 'S', 0};
  const VLWChar w1[] = {'a', 0xDF, 0}, w2[] = {'A', 'S', 'S', 0};
  const std::string long1(300, '\x62'), long2(300, '\xC1');
  struct {
    const char *what;
    std::function<int32_t()> call;
    VLLocale *Compare::*loc;
  } calls[] = {
      {"plain", [&] { return VLStrcmp(de_, "stra\xDF" "e", -1, "STRASSE", -1, kCase); }, &Compare::de_},
      {"Ex", [&] { return VLStrcmpEx(sh_, long1.c_str(), 0, -1, long2.c_str(), 0, -1, kCase); }, &Compare::sh_},
      {"W", [&] { return VLWcscmp(de_, w1, -1, w2, -1, kCase); }, &Compare::de_},
      {"U", [&] { return VLStrcmpU(de_, u1, -1, u2, -1, kCase); }, &Compare::de_},
  };
  for (auto &c : calls) {
    for (long k : {1, 2}) {
      const long live = ts::hooks.live;
      ts::hooks.failAt = ts::hooks.allocs + k;
      EXPECT_EQ(c.call(), 0) << c.what << " block " << k;
      EXPECT_EQ(VLGetError(this->*c.loc), 20) << c.what << " block " << k;
      EXPECT_EQ(ts::hooks.live, live) << c.what << " block " << k;
    }
    ts::hooks.failAt = -1;
    const long live = ts::hooks.live;
    EXPECT_EQ(c.call(), 0) << c.what;
    EXPECT_EQ(VLGetError(this->*c.loc), 0) << c.what;
    EXPECT_EQ(ts::hooks.live, live) << c.what;
  }
}

// Random text of each page against the same text upper-cased as UTF-16 and encoded
// again: equal exactly when the upper-cased strings are, and otherwise ordered as them.
TEST_F(Compare, CaseInsensitiveAgreesWithUpperCasedText) {
  std::vector<VLUChar> candidates;
  for (VLUChar u = 0x20; u < 0x7F; ++u) candidates.push_back(u);
  for (VLUChar u = 0xC0; u <= 0xFF; ++u) candidates.push_back(u);
  for (VLUChar u = 0x391; u <= 0x3C9; ++u) candidates.push_back(u);
  for (VLUChar u = 0x410; u <= 0x44F; ++u) candidates.push_back(u);
  for (VLUChar u = 0xFF21; u <= 0xFF5A; ++u) candidates.push_back(u);
  for (VLUChar u : {0x3000, 0x4E00, 0x4E01, 0x30A2, 0x3042}) candidates.push_back(u);

  for (VLLocale *l : {sb_, mb_, sh_, de_, tr_}) {
    auto encode = [&](const std::vector<VLUChar> &u) {
      std::string out(u.size() * 4 + 4, '\0');
      int32_t n = VLCpUnicodeToStr(l->codePage, u.data(), static_cast<int32_t>(u.size()), 0,
                                   reinterpret_cast<unsigned char *>(out.data()));
      out.resize(n > 0 ? static_cast<size_t>(n) : 0);
      return out;
    };
    auto upper = [&](const std::vector<VLUChar> &u) {
      std::vector<VLUChar> out(u.size() * 2 + 1);
      int32_t n = VLMapStringU(l, out.data(), static_cast<int32_t>(out.size()), u.data(),
                               static_cast<int32_t>(u.size()), VL_MAP_UPPER);
      out.resize(static_cast<size_t>(n));
      return out;
    };
    auto decode = [&](const std::string &s) {
      std::vector<VLUChar> u(s.size() + 1);
      int32_t n = VLCpStrToUnicode(l->codePage, reinterpret_cast<const unsigned char *>(s.data()),
                                   static_cast<int32_t>(s.size()), u.data());
      u.resize(n > 0 ? static_cast<size_t>(n) : 0);
      return u;
    };
    // Characters that the page holds together with their upper-case forms.
    std::vector<VLUChar> alphabet;
    for (VLUChar c : candidates) {
      std::vector<VLUChar> one{c}, up = upper(one);
      if (decode(encode(one)) == one && decode(encode(up)) == up) alphabet.push_back(c);
    }
    ASSERT_GT(alphabet.size(), 60u);
    std::mt19937 rng(1234);
    auto pick = [&] { return alphabet[rng() % alphabet.size()]; };
    int mismatches = 0, equal = 0;
    for (int i = 0; i < 2000 && mismatches < 5; ++i) {
      std::vector<VLUChar> a(rng() % 10), b;
      for (auto &c : a) c = pick();
      for (VLUChar c : a) {
        std::vector<VLUChar> one{c};
        b.push_back(rng() % 2 ? upper(one)[0] : c);
      }
      if (rng() % 2 && !b.empty()) b[rng() % b.size()] = pick();
      if (rng() % 4 == 0) b.push_back(pick());
      const std::string ea = encode(a), eb = encode(b), ua = encode(upper(a)), ub = encode(upper(b));
      int r = l == sh_ ? VLStrcmpEx(l, ea.c_str(), 0, -1, eb.c_str(), 0, -1, kCase)
                       : VLStrcmp(l, ea.c_str(), -1, eb.c_str(), -1, kCase);
      int m = std::memcmp(ua.data(), ub.data(), std::min(ua.size(), ub.size()));
      int want = m ? sign(m) : sign(int64_t(ua.size()) - int64_t(ub.size()));
      equal += want == 0;
      if (sign(r) != want) {
        ++mismatches;
        ADD_FAILURE() << "page " << l->codePage->name << ": " << ea << " / " << eb << " gave " << r;
      }
    }
    EXPECT_GT(equal, 100) << l->codePage->name;
  }
}

TEST(CompareHandMade, SingleByteCaseTableWithoutSpecialCasing) {
  ts::TempDir dir;
  ts::DefDir::standard().write(dir.path);
  ts::Library lib(dir.path.c_str());
  ASSERT_EQ(lib.rc, 0u);
  uint32_t rc = 0;
  VLLocale *l = VLGetLocale("German", 0, &rc);
  ASSERT_NE(l, nullptr);
  VLLocale *d = VLGetLocale("German.MS932", 0, &rc);
  VLLocale *e = VLGetLocale("German.IBM-930", 0, &rc);
  ASSERT_TRUE(d && e);
  const long allocs = ts::hooks.allocs;
  EXPECT_EQ(VLStrcmp(l, "\xE4" "bc", -1, "\xC4" "BC", -1, kCase), 0);
  EXPECT_LT(VLStrcmp(l, "abc", -1, "ABD", -1, kCase), 0);
  EXPECT_NE(VLStrcmp(l, "a", -1, "A", -1, kWidth), 0);
  EXPECT_EQ(VLStrcmp(d, "ab\x81\x40" "c", -1, "AB\x81\x40" "C", -1, kCase), 0);
  EXPECT_GT(VLStrcmp(d, "ab\x81\x41", -1, "AB\x81\x40", -1, kCase), 0);
  EXPECT_EQ(VLStrcmpEx(e, "\x81\x0E\x45\x41\x0F\x82", 0, -1, "\xC1\x0E\x45\x41\x0F\xC2", 0, -1, kCase), 0);
  EXPECT_LT(VLStrcmpEx(e, "\x81\x0E\x45\x41", 0, -1, "\xC1\x0E\x45\x42", 0, -1, kCase), 0);
  EXPECT_EQ(ts::hooks.allocs, allocs) << "only special casing allocates";
  for (VLLocale *x : {l, d, e}) VLReleaseLocale(x);
}

TEST(CompareBytes, BigEndianSwapsWholeUnits) {
  struct {
    int32_t count;
    std::string want;
  } cases[] = {{5, "\x02\x01\x04\x03\x05"}, {4, "\x02\x01\x04\x03\x05"}, {1, "\x01\x02\x03\x04\x05"},
               {0, "\x01\x02\x03\x04\x05"}, {-3, "\x01\x02\x03\x04\x05"}};
  for (auto &c : cases) {
    std::string b = "\x01\x02\x03\x04\x05";
    VLStrBigEndian(b.data(), c.count);
    EXPECT_EQ(b, c.want) << c.count;
  }
}

}  // namespace
