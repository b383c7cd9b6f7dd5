// Copy, concatenation, character search, spans and tokenising in the four forms.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "step_pages.h"

using namespace stepts;

namespace {

constexpr char kFill = '#';  // marks bytes a call must not touch

struct CopyCase {
  Kind kind;
  std::string src;
  int32_t srcLen;
  int32_t dstLen;
  uint32_t options;
  int32_t result;
  std::string dst;  // bytes written
  VLShiftState srcState = 0, dstState = 0;
};

TEST(String, CopiesWholeCharactersOnly) {
  const std::vector<CopyCase> cases = {
      {kSingle, "abc", -1, 10, 0, 4, B("abc\0")},
      {kSingle, "abc", -1, 2, 0, 2, "ab"},
      {kDouble, B("a\x81\x40" "b"), -1, 2, 0, 1, "a"},
      {kDouble, B("a\x81\x40" "b"), -1, 3, 0, 3, B("a\x81\x40")},
      {kDouble, B("a\x81\x40" "b"), -1, 2, VL_OPT_CHARLEN, 2, B("a\x81\x40")},
      {kDouble, B("a\x81\x40" "b"), 2, 10, VL_OPT_CHARLEN, 2, B("a\x81\x40")},
      {kUtf8, B("\xC3\xA9x"), -1, 1, 0, 0, ""},
      {kSingle, "abc", 0, 10, 0, 0, ""},
      {kSingle, "abc", 3, 0, 0, 0, ""},
      // Shift-sensitive: the seam between the states, and no dangling shift byte.
      {kShift, B("\x45\x41"), 2, 2, 0, 0, "", 1, 0},
      {kShift, B("\x45\x41\x0F" "a"), 4, 10, 0, 5, B("\x0E\x45\x41\x0F" "a"), 1, 0},
      {kShift, B("\x0F" "a"), 2, 10, 0, 1, "a", 1, 0},
      {kShift, B("a\x0E\x45\x41"), 4, 3, 0, 1, "a"},
      {kShift, "ab", 2, 1, 0, 0, "", 0, 1},
      {kShift, "ab", 2, 3, 0, 3, B("\x0F" "ab"), 0, 1},
      {kShift, B("\x0E" "ab"), 3, 10, 0, 2, "ab", 0, 1},
      {kShift, B("\x0E\x45\x41\x45\x42\x0F"), 1, 10, VL_OPT_CHARLEN, 1, B("\x0E\x45\x41")},
      // However many shift bytes the source ends with.
      {kShift, B("\xC1\x0E\x0F"), 3, 10, 0, 1, "\xC1"},
      {kShift, B("\xC1\x0E\x0F\x0E"), 4, 10, 0, 1, "\xC1"},
  };
  for (size_t i = 0; i < cases.size(); ++i) {
    const CopyCase &c = cases[i];
    std::string dst(16, kFill);
    int32_t r = c.kind == kShift ? VLStrcpyEx(locale(c.kind), dst.data(), c.dstState, c.dstLen, c.src.data(),
                                              c.srcState, c.srcLen, c.options)
                                 : VLStrcpy(locale(c.kind), dst.data(), c.dstLen, c.src.data(), c.srcLen, c.options);
    EXPECT_EQ(r, c.result) << "case " << i;
    EXPECT_EQ(dst.substr(0, c.dst.size() + 1), c.dst + kFill) << "case " << i;
  }
  char d[4];
  EXPECT_EQ(VLStrcpy(locale(kSingle), d, 4, "a", -1, 0x1), -1);
  EXPECT_EQ(locale(kSingle)->lastError, 2);
  EXPECT_EQ(VLStrcpyEx(locale(kShift), d, 0, 4, "a", 0, -1, VL_OPT_NULLTERM), -1);
}

TEST(String, CopiesUnits) {
  const VLUChar src[] = {'a', 'b', 0};
  VLUChar dst[4] = {9, 9, 9, 9};
  EXPECT_EQ(VLStrcpyU(nullptr, dst, 4, src, -1), 3);
  EXPECT_EQ(dst[2], 0);
  EXPECT_EQ(dst[3], 9);
  EXPECT_EQ(VLStrcpyU(nullptr, dst, 1, src, -1), 1);
  EXPECT_EQ(VLStrcpyU(nullptr, dst, 4, src, 0), 0);
  const VLWChar wsrc[] = {0x8140, 0x41, 0};
  VLWChar wdst[2];
  EXPECT_EQ(VLWcscpy(nullptr, wdst, 2, wsrc, -1), 2);
  EXPECT_EQ(wdst[0], 0x8140u);
}

struct CatCase {
  Kind kind;
  std::string dst;
  std::string src;
  int32_t srcLen;
  uint32_t options;
  int32_t result;
  std::string after;  // dst afterwards, through the last byte written
  VLShiftState srcState = 0;
};

TEST(String, Concatenates) {
  const std::vector<CatCase> cases = {
      {kSingle, "ab", "cd", -1, 0, 5, B("abcd\0")},
      {kSingle, "ab", "cd", 0, 0, 3, "ab"},  // the terminator counted, nothing written
      {kSingle, "ab", "cd", 0, VL_OPT_CHARLEN, 3, "ab"},
      {kSingle, "ab", "cde", 2, 0, 4, "abcd"},
      {kSingle, "ab", "cde", 2, VL_OPT_NULLTERM, 5, B("abcd\0")},
      {kDouble, "x", B("\x81\x40\x81\x41"), 3, 0, 3, B("x\x81\x40")},
      {kDouble, "", B("\x81\x40" "a"), 1, VL_OPT_CHARLEN | VL_OPT_NULLTERM, 2, B("\x81\x40\0")},
      // A closed double-byte run is reopened when more of it follows...
      {kShift, B("a\x0E\x45\x41\x0F"), B("\x45\x42"), -1, 0, 8, B("a\x0E\x45\x41\x45\x42\x0F\0"), 1},
      // ...and the states are joined by one shift byte.
      {kShift, "a", B("\x45\x42"), 2, 0, 4, B("a\x0E\x45\x42"), 1},
      {kShift, "a", B("\x0E"), -1, 0, 2, B("a\0")},
      {kShift, B("a\x0E\x45\x41\x0F"), "b", -1, 0, 7, B("a\x0E\x45\x41\x0F" "b\0")},
      // The appended part never ends on shift bytes, however many src ends with.
      {kShift, "\xC1", B("\xC2\x0E\x0F"), 3, 0, 2, "\xC1\xC2"},
      {kShift, "\xC1", B("\xC2\x0E\x0F"), -1, 0, 3, B("\xC1\xC2\0")},
  };
  for (size_t i = 0; i < cases.size(); ++i) {
    const CatCase &c = cases[i];
    std::string dst(24, kFill);
    std::copy(c.dst.begin(), c.dst.end(), dst.begin());
    dst[c.dst.size()] = 0;
    int32_t r = c.kind == kShift ? VLStrcatEx(locale(c.kind), dst.data(), 0, c.src.data(), c.srcState, c.srcLen, c.options)
                                 : VLStrcat(locale(c.kind), dst.data(), c.src.data(), c.srcLen, c.options);
    EXPECT_EQ(r, c.result) << "case " << i;
    EXPECT_EQ(dst.substr(0, c.after.size()), c.after) << "case " << i;
  }
  char d[8] = "a";
  EXPECT_EQ(VLStrcat(locale(kSingle), d, "b", -1, 0x10), -1);
  EXPECT_EQ(locale(kSingle)->lastError, 2);
  VLUChar u[8] = {'a', 0};
  const VLUChar b[] = {'b', 'c', 0};
  EXPECT_EQ(VLStrcatU(nullptr, u, b, -1, 0), 4);
  EXPECT_EQ(std::u16string(u, u + 4), std::u16string(u"abc", 4));
}

TEST(String, FindsCharacters) {
  struct Case {
    Kind kind;
    std::string str;
    int32_t len;
    std::string chr;
    uint32_t options;
    int at;  // -1: not found
    VLShiftState found = 0, strState = 0, chrState = 0;
  };
  const std::vector<Case> cases = {
      {kSingle, "abcabc", -1, "b", 0, 1},
      {kSingle, "abcabc", -1, "b", VL_OPT_LAST, 4},
      {kSingle, "abcabc", -1, B("\0"), 0, 6},  // the terminator can be found
      {kSingle, "abcabc", 6, B("\0"), 0, -1},
      {kSingle, "abcabc", 0, "a", 0, -1},
      {kDouble, B("\x81\x62" "b"), -1, "b", 0, 2},  // never the trail byte
      {kDouble, B("\x81\x40" "a\x81\x40"), -1, B("\x81\x40"), VL_OPT_LAST, 3},
      {kDouble, B("a\x81\x40" "b"), 2, "b", VL_OPT_CHARLEN, -1},
      {kDouble, B("a\x81\x40" "b"), 3, "b", VL_OPT_CHARLEN, 3},
      {kShift, B("a\x0E\x45\x41\x0F\x41"), -1, B("\x0E\x45\x41"), 0, 2, 1},
      {kShift, B("a\x0E\x45\x41\x0F\x41"), -1, "A", 0, 5, 0},
      {kShift, B("\x45\x41\x0F\x41"), 4, B("\x45\x41"), VL_OPT_LAST, 0, 1, 1, 1},
  };
  for (size_t i = 0; i < cases.size(); ++i) {
    const Case &c = cases[i];
    VLShiftState found = 9;
    const char *s = c.str.data();
    const char *p = c.kind == kShift
                        ? VLStrchrEx(locale(c.kind), s, c.strState, c.len, c.chr.data(), c.chrState, &found, c.options)
                        : VLStrchr(locale(c.kind), s, c.len, c.chr.data(), c.options);
    EXPECT_EQ(p ? p - s : -1, c.at) << "case " << i;
    if (c.kind == kShift && p) {
      EXPECT_EQ(found, c.found) << "case " << i;
    }
  }
  EXPECT_EQ(VLStrchr(locale(kSingle), "ab", -1, "a", 0x1), nullptr);
  EXPECT_EQ(locale(kSingle)->lastError, 2);

  const VLWChar w[] = {1, 2, 3, 2, 0};
  EXPECT_EQ(VLWcschr(nullptr, w, -1, 2, 0), w + 1);
  EXPECT_EQ(VLWcschr(nullptr, w, -1, 2, VL_OPT_LAST), w + 3);
  EXPECT_EQ(VLWcschr(nullptr, w, -1, 0, 0), w + 4);
  EXPECT_EQ(VLWcschr(nullptr, w, -1, 0, VL_OPT_LAST), nullptr);  // backwards starts before the 0
  const VLUChar u[] = {'x', 'y', 0};
  EXPECT_EQ(VLStrchrU(nullptr, u, 2, 'y', VL_OPT_LAST | VL_OPT_CHARLEN), u + 1);
  EXPECT_EQ(VLStrchrU(nullptr, u, 2, 'y', 0x2), nullptr);
}

TEST(String, Spans) {
  struct Case {
    Kind kind;
    bool in;
    std::string str;
    int32_t len;
    std::string set;
    int32_t setLen;
    uint32_t options;
    int32_t result;
  };
  const std::vector<Case> cases = {
      {kSingle, true, "aabbc", -1, "ab", -1, 0, 4},
      {kSingle, false, "xyzab", -1, "ba", -1, 0, 3},
      {kSingle, true, "aabbc", 3, "ab", -1, 0, 3},
      {kSingle, true, B("a\0a"), 3, B("\0a"), 2, 0, 3},
      {kDouble, true, B("\x81\x40\x81\x41" "x"), -1, B("\x81\x40"), -1, 0, 2},
      {kDouble, false, B("\x81\x40" "@"), -1, "@", -1, 0, 2},  // the trail byte is not '@'
      {kDouble, true, B("\x81\x40\x81\x40" "a"), -1, B("\x81\x40"), -1, VL_OPT_CHARLEN, 2},
      {kDouble, true, B("\x81\x40\x81\x40"), 3, B("\x81\x40"), -1, 0, 2},
      {kDouble, true, B("a\x81\x40"), -1, B("\x81\x40" "a"), 1, 0, 0},  // set cut to whole characters
      {kShift, true, B("\x0E\x45\x41\x45\x41\x0F" "a"), -1, B("\x0E\x45\x41"), -1, 0, 6},
      {kShift, false, B("ab\x0E\x45\x41"), -1, B("\x0E\x45\x41"), -1, 0, 3},
      {kShift, false, B("ab\x0E\x45\x41"), -1, B("\x0E\x45\x41"), -1, VL_OPT_CHARLEN, 2},
  };
  for (size_t i = 0; i < cases.size(); ++i) {
    const Case &c = cases[i];
    VLLocale *l = locale(c.kind);
    const char *s = c.str.data(), *set = c.set.data();
    int32_t r = c.kind == kShift
                    ? (c.in ? VLStrspnEx(l, s, 0, c.len, set, 0, c.setLen, c.options)
                            : VLStrcspnEx(l, s, 0, c.len, set, 0, c.setLen, c.options))
                    : (c.in ? VLStrspn(l, s, c.len, set, c.setLen, c.options)
                            : VLStrcspn(l, s, c.len, set, c.setLen, c.options));
    EXPECT_EQ(r, c.result) << "case " << i;
  }
  EXPECT_EQ(VLStrspn(locale(kSingle), "a", -1, "a", -1, 0x8), -1);
  const VLUChar u[] = {'a', 'a', 'b', 0}, us[] = {'a', 0};
  EXPECT_EQ(VLStrspnU(nullptr, u, -1, us, -1), 2);
  EXPECT_EQ(VLStrcspnU(nullptr, u, -1, u + 2, -1), 2);
  const VLWChar w[] = {0x8140, 0x41, 0}, ws[] = {0x41, 0};
  EXPECT_EQ(VLWcscspn(nullptr, w, -1, ws, -1), 1);
  EXPECT_EQ(VLWcsspn(nullptr, w, -1, ws, -1), 0);
}

// Every token of text, calling again from next until no token is left.
std::vector<std::string> tokens(Kind kind, std::string text, const std::string &delims, uint32_t options = 0) {
  std::vector<std::string> out;
  char *str = text.data();
  int32_t len = options ? VLNumChars(locale(kind), str, -1) : static_cast<int32_t>(text.size());
  while (char *t = [&] {
    char *next = nullptr;
    char *tok = VLStrtok(locale(kind), str, &len, delims.data(), -1, &next, options);
    str = next;
    return tok;
  }()) {
    out.emplace_back(t);
    if (!str) break;
  }
  return out;
}

TEST(String, Tokenises) {
  using V = std::vector<std::string>;
  EXPECT_EQ(tokens(kSingle, "a,,b", ","), (V{"a", "b"}));
  EXPECT_EQ(tokens(kSingle, ",a;b,,c;", ",;"), (V{"a", "b", "c"}));
  EXPECT_EQ(tokens(kSingle, ",,,", ","), V{});
  EXPECT_EQ(tokens(kSingle, "", ","), V{});
  EXPECT_EQ(tokens(kSingle, "abc", ","), V{"abc"});
  EXPECT_EQ(tokens(kDouble, B("ab\x81\x40" "cd"), B("\x81\x40")), (V{"ab", "cd"}));
  EXPECT_EQ(tokens(kDouble, B("\x81\x40@x"), "@"), (V{B("\x81\x40"), "x"}));
  EXPECT_EQ(tokens(kDouble, B("\x81\x40@x\x81\x41"), "@", VL_OPT_CHARLEN), (V{B("\x81\x40"), B("x\x81\x41")}));

  // The delimiter is blanked whole, and the remaining length counts from next.
  std::string s = B("ab\x81\x40" "cd");
  char *next = nullptr;
  int32_t len = 6;
  char *t = VLStrtok(locale(kDouble), s.data(), &len, "\x81\x40", -1, &next, 0);
  EXPECT_EQ(t, s.data());
  EXPECT_EQ(s, B("ab\0\0cd"));
  EXPECT_EQ(next, s.data() + 4);
  EXPECT_EQ(len, 2);

  // Shift-sensitive: the token and the rest report the states they begin in.
  std::string x = B("a\x0E\x45\x41\x0F" "b");
  len = 6;
  VLShiftState ts = 9, ns = 9;
  t = VLStrtokEx(locale(kShift), x.data(), 0, &len, "\x0E\x45\x41", 0, -1, &next, &ts, &ns, 0);
  EXPECT_EQ(t, x.data());
  EXPECT_EQ(ts, 0u);
  EXPECT_EQ(next, x.data() + 4);
  EXPECT_EQ(ns, 1u);
  EXPECT_EQ(len, 2);
  EXPECT_EQ(x, B("a\0\0\0\x0F" "b"));
  t = VLStrtokEx(locale(kShift), next, ns, &len, "\x0E\x45\x41", 0, -1, &next, &ts, &ns, 0);
  EXPECT_EQ(t, x.data() + 4);
  EXPECT_EQ(next, nullptr);
  EXPECT_EQ(len, 0);

  VLUChar u[] = {'a', ',', ',', 'b', 0};
  const VLUChar comma[] = {',', 0};
  VLUChar *un = nullptr;
  len = -1;
  EXPECT_EQ(VLStrtokU(nullptr, u, &len, comma, -1, &un), u);
  EXPECT_EQ(un, u + 2);
  EXPECT_EQ(VLStrtokU(nullptr, un, &len, comma, -1, &un), u + 3);
  EXPECT_EQ(un, nullptr);
  EXPECT_EQ(VLStrtok(locale(kSingle), s.data(), &len, ",", -1, &next, 0x1), nullptr);
  EXPECT_EQ(locale(kSingle)->lastError, 2);
}

}  // namespace
