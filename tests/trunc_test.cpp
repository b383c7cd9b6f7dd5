// Truncation and the small length members in single-byte, double-byte and
// shift-sensitive pages.
#include <string>
#include <vector>

#include "genloc.h"

using gents::B;

namespace {

class Truncate : public gents::GenLocales {};

constexpr uint32_t kTrim = VL_TRUNC_BLANKS, kTrimFw = VL_TRUNC_BLANKS | VL_CMP_NOWIDTH;

TEST_F(Truncate, CutsOnCharactersAndDropsBlanks) {
  struct Case {
    const char *what;
    VLLocale *Truncate::*loc;
    std::string in;
    VLShiftState state;
    int32_t len;
    uint32_t options;
    int32_t result;
    std::string out;
  } cases[] = {
      {"a string that fits is left alone", &Truncate::sb_, "abc", 0, 10, 0, 0, "abc"},
      {"trailing blanks go", &Truncate::sb_, "abc  ", 0, 10, kTrim, 4, "abc"},
      {"the cut leaves room for the 0", &Truncate::sb_, "abcdef", 0, 4, 0, 4, "abc"},
      {"blanks before the cut go too", &Truncate::sb_, "ab  cd", 0, 5, kTrim, 3, "ab"},
      {"a string of blanks empties", &Truncate::sb_, "   ", 0, 10, kTrim, 1, ""},
      {"length 0 empties", &Truncate::sb_, "abc", 0, 0, 0, 1, ""},
      {"a negative length empties", &Truncate::sb_, "abc", 0, -5, kTrim, 1, ""},
      {"lengths in characters", &Truncate::sb_, "abcdef", 0, 3, VL_OPT_CHARLEN, 3, "ab"},
      {"single-byte pages keep a letter after blanks", &Truncate::sb_, "ab  c", 0, 10, kTrim, 6, "ab  c"},
      {"a double-byte character that does not fit goes", &Truncate::mb_, B("ab\x88\xEA" "c", 5), 0, 4, 0, 3, "ab"},
      {"one that fits stays", &Truncate::mb_, B("ab\x88\xEA" "c", 5), 0, 5, 0, 5, B("ab\x88\xEA", 4)},
      {"a lead byte before the 0 is no character", &Truncate::mb_, B("ab\x88", 3), 0, 10, kTrim, 3, "ab"},
      {"full-width blanks go when asked", &Truncate::mb_, B("ab\x81\x40 ", 5), 0, 10, kTrimFw, 3, "ab"},
      {"and stay otherwise", &Truncate::mb_, B("ab\x81\x40 ", 5), 0, 10, kTrim, 5, B("ab\x81\x40", 4)},
      {"a letter after blanks before the end goes with them", &Truncate::mb_, "ab  c", 0, 10, kTrim, 3, "ab"},
      {"two letters after blanks stay", &Truncate::mb_, "ab  cd", 0, 10, kTrim, 7, "ab  cd"},
      {"a blank at the start opens no run, so the next one does", &Truncate::mb_, "  ", 0, 10, kTrim, 2, " "},
      {"characters counted", &Truncate::mb_, B("\x88\xEA\x88\xEA\x88\xEA", 6), 0, 2, VL_OPT_CHARLEN, 2,
       B("\x88\xEA", 2)},
      {"no room for the Shift-In gives up a character", &Truncate::sh_, B("\x0E\x45\x41\x45\x42\x0F", 6), 0, 4, 0,
       1, ""},
      {"room for it closes the run", &Truncate::sh_, B("\x0E\x45\x41\x45\x42\x0F", 6), 0, 5, 0, 5,
       B("\x0E\x45\x41\x0F", 4)},
      {"a closed string that fits is left alone", &Truncate::sh_, B("\x0E\x45\x41\x0F", 4), 0, 10, 0, 0,
       B("\x0E\x45\x41\x0F", 4)},
      {"a cut right after Shift-Out drops it", &Truncate::sh_, B("a\x0E\x45\x41", 4), 0, 2, 0, 2, "a"},
      {"double-byte blanks go, closed by Shift-In", &Truncate::sh_, B("\x0E\x45\x41\x40\x40\x0F", 6), 0, 10,
       kTrimFw, 5, B("\x0E\x45\x41\x0F", 4)},
      {"a run of them after Shift-Out drops it", &Truncate::sh_, B("a\x0E\x40\x40\x0F", 5), 0, 10, kTrimFw, 2, "a"},
      {"single-byte blanks after the run", &Truncate::sh_, B("\x0E\x45\x41\x0F\x40\x40", 6), 0, 10, kTrim, 5,
       B("\x0E\x45\x41\x0F", 4)},
      {"0x40 inside the run is a character, not a blank", &Truncate::sh_, B("a\x0E\x40\x41\x0F", 5), 0, 10, kTrim,
       6, B("a\x0E\x40\x41\x0F", 5)},
      {"starting in the double-byte state", &Truncate::sh_, B("\x45\x41\x45\x42", 4), 1, 4, 0, 4,
       B("\x45\x41\x0F", 3)},
      {"and without room there", &Truncate::sh_, B("\x45\x41\x45\x42", 4), 1, 3, 0, 1, ""},
      {"characters counted past the shift bytes", &Truncate::sh_, B("\x0E\x45\x41\x45\x42\x0F", 6), 0, 2,
       VL_OPT_CHARLEN, 2, B("\x0E\x45\x41\x0F", 4)},
  };
  for (const Case &c : cases) {
    std::string buf = c.in + std::string(1, '\0') + "########";
    VLLocale *l = this->*c.loc;
    int32_t r = l == sh_ ? VLTruncateStringEx(l, buf.data(), c.state, c.len, c.options)
                         : VLTruncateString(l, buf.data(), c.len, c.options);
    EXPECT_EQ(r, c.result) << c.what;
    EXPECT_EQ(std::string(buf.c_str()), c.out) << c.what;
    EXPECT_EQ(VLGetError(l), 0) << c.what;
  }
}

// The plain member on a shift-sensitive page and the Ex member on others agree with
// the page's own rules.
TEST_F(Truncate, EachMemberHandsOverToThePagesOwn) {
  std::string a = "ab  c", b = a;
  EXPECT_EQ(VLTruncateStringEx(mb_, a.data(), 0, 10, kTrim), VLTruncateString(mb_, b.data(), 10, kTrim));
  EXPECT_EQ(a.c_str(), std::string("ab"));
}

TEST_F(Truncate, TerminatesInTheState) {
  struct Case {
    const char *what;
    VLLocale *Truncate::*loc;
    VLShiftState state;
    uint32_t options;
    int32_t result;
    std::string out;
  } cases[] = {
      {"Shift-In and 0", &Truncate::sh_, 1, VL_OPT_NULLTERM, 2, B("\x0F\0", 2)},
      {"Shift-In alone", &Truncate::sh_, 1, 0, 1, "\x0F"},
      {"the 0 alone in the single-byte state", &Truncate::sh_, 0, VL_OPT_NULLTERM, 1, B("\0", 1)},
      {"nothing to do", &Truncate::sh_, 0, 0, 0, ""},
      {"no Shift-In outside shift pages", &Truncate::mb_, 1, VL_OPT_NULLTERM, 1, B("\0", 1)},
  };
  for (const Case &c : cases) {
    char buf[4] = {'#', '#', '#', '#'};
    EXPECT_EQ(VLTerminateStringEx(this->*c.loc, buf, c.state, c.options), c.result) << c.what;
    EXPECT_EQ(std::string(buf, c.out.size()), c.out) << c.what;
    EXPECT_EQ(buf[c.out.size()], '#') << c.what;
  }
  char buf[2] = {'#', '#'};
  EXPECT_EQ(VLTerminateStringEx(sh_, buf, 1, 0x1), -1);
  EXPECT_EQ(VLGetError(sh_), 2);
  EXPECT_EQ(buf[0], '#');
}

TEST(Lengths, OfValuesUnitsAndCharacters) {
  struct {
    VLWChar w;
    int32_t n;
  } bytes[] = {{0, 1}, {0x41, 1}, {0x8140, 2}, {0x8f8140, 3}, {0x10000, 3}, {0x01000000, 4}, {0xFFFFFFFF, 4}};
  for (auto c : bytes) EXPECT_EQ(VLStrByteLength(c.w), c.n) << std::hex << c.w;
  const VLWChar w[] = {0x8140, 0x41, 0, 7};
  const VLUChar u[] = {0xFF21, 0};
  EXPECT_EQ(VLWcslen(nullptr, w, 0), 2);
  EXPECT_EQ(VLStrlenU(nullptr, u, 0), 1);
  EXPECT_EQ(VLWcslen(nullptr, nullptr, 0), 0);
}

}  // namespace
