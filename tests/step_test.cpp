// Stepping, measuring, classification and line ends over the four kinds of code page.
#include <gtest/gtest.h>

#include <fstream>
#include <vector>

#include "step_pages.h"

using namespace stepts;

namespace {

struct WalkCase {
  Kind kind;
  std::string text;
  std::vector<int> starts;  // character starts, then the end
  std::vector<VLShiftState> states;  // Ex only: the state at each start
};

// Forward and backward walks agree with the expected character starts, and the count
// of characters with the number of steps.
TEST(Step, WalksForwardAndBack) {
  const std::vector<WalkCase> cases = {
      {kSingle, B("ab\x81" "c"), {0, 1, 2, 3, 4}, {}},
      {kDouble, B("a\x81\x40" "b\x9F\xFC"), {0, 1, 3, 4, 6}, {}},
      {kUtf8, B("a\xC3\xA9\xE2\x82\xAC" "z"), {0, 1, 3, 6, 7}, {}},
      {kShift, B("a\x0E\x45\x41\x45\x42\x0F" "b"), {0, 2, 4, 7, 8}, {0, 1, 1, 0, 0}},
  };
  for (const WalkCase &c : cases) {
    SCOPED_TRACE(c.kind);
    VLLocale *l = locale(c.kind);
    const char *s = c.text.data();
    const bool ex = !c.states.empty();
    const int n = static_cast<int>(c.text.size());
    for (size_t i = 0; i + 1 < c.starts.size(); ++i) {
      VLShiftState st = 9;
      const char *next = ex ? VLNextCharEx(l, s + c.starts[i], c.states[i], &st) : VLNextChar(l, s + c.starts[i]);
      EXPECT_EQ(next - s, c.starts[i + 1]) << "forward from " << c.starts[i];
      if (ex) {
        EXPECT_EQ(st, c.states[i + 1]);
      }
      const char *prev = ex ? VLPrevCharEx(l, s, s + c.starts[i + 1], c.states[i + 1], &st)
                            : VLPrevChar(l, s, s + c.starts[i + 1]);
      EXPECT_EQ(prev - s, c.starts[i]) << "back from " << c.starts[i + 1];
      if (ex) {
        EXPECT_EQ(st, c.states[i]);
      }
    }
    const int chars = static_cast<int>(c.starts.size()) - 1;
    EXPECT_EQ(ex ? VLNumCharsEx(l, s, 0, n) : VLNumChars(l, s, n), chars);
    EXPECT_EQ(l->lastError, 0);
  }
}

TEST(Step, ShiftBytesAroundOneCharacter) {
  VLLocale *l = locale(kShift);
  const std::string s = B("\x0E\x45\x41\x0F" "a");
  VLShiftState st = 7;
  EXPECT_EQ(VLNextCharEx(l, s.data(), 0, &st), s.data() + 4);
  EXPECT_EQ(st, 0u);
  EXPECT_EQ(VLByteLengthEx(l, s.data(), 0), 2);      // Shift-Out announces a double-byte char
  EXPECT_EQ(VLByteLengthEx(l, s.data() + 3, 1), 1);  // Shift-In a single-byte one
  EXPECT_EQ(VLGetCharEx(l, s.data(), 0), 0x4541u);
  EXPECT_EQ(VLGetCharEx(l, s.data() + 3, 1), 0x61u);
}

TEST(Step, CountsStopAtPartialCharacters) {
  struct Case {
    Kind kind;
    std::string text;
    int length;
    VLShiftState state;
    int chars;
  };
  const std::vector<Case> cases = {
      {kDouble, B("a\x81"), 2, 0, 1},
      {kDouble, B("a\x81\x40"), -1, 0, 2},
      {kUtf8, B("\xE2\x82"), 2, 0, 0},
      {kSingle, B("abc"), -1, 0, 3},
      {kShift, B("\x0E\x45\x41\x45"), 4, 0, 1},
      {kShift, B("\x45\x41\x0F"), 3, 1, 1},
      {kShift, B("\x0E"), 1, 0, 0},
      {kShift, B("ab"), 0, 0, 0},
  };
  for (const Case &c : cases)
    EXPECT_EQ(VLNumCharsEx(locale(c.kind), c.text.data(), c.state, c.length), c.chars) << c.kind << " " << c.length;
}

TEST(Step, SingleBytePrevCharDoesNotCheckTheStart) {
  const char buf[] = "xab";
  const char *s = buf + 1;
  EXPECT_EQ(VLPrevChar(locale(kSingle), s, s), buf);
  EXPECT_EQ(VLPrevChar(locale(kDouble), s, s), s);
}

TEST(Step, MovesToTheCharacterHoldingTheTarget) {
  struct Case {
    Kind kind;
    std::string text;
    int count;
    uint32_t options;
    int at;
    VLShiftState state;  // Ex only
  };
  const std::string sh = B("a\x0E\x45\x41\x45\x42\x0F" "b");
  const std::vector<Case> cases = {
      {kSingle, "abcd", 3, 0, 3, 0},
      {kDouble, B("a\x81\x40" "b"), 2, 0, 1, 0},
      {kDouble, B("a\x81\x40" "b"), 3, 0, 3, 0},
      {kDouble, B("a\x81\x40" "b"), 2, VL_OPT_CHARLEN, 3, 0},
      {kDouble, B("a\x81\x40" "b"), 0, 0, 0, 0},
      {kShift, sh, 1, 0, 1, 0},  // the target is Shift-Out itself
      {kShift, sh, 3, 0, 2, 1},
      {kShift, sh, 2, VL_OPT_CHARLEN, 4, 1},
      {kShift, sh, 7, 0, 7, 0},
  };
  for (const Case &c : cases) {
    VLLocale *l = locale(c.kind);
    VLShiftState st = 9;
    const char *p = c.kind == kShift ? VLMoveStringPointerEx(l, c.text.data(), 0, c.count, &st, c.options)
                                     : VLMoveStringPointer(l, c.text.data(), c.count, c.options);
    EXPECT_EQ(p - c.text.data(), c.at) << c.kind << " count " << c.count;
    if (c.kind == kShift) {
      EXPECT_EQ(st, c.state) << "count " << c.count;
    }
  }
  EXPECT_EQ(VLMoveStringPointer(locale(kDouble), "ab", 1, 0x1), nullptr);
  EXPECT_EQ(locale(kDouble)->lastError, 2);
}

TEST(Step, ReadsAndWritesCharacters) {
  EXPECT_EQ(VLGetChar(locale(kDouble), "\x81\x40"), 0x8140u);
  EXPECT_EQ(VLGetChar(locale(kUtf8), "\xE2\x82\xAC"), 0xE282ACu);
  EXPECT_EQ(VLGetChar(locale(kSingle), "\x81\x40"), 0x81u);

  struct Case {
    VLShiftState state;
    VLWChar value;
    int result;
    std::string bytes;
  };
  const std::vector<Case> cases = {
      {0, 0x4142, 2, B("\x0E\x41\x42")},  // Shift-Out written, not counted
      {1, 0x41, 1, B("\x0F\x41")},
      {1, 0x4142, 2, B("\x41\x42")},
      {0, 0x41, 1, B("\x41")},
  };
  for (const Case &c : cases) {
    char out[8] = {};
    EXPECT_EQ(VLPutCharEx(locale(kShift), out, c.state, c.value), c.result);
    EXPECT_EQ(std::string(out, c.bytes.size()), c.bytes);
  }
  char out[8] = {};
  EXPECT_EQ(VLPutChar(locale(kDouble), out, 0x8140), 2);
  EXPECT_EQ(std::string(out, 2), B("\x81\x40"));
  for (auto [v, n] : {std::pair<VLWChar, int>{0x41, 1}, {0x8140, 2}, {0xE282AC, 3}, {0x01000000, 4}})
    EXPECT_EQ(VLByteLengthW(nullptr, v), n);
}

TEST(Step, ValidCharCountsBytesBeforeAZero) {
  EXPECT_EQ(VLValidChar(locale(kDouble), "\x81"), 1);
  EXPECT_EQ(VLValidChar(locale(kDouble), "\x81\x40"), 2);
  EXPECT_EQ(VLValidChar(locale(kDouble), ""), 0);
  EXPECT_EQ(VLValidChar(locale(kUtf8), "\xE2\x82"), 2);
  EXPECT_EQ(VLValidCharEx(locale(kShift), "\x45\x41", 1), 2);
  EXPECT_EQ(VLValidCharEx(locale(kShift), "\x45", 1), 1);
  EXPECT_EQ(VLValidCharEx(locale(kShift), "\x45\x41", 0), 1);
}

TEST(Step, ClassifiesThroughTheRightTable) {
  struct Case {
    uint32_t got;
    uint32_t want;
  };
  VLLocale *sb = locale(kSingle), *db = locale(kDouble), *sh = locale(kShift);
  const std::vector<Case> cases = {
      {VLGetCharType(sb, "A", VL_CT_TYPE1), 0x213},
      {VLGetCharType(sb, "A", VL_CT_TYPE2), 0x002},
      {VLGetCharType(sb, "A", VL_CT_TYPE3), 0x040},
      {VLGetCharType(db, "A", VL_CT_TYPE1), 0x213},
      {VLGetCharType(db, "\x81\x40", VL_CT_TYPE3), 0x100},
      {VLGetCharTypeEx(sh, "\x0E\x45\x41", 0, VL_CT_TYPE3), 0x100},
      {VLGetCharTypeEx(sh, "\x0F\xC1", 1, VL_CT_TYPE1), 0x213},
      {VLGetCharTypeEx(sh, "\xC1", 0, VL_CT_TYPE1), 0x213},
      {VLGetCharTypeW(db, 0x8140, VL_CT_TYPE3), 0x100},
      {VLGetCharTypeW(db, 'A', VL_CT_TYPE2), 0x002},
      {VLGetCharTypeU(nullptr, 0x41, VL_CT_TYPE1), 0x213},
      {VLGetCharTypeU(nullptr, 0x41, VL_CT_TYPE3), 0x040},
      {VLGetCharTypeU(nullptr, 0x4E00, VL_CT_TYPE3), 0x100},
      {VLGetCharTypeU(nullptr, 0xAC00, VL_CT_TYPE2), 0x002},
      {VLGetCharTypeU(nullptr, 0x06FA, VL_CT_TYPE2), 0x001},
      {VLGetCharTypeU(nullptr, 0x2212, VL_CT_TYPE2), 0x020},
      {VLGetCharTypeU(nullptr, 0x2200, VL_CT_TYPE3), 0x008},
      {VLGetCharTypeU(nullptr, 0xFBD3, VL_CT_TYPE2), 0x004},
      {VLGetCharTypeU(nullptr, 0xFBE9, VL_CT_TYPE2), 0x001},
      {VLGetCharTypeU(nullptr, 0xFF21, VL_CT_TYPE3), 0x080},  // full-width A, from the last table
  };
  for (size_t i = 0; i < cases.size(); ++i) EXPECT_EQ(cases[i].got, cases[i].want) << "case " << i;
  EXPECT_EQ(VLGetCharType(sb, "A", 0), 0x213u);
  EXPECT_EQ(sb->lastError, 2);
  EXPECT_EQ(VLGetCharType(sb, "A", VL_CT_TYPE1), 0x213u);
  EXPECT_EQ(sb->lastError, 0);
}

TEST(Step, FindsLineEnds) {
  struct Case {
    Kind kind;
    std::string text;
    uint32_t options;
    uint32_t kind_;
    int eolLen;
    int after;  // -1: null
    int rc;
    int length = -2;  // -2: the whole text
  };
  const std::vector<Case> cases = {
      {kSingle, "ab\rx", VL_EOL_CRLF, VL_EOL_NOTFOUND, 0, -1, 0},
      {kSingle, "a\r\n", VL_EOL_CRLF, VL_EOL_NOTFOUND, 0, -1, 0, 2},  // the line feed lies beyond
      {kSingle, "\r\n", VL_EOL_LF | VL_EOL_CRLF, VL_EOL_CRLF, 2, 2, 0},
      {kSingle, "\r\n", VL_EOL_LF, VL_EOL_LF, 1, 2, 0},
      {kSingle, "ab\nc", 0, VL_EOL_LF, 1, 3, 0},
      {kSingle, "a\r\rb\r\n", VL_EOL_CRLF, VL_EOL_CRLF, 2, 6, 0},
      {kSingle, "a\x1E" "b\x1F", VL_EOL_PS, VL_EOL_PS, 1, 4, 0},
      {kSingle, "a\x1E" "b", VL_EOL_LS | VL_EOL_PS, VL_EOL_LS, 1, 2, 0},
      {kSingle, "a\nb", 0x0F00 | 0x1, VL_EOL_LF, 1, 2, 0},
      {kSingle, "a\nb", 0x0300 | 0x1000, VL_EOL_BADOPTION, 0, -1, 2},
      {kDouble, B("\x81\x0A\n"), VL_EOL_LF, VL_EOL_LF, 1, 3, 0},  // a trail byte is no line feed
      {kShift, B("\x0E\x45\x25\x0F\x25"), VL_EOL_LF, VL_EOL_LF, 1, 5, 0},
      // The character-count bit is taken whatever the length.
      {kSingle, "ab\ncd", VL_EOL_LF | VL_OPT_CHARLEN, VL_EOL_LF, 1, 3, 0, -1},
      {kSingle, "ab\ncd", VL_EOL_LF | VL_OPT_CHARLEN, VL_EOL_NOTFOUND, 0, -1, 0, 0},
      {kShift, B("\x0E\x45\x25\x0F\x25"), VL_EOL_LF | VL_OPT_CHARLEN, VL_EOL_LF, 1, 5, 0, -1},
  };
  for (const Case &c : cases) {
    VLLocale *l = locale(c.kind);
    uint32_t kind = 0;
    int32_t len = -5;
    VLShiftState st = 9;
    const char *s = c.text.data();
    const int32_t n = c.length == -2 ? static_cast<int32_t>(c.text.size()) : c.length;
    const char *p = c.kind == kShift ? VLGetEolEx(l, s, 0, n, &kind, &len, &st, c.options)
                                     : VLGetEol(l, s, n, &kind, &len, c.options);
    SCOPED_TRACE(c.text);
    EXPECT_EQ(kind, c.kind_);
    EXPECT_EQ(len, c.eolLen);
    EXPECT_EQ(p ? p - s : -1, c.after);
    EXPECT_EQ(l->lastError, c.rc);
    if (c.kind == kShift) {
      EXPECT_EQ(st, 0u);
    }
  }
  const VLUChar u[] = {'a', 'b', 0x2028, 'c', 0};
  uint32_t kind = 0;
  int32_t len = 0;
  EXPECT_EQ(VLGetEolU(nullptr, u, -1, &kind, &len, VL_EOL_LS), u + 3);
  EXPECT_EQ(VLGetEolU(nullptr, u, -1, &kind, &len, VL_EOL_PS), nullptr);
  EXPECT_EQ(kind, VL_EOL_NOTFOUND);
  const VLWChar w[] = {0x41, 0x810A, 0x0A, 0};
  EXPECT_EQ(VLGetEolW(locale(kDouble), w, -1, &kind, &len, 0), w + 3);
}

TEST(Step, WritesLineEnds) {
  struct Case {
    uint32_t options;
    std::string bytes;  // nothing written and null when empty
  };
  const std::vector<Case> cases = {
      {0, "\n"},
      {VL_EOL_DEFAULT, "\n"},
      {VL_EOL_PS | VL_EOL_CRLF, "\x1F\r\n"},
      {0x0F00, "\x1F\x1E\n\r\n"},
      {0x2000, ""},
      {VL_EOL_LF | 0x1, ""},
  };
  VLLocale *l = locale(kSingle);
  for (const Case &c : cases) {
    char out[8] = {};
    char *end = VLPutEol(l, out, c.options);
    if (c.bytes.empty()) {
      EXPECT_EQ(end, nullptr);
      EXPECT_EQ(l->lastError, 2);
    } else {
      ASSERT_NE(end, nullptr);
      EXPECT_EQ(std::string(out, end), c.bytes);
    }
  }
  VLUChar u[8];
  VLUChar *ue = VLPutEolU(nullptr, u, 0x0F00);
  EXPECT_EQ(std::u16string(u, ue), u"\n\u2028\u2029\r\n");
  VLWChar w[8];
  VLWChar *we = VLPutEolW(l, w, VL_EOL_CRLF | VL_EOL_LS);
  EXPECT_EQ(std::vector<VLWChar>(w, we), (std::vector<VLWChar>{0x1E, 0x0D, 0x0A}));
  char out[8] = {};
  VLShiftState st = 1;
  char *end = VLPutEolEx(locale(kShift), out, 1, &st, 0);
  EXPECT_EQ(std::string(out, end), B("\x0F\x25"));
  EXPECT_EQ(st, 0u);
}

}  // namespace

// On the generated definitions, stepping meets the converter character for character,
// and the code page's type words agree with the Unicode tables.
TEST(Step, GeneratedPagesAgreeWithUnicode) {
  if (!std::ifstream(std::string(VL_TEST_DEFS_DIR) + "/control.nls")) GTEST_SKIP() << "no generated definitions";
  ASSERT_EQ(VLInit(VL_TEST_DEFS_DIR, nullptr, nullptr, 0, VL_OPT_NOBUILTIN), 0u);
  const std::vector<std::pair<const char *, std::string>> cases = {
      {"English_UnitedStates.UTF-8", B("a\xC3\xA9\xE2\x82\xAC" "1 \xE3\x81\x82")},
      {"English_UnitedStates.MS932", B("A\x82\xA0\x82\x60\xB1" "9")},
      {"English_UnitedStates.IBM930", B("\xC1\x0E\x40\x40\x0F\xF1")},
      {"English_UnitedStates.Latin1", B("A\xE9\xD7" "5")},
  };
  for (const auto &[name, text] : cases) {
    SCOPED_TRACE(name);
    uint32_t rc = 0;
    VLLocale *l = VLGetLocale(name, 0, &rc);
    ASSERT_NE(l, nullptr) << rc;
    VLUChar units[32];
    int32_t n = VLCpStrToUnicode(l->codePage, reinterpret_cast<const unsigned char *>(text.data()), static_cast<int32_t>(text.size()), units);
    EXPECT_EQ(VLNumCharsEx(l, text.data(), 0, static_cast<int32_t>(text.size())), n);
    const char *p = text.data();
    VLShiftState st = 0;
    for (int32_t i = 0; i < n; ++i) {
      for (uint32_t sel : {VL_CT_TYPE1, VL_CT_TYPE2, VL_CT_TYPE3})
        EXPECT_EQ(VLGetCharTypeEx(l, p, st, sel), VLGetCharTypeU(l, units[i], sel)) << "unit " << std::hex << units[i];
      p = VLNextCharEx(l, p, st, &st);
    }
    EXPECT_EQ(p, text.data() + text.size());
    VLReleaseLocale(l);
  }
  VLTerm();
}
