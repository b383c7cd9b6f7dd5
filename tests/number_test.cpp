// Numbers and money: the grouping, overflow, radix and reader rules as tables, every
// generated territory round-tripped in the six code pages of its family and all four
// forms, short buffers, hostile input, and the C library's printf and strfmon as oracles.
#include <gtest/gtest.h>

#include <clocale>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <functional>
#include <memory>
#include <monetary.h>
#include <random>
#include <string>
#include <vector>

#include "store/store.h"
#include "support/defdir.h"
#include "support/gendefs.h"

namespace {

const char *const kPages[] = {"Latin1", "MS1252", "UTF-8", "MS932", "IBM930", "IBM037"};

class Num : public ts::DefsTest {
 protected:
  // An English locale with the separators and grouping of the rule tables.
  VLLocale *ruled(const char *grouping = "3;0", const char *group = ",", const char *decimal = ".") {
    VLLocale *l = loc("English_UnitedStates.Latin1");
    EXPECT_EQ(VLSetLocaleTextInfo(l, 60, "x", 1, 0), 1);  // out of the way of the next two
    EXPECT_EQ(VLSetLocaleTextInfo(l, 59, decimal, 1, 0), 1);
    EXPECT_EQ(VLSetLocaleTextInfo(l, 60, group, 1, 0), 1);
    EXPECT_EQ(VLSetLocaleTextInfo(l, 62, grouping, -1, 0), 1);
    return l;
  }
};

std::string fmtLong(VLLocale *l, int32_t v, uint32_t opts = 0, int32_t size = 64) {
  char b[64];
  int32_t n = VLLongToString(l, v, b, size, opts);
  return n < 0 ? "<-1>" : std::string(b, static_cast<size_t>(n));
}
std::string fmtDouble(VLLocale *l, double v, uint32_t opts = 0) {
  char b[600];
  int32_t n = VLDoubleToString(l, v, b, sizeof b, opts);
  return n < 0 ? "<-1>" : std::string(b, static_cast<size_t>(n));
}
std::string fmtMoney(VLLocale *l, double v, uint32_t opts = 0, int32_t size = 128) {
  char b[128];
  int32_t n = VLCurrencyToString(l, b, size, opts, v);
  return n < 0 ? "<-1>" : std::string(b, static_cast<size_t>(n));
}
std::u16string unicode(VLLocale *l, const std::string &s, VLShiftState state = 0) {
  VLUChar u[600];
  int32_t n = VLStringToUnicodeEx(u, 600, l, s.data(), state, static_cast<int32_t>(s.size()), 0);
  return n < 0 ? u"<bad>" : std::u16string(reinterpret_cast<char16_t *>(u), static_cast<size_t>(n));
}

// ---- Integers ---------------------------------------------------------------------------

TEST_F(Num, IntegersAreGroupedAsTheGroupingTextSays) {
  struct Row {
    const char *grouping;
    int32_t value;
    uint32_t options;
    const char *text;
  } rows[] = {
      {"3", 1234567, 0, "1234,567"},                // the list ends: no more separators
      {"3;0", 1234567, 0, "1,234,567"},             // 0 repeats the size before it
      {"3;2;0", 1234567, 0, "12,34,567"},
      {"3;2", 123456789, 0, "1234,56,789"},
      {"3;0", 999, 0, "999"},                       // no separator in front
      {"3;0", -123456, 0, "-123,456"},
      {"3;0", -5, VL_NUM_UNSIGNED, "4,294,967,291"},
      {"3;0", INT32_MIN, 0, "-2,147,483,648"},
      {"0", 1234567, 0, "1234567"},
      {"1;0", 1234, 0, "1,2,3,4"},
      {"3;x", 1234567, 0, "1234,567"},              // a malformed size ends grouping
      {"3;0", 0, 0, "0"},
  };
  for (const Row &r : rows) {
    VLLocale *l = ruled(r.grouping);
    EXPECT_EQ(fmtLong(l, r.value, r.options), r.text) << "grouping '" << r.grouping << "' value " << r.value;
    EXPECT_EQ(VLGetError(l), 0);
  }
}

TEST_F(Num, GroupingSizesAreWalkedOneByOne) {
  VLLocale *l = loc("English_UnitedStates.Latin1");
  char g[] = "3;12;0";
  int32_t rest = 6;
  char *next = g;
  std::vector<int32_t> sizes;
  for (int i = 0; i < 5 && next; ++i) sizes.push_back(VLStrGroupingSize(l, next, &rest, &next));
  EXPECT_EQ(sizes, (std::vector<int32_t>{3, 12, 0}));
  EXPECT_EQ(next, nullptr);
  EXPECT_EQ(rest, 0);
  for (const char *bad : {"", ";3", "a", "3a"}) {
    rest = -1;
    EXPECT_EQ(VLStrGroupingSize(l, bad, &rest, &next), -1) << "'" << bad << "'";
  }
  rest = 5;
  EXPECT_EQ(VLStrGroupingSize(l, nullptr, &rest, &next), -1);
  // EBCDIC digits and separator in the wide form of an EBCDIC page.
  VLLocale *e = loc("English_UnitedStates.IBM037");
  VLWChar w[] = {0xF3, 0x5E, 0xF2, 0};
  VLWChar *wn = w;
  rest = -1;
  EXPECT_EQ(VLStrGroupingSizeW(e, wn, &rest, &wn), 3);
  EXPECT_EQ(VLStrGroupingSizeW(e, wn, &rest, &wn), 2);
  EXPECT_EQ(wn, nullptr);
}

struct ParseRow {
  const char *text;
  int32_t radix;
  uint32_t options;
  int32_t value;
  int32_t used;  // units read
  const char *why;
};

TEST_F(Num, IntegersAreReadWithTheRadixAndOverflowRules) {
  const ParseRow rows[] = {
      {"2147483647", 10, 0, INT32_MAX, 10, "the largest signed value"},
      {"2147483648", 10, 0, INT32_MAX, 10, "signed overflow at once above 0x7FFFFFFF"},
      {"-2147483648", 10, 0, INT32_MIN, 11, "the smallest signed value"},
      {"-2147483649", 10, 0, INT32_MIN, 11, "negative overflow"},
      {"4294967296", 10, 0, 0, 10, "wraps to 0 below the limit: the check comes one digit late"},
      {"4294967296", 10, VL_NUM_UNSIGNED, 0, 10, "the same unsigned"},
      {"4294967295", 10, VL_NUM_UNSIGNED, -1, 10, "the largest unsigned value marks but does not overflow"},
      {"42949672950", 10, VL_NUM_UNSIGNED, -1, 11, "a digit after the mark overflows"},
      {"4294967300", 10, VL_NUM_UNSIGNED, -1, 10, "reaching the limit before the last digit"},
      {"99999999999999999999", 10, 0, INT32_MAX, 20, "every digit is read past an overflow"},
      {"-5", 10, VL_NUM_UNSIGNED, 0, 0, "a minus sign ends an unsigned number"},
      {"0x1F", 0, 0, 31, 4, "radix 0 takes 0x as hexadecimal"},
      {"0X1f", 16, 0, 31, 4, "radix 16 skips 0X"},
      {"017", 0, 0, 15, 3, "radix 0 takes a leading 0 as octal"},
      {"019", 0, 0, 1, 2, "9 is no octal digit"},
      {"0x", 0, 0, 0, 1, "0x without a hexadecimal digit is the 0"},
      {"0xg", 16, 0, 0, 1, "the same in radix 16"},
      {"12", 0, 0, 12, 2, "radix 0 takes anything else as decimal"},
      {"zZ", 36, 0, 35 * 36 + 35, 2, "letters of either case up to radix 36"},
      {"FFFFFFFF", 16, VL_NUM_UNSIGNED, -1, 8, "the largest unsigned value in hexadecimal"},
      {"100000000", 16, VL_NUM_UNSIGNED, -1, 9, "one hexadecimal digit too many"},
      {"1,234", 10, 0, 1234, 5, "group separators between digits are skipped"},
      {"1,2,3", 10, 0, 123, 5, "their sizes are not checked"},
      {"12,,3", 10, 0, 12, 2, "two in a row end the number"},
      {"1,", 10, 0, 1, 1, "a trailing separator is left"},
      {",1", 10, 0, 0, 0, "a leading one is no number"},
      {"  +42", 10, 0, 42, 5, "a run of blanks is skipped once, then a sign"},
      {" - 4", 10, 0, 0, 0, "a blank after the sign ends before any digit"},
      {"+-4", 10, 0, 0, 0, "one sign only"},
      {"", 10, 0, 0, 0, "the empty text"},
      {"12.5", 10, 0, 12, 2, "a decimal separator ends an integer"},
      {"101", 2, 0, 5, 3, "radix 2"},
      {"1012", 2, 0, 5, 3, "a digit at or above the radix ends the number"},
  };
  VLLocale *l = ruled();
  for (const ParseRow &r : rows) {
    char *end = nullptr;
    const int32_t v = VLStringToLong(l, r.text, -1, &end, r.radix, r.options);
    EXPECT_EQ(v, r.value) << r.why << ": '" << r.text << "'";
    EXPECT_EQ(end - r.text, r.used) << r.why << ": '" << r.text << "'";
    EXPECT_EQ(VLGetError(l), 0) << r.why;
  }
}

TEST_F(Num, BadArgumentsGetTheirCodes) {
  VLLocale *l = ruled();
  char *end;
  char b[16];
  struct Row {
    const char *what;
    std::function<int32_t()> call;
    int32_t result;
    uint32_t rc;
  } rows[] = {
      {"radix 1", [&] { return VLStringToLong(l, "12", -1, &end, 1, 0); }, 0, VL_RC_RADIX},
      {"radix 37", [&] { return VLStringToLong(l, "12", -1, &end, 37, 0); }, 0, VL_RC_RADIX},
      {"an unknown reading option", [&] { return VLStringToLong(l, "12", -1, &end, 10, 0x2); }, 0, VL_RC_BADARG},
      {"an unknown writing option", [&] { return VLLongToString(l, 12, b, 16, 0x40); }, -1, VL_RC_BADARG},
      {"size 0", [&] { return VLLongToString(l, 12, b, 0, 0); }, 0, VL_RC_BUFFER},
      {"unsigned for a double", [&] { return VLDoubleToString(l, 1.5, b, 16, VL_NUM_UNSIGNED); }, -1, VL_RC_BADARG},
      {"a reading option for money", [&] { return VLCurrencyToString(l, b, 16, VL_NUM_MONEY, 1.5); }, -1,
       VL_RC_BADARG},
      {"size 0 in characters", [&] { return VLCurrencyToString(l, b, 0, VL_OPT_CHARLEN, 1.5); }, 0, VL_RC_BUFFER},
      {"one byte short", [&] { return VLLongToString(l, 12345, b, 5, 0); }, 5, VL_RC_BUFFER},
      {"room for the terminator", [&] { return VLLongToString(l, 1234, b, 6, VL_OPT_NULLTERM); }, 6, VL_RC_OK},
  };
  for (const Row &r : rows) {
    EXPECT_EQ(r.call(), r.result) << r.what;
    EXPECT_EQ(VLGetError(l), static_cast<int32_t>(r.rc)) << r.what;
  }
}

TEST_F(Num, TheTokenReaderClassifiesOneTokenAtATime) {
  VLLocale *l = ruled();
  char text[] = "  -1,2.zZ?";
  char *p = text;
  std::vector<int32_t> tokens;
  for (int i = 0; i < 12 && *p; ++i) {
    const int32_t t = VLStrGetDigit(l, &p, static_cast<int32_t>(std::strlen(p)), "+", "-", ",", ".", VL_DIGITS_ASCII, 0);
    tokens.push_back(t);
    if (t < 0) break;
  }
  EXPECT_EQ(tokens, (std::vector<int32_t>{VL_TOK_BLANK, VL_TOK_MINUS, 1, VL_TOK_GROUP, 2, VL_TOK_DECIMAL, 35, 35, -1}));
  EXPECT_EQ(p, text + 9);
  // EBCDIC: letters at their positions, and code page 930's lower case elsewhere.
  struct Row {
    int32_t table;
    unsigned char byte;
    int32_t token;
  } rows[] = {{VL_DIGITS_EBCDIC, 0xF7, 7},   {VL_DIGITS_EBCDIC, 0xC1, 10}, {VL_DIGITS_EBCDIC, 0x81, 10},
              {VL_DIGITS_EBCDIC930, 0x62, 10}, {VL_DIGITS_EBCDIC930, 0xB9, 35}, {VL_DIGITS_EBCDIC930, 0x81, -1},
              {VL_DIGITS_ASCII, 0xF7, -1}};
  for (const Row &r : rows) {
    char s[2] = {static_cast<char>(r.byte), 0};
    char *q = s;
    EXPECT_EQ(VLStrGetDigit(l, &q, 1, nullptr, nullptr, nullptr, nullptr, r.table, 0), r.token)
        << "table " << r.table << " byte " << int(r.byte);
  }
  for (int i = 0; i < 256; ++i) {
    EXPECT_EQ(VLAsciiToNum[i] >= 0, std::isalnum(i) != 0) << i;
    if (i >= 0xF0 && i <= 0xF9) {
      EXPECT_EQ(VLEbcdicToNum[i], i - 0xF0);
      EXPECT_EQ(VLEbcdic930ToNum[i], i - 0xF0);
    }
  }
  char *q = text;
  EXPECT_EQ(VLStrGetDigit(l, &q, 2, "+", "-", ",", ".", 1, 0x1), -1);
  EXPECT_EQ(VLGetError(l), static_cast<int32_t>(VL_RC_BADARG));
}

// Digits of other scripts: always in the U and W forms, with VL_NUM_DIGITS in the byte forms.
TEST_F(Num, DigitsOfAnyScript) {
  VLLocale *l = loc("Japanese_Japan.MS932");
  ASSERT_NE(l, nullptr);
  struct Row {
    std::u16string text;
    int32_t value;
  } rows[] = {
      {u"\uFF11\uFF12\uFF13", 123},        // full-width
      {u"\u0661\u0662", 12},                // Arabic-Indic
      {u"-\u0967,\u0968\u0969\u096A", -1234},  // Devanagari with a group separator
      {u"4\u0E52", 42},                      // Thai after an ASCII digit
  };
  for (const Row &r : rows) {
    const auto *u = reinterpret_cast<const VLUChar *>(r.text.data());
    const int32_t n = static_cast<int32_t>(r.text.size());
    VLUChar *ue;
    EXPECT_EQ(VLStringToLongU(l, u, n, &ue, 10, 0), r.value);
    EXPECT_EQ(ue, u + n);
    EXPECT_DOUBLE_EQ(VLStringToDoubleU(l, u, n, &ue, 0), r.value);
  }
  // Full-width digits in the code page: bytes 0x82 0x50 and on.
  char fw[] = "\x82\x50\x82\x51";
  char *end;
  EXPECT_EQ(VLStringToLong(l, fw, 4, &end, 10, 0), 0) << "not without the option";
  EXPECT_EQ(VLStringToLong(l, fw, 4, &end, 10, VL_NUM_DIGITS), 1 * 10 + 2);
  EXPECT_EQ(end, fw + 4);
  const VLWChar w[] = {0x8250, 0x8258, 0};
  VLWChar *we;
  EXPECT_EQ(VLStringToLongW(l, w, -1, &we, 10, 0), 19);
}

// ---- Floating point -------------------------------------------------------------------------

TEST_F(Num, DoublesAreCutToThePrecisionNotRounded) {
  struct Row {
    double value;
    int precision;
    const char *text;
    const char *why;
  } rows[] = {
      {1234.5678, 2, "1,234.56", "the third fraction digit is dropped"},
      {0.5, 0, "0.", "the separator stays with no fraction digits"},
      {2.9999996, 2, "3.00", "the six-digit conversion rounds first"},
      {-0.001, 2, "-0.00", "a negative value keeps its sign"},
      {1e6, 8, "1,000,000.00000000", "zeros past six digits"},
      {-1234567.25, 1, "-1,234,567.2", "grouped and cut"},
      {0, 3, "0.000", "zero"},
  };
  VLLocale *l = ruled();
  for (const Row &r : rows) {
    ASSERT_EQ(VLSetLocaleNumInfo(l, 63, r.precision, 0), 1);
    EXPECT_EQ(fmtDouble(l, r.value), r.text) << r.why;
  }
  EXPECT_EQ(fmtDouble(l, INFINITY), "inf");
  EXPECT_EQ(fmtDouble(l, -INFINITY), "-inf");
}

TEST_F(Num, DoublesAreReadByTheNineStates) {
  struct Row {
    const char *text;
    double value;
    int32_t used;
    const char *why;
  } rows[] = {
      {"1,234.5", 1234.5, 7, "group separators between integer digits"},
      {".5", 0.5, 2, "a decimal separator first"},
      {"-.25", -0.25, 4, "a sign, then the separator"},
      {"2.5E-3", 0.0025, 6, "an exponent with its sign"},
      {"2.5D2", 250, 5, "D stands for E"},
      {"2.5e+2", 250, 6, "either case"},
      {"1E5", 1, 1, "an exponent only after the decimal separator"},
      {"1.E5", 100000, 4, "directly after it"},
      {"- 5", 0, 1, "blanks only before the sign"},
      {"  7", 7, 3, "leading blanks"},
      {"1,,2", 1, 2, "never two group separators in a row"},
      {"1.5,3", 1.5, 3, "no group separator in the fraction"},
      {"1.5E", 1.5, 4, "the exponent letter is taken without digits"},
      {"x", 0, 0, "no number"},
  };
  VLLocale *l = ruled();
  for (const Row &r : rows) {
    char *end = nullptr;
    EXPECT_DOUBLE_EQ(VLStringToDouble(l, r.text, -1, &end, 0), r.value) << r.why << ": '" << r.text << "'";
    EXPECT_EQ(end - r.text, r.used) << r.why << ": '" << r.text << "'";
  }
  VLLocale *de = ruled("3;0", ".", ",");
  char *end;
  EXPECT_DOUBLE_EQ(VLStringToDouble(de, ",5", -1, &end, 0), 0.5);
  EXPECT_DOUBLE_EQ(VLStringToDouble(de, "1.234,5", -1, &end, 0), 1234.5);
  EXPECT_EQ(VLStringToDouble(de, "1", -1, &end, 0x80), 0);
  EXPECT_EQ(VLGetError(de), static_cast<int32_t>(VL_RC_BADARG));
}

TEST_F(Num, EveryRefusedStateAndTokenEndsTheNumber) {
  // The tokens each state takes; everything else is -1.
  const std::vector<std::vector<int32_t>> takes = {
      {0, 9, VL_TOK_BLANK, VL_TOK_PLUS, VL_TOK_MINUS, VL_TOK_DECIMAL},
      {0, 9, VL_TOK_DECIMAL},
      {0, 9},
      {0, 9, VL_TOK_GROUP, VL_TOK_DECIMAL},
      {0, 9},
      {0, 9, 13, 14},
      {0, 9, VL_TOK_PLUS, VL_TOK_MINUS},
      {0, 9},
      {0, 9},
  };
  for (int32_t st = -1; st <= 9; ++st) {
    for (int32_t tok = -1; tok <= 45; ++tok) {
      double v = 0;
      int32_t sign = 1, fe = 0, es = 1, ex = 0;
      const int32_t next = VLStrDoubleNextState(st, tok, &v, &sign, &fe, &es, &ex);
      bool taken = false;
      if (st >= 0 && st <= 8)
        for (int32_t t : takes[st]) taken |= t == tok || (t == 0 && tok >= 0 && tok <= 9);
      EXPECT_EQ(next >= 0, taken) << "state " << st << " token " << tok;
    }
  }
  double v = 0;
  int32_t sign = 1, fe = 0, es = 1, ex = 0;
  EXPECT_EQ(VLStrDoubleNextState(0, 1, nullptr, &sign, &fe, &es, &ex), -1);
  EXPECT_EQ(VLStrDoubleNextState(2, 5, &v, &sign, &fe, &es, &ex), 5);
  EXPECT_EQ(fe, -1);
  EXPECT_DOUBLE_EQ(v, 0.5);
}

// ---- Money ----------------------------------------------------------------------------------

TEST_F(Num, SignPositionsPlaceSignSymbolAndBlank) {
  struct Row {
    double amount;
    int position, precedes, blank;
    const char *text;
  } rows[] = {
      {1234.567, 1, 1, 1, "$ 1,234.56"},  // the third digit dropped, not rounded
      {-1234.5, 0, 1, 0, "($1,234.50)"},
      {-1234.5, 0, 0, 1, "(1,234.50 $)"},
      {-1.5, 1, 1, 0, "-$1.50"},
      {-1.5, 1, 0, 1, "-1.50 $"},
      {-1.5, 2, 1, 1, "$ 1.50-"},
      {-1.5, 2, 0, 1, "1.50 $-"},
      {-1.5, 3, 1, 1, "-$ 1.50"},
      {-1.5, 3, 0, 1, "1.50 -$"},
      {-1.5, 4, 1, 1, "$- 1.50"},
      {-1.5, 4, 0, 1, "1.50 $-"},
      {-1.5, 4, 0, 0, "1.50$-"},
      {2.9999996, 1, 1, 0, "$3.00"},
  };
  VLLocale *l = ruled();
  for (auto [item, text] : {std::pair{64, "$"}, {72, "-"}, {66, "."}, {67, ","}, {68, "3;0"}})
    ASSERT_EQ(VLSetLocaleTextInfo(l, item, text, -1, 0), 1) << item;
  ASSERT_EQ(VLSetLocaleNumInfo(l, 69, 2, 0), 1);
  for (const Row &r : rows) {
    const bool neg = r.amount < 0;
    ASSERT_EQ(VLSetLocaleNumInfo(l, neg ? 78 : 77, r.position, 0), 1);
    ASSERT_EQ(VLSetLocaleNumInfo(l, neg ? 75 : 73, r.precedes, 0), 1);
    ASSERT_EQ(VLSetLocaleNumInfo(l, neg ? 76 : 74, r.blank, 0), 1);
    EXPECT_EQ(fmtMoney(l, r.amount), r.text) << "position " << r.position << " precedes " << r.precedes;
  }
  ASSERT_EQ(VLSetLocaleNumInfo(l, 69, 0, 0), 1);
  EXPECT_EQ(fmtMoney(l, 12), "$12.") << "the separator stays with no fraction digits";
}

// A yen sign of the double-byte set comes with its shift bytes, in every form.
TEST_F(Num, DoubleByteSymbolsInShiftSensitivePages) {
  VLLocale *l = loc("Japanese_Japan.IBM930");
  ASSERT_NE(l, nullptr);
  const VLUChar yen[] = {0xFFE5, 0};
  ASSERT_EQ(VLSetLocaleTextInfoU(l, 64, yen, -1, 0), 1);
  std::string s = fmtMoney(l, 1234);
  ASSERT_GE(s.size(), 4u);
  EXPECT_EQ(s[0], '\x0E');
  EXPECT_EQ(s[3], '\x0F');
  EXPECT_EQ(unicode(l, s).substr(0, 1), u"\uFFE5");
  // From a caller in the double-byte state, a shift-in comes first.
  char b[32];
  int32_t n = VLCurrencyToStringEx(l, b, 1, 32, 0, 1234);
  ASSERT_GT(n, 0);
  EXPECT_EQ(b[0], '\x0F');
  EXPECT_EQ(unicode(l, std::string(b + 1, n - 1)), unicode(l, s));
  EXPECT_EQ(VLCurrencyToStringEx(l, b, 1, 1, 0, 1234), 0);
  EXPECT_EQ(VLGetError(l), static_cast<int32_t>(VL_RC_BUFFER));
  VLUChar u[32];
  n = VLCurrencyToStringU(l, u, 32, 0, 1234);
  EXPECT_EQ(std::u16string(reinterpret_cast<char16_t *>(u), n), unicode(l, s));
  VLWChar w[32];
  n = VLCurrencyToStringW(l, w, 32, 0, 1234);
  ASSERT_GT(n, 0);
  EXPECT_GT(w[0], 0xFFu);
}

// Every size below the whole: code 40, whole characters, no open shift run, a prefix.
TEST_F(Num, ShortBuffersCutAtCharacterBoundaries) {
  for (const char *page : {"Latin1", "UTF-8", "MS932", "IBM930"}) {
    VLLocale *l = loc(std::string("Japanese_Japan.") + page);
    ASSERT_NE(l, nullptr);
    const VLUChar sym[] = {0xFFE5, 0x5186, 0};
    ASSERT_EQ(VLSetLocaleTextInfoU(l, 64, sym, -1, 0), 1);
    for (uint32_t opts : {0u, unsigned(VL_OPT_NULLTERM)}) {
      char full[128];
      const int32_t whole = VLCurrencyToString(l, full, sizeof full, opts, -123456.5);
      ASSERT_GT(whole, 0);
      const std::u16string fullU = unicode(l, std::string(full, whole - (opts ? 1 : 0)));
      for (int32_t size = 1; size < whole; ++size) {
        char b[128];
        std::memset(b, 0x55, sizeof b);
        const int32_t n = VLCurrencyToString(l, b, size, opts, -123456.5);
        SCOPED_TRACE(std::string(page) + " size " + std::to_string(size));
        EXPECT_EQ(VLGetError(l), static_cast<int32_t>(VL_RC_BUFFER));
        ASSERT_LE(n, size);
        EXPECT_EQ(b[size], 0x55) << "written past the size";
        const int32_t text = n - (opts ? 1 : 0);
        if (opts) {
          EXPECT_EQ(b[text], 0);
        }
        int shift = 0;
        for (int32_t i = 0; i < text; ++i) shift = b[i] == 0x0E ? 1 : b[i] == 0x0F ? 0 : shift;
        if (!std::strcmp(page, "IBM930")) {
          EXPECT_EQ(shift, 0) << "left in the double-byte state";
        }
        const std::u16string got = unicode(l, std::string(b, text));
        EXPECT_EQ(fullU.compare(0, got.size(), got), 0) << "not a prefix";
      }
    }
  }
}

// ---- Round trips ----------------------------------------------------------------------------

// Formats then reads back in the four forms; `state` is the Ex caller's state.
void roundTrip(VLLocale *l, int32_t v, uint32_t opts, const std::string &where) {
  SCOPED_TRACE(where + " value " + std::to_string(v) + " options " + std::to_string(opts));
  char b[64];
  int32_t n = VLLongToString(l, v, b, sizeof b, opts);
  ASSERT_GT(n, 0);
  char *end;
  EXPECT_EQ(VLStringToLong(l, b, n, &end, 10, opts), v) << std::string(b, n);
  EXPECT_EQ(end, b + n);
  for (VLShiftState st : {0u, 1u}) {
    n = VLLongToStringEx(l, v, b, st, sizeof b, opts);
    VLShiftState endState = 9;
    EXPECT_EQ(VLStringToLongEx(l, b, st, n, &end, &endState, 10, opts), v);
    EXPECT_EQ(end, b + n);
  }
  VLUChar u[64];
  n = VLLongToStringU(l, v, u, 64, opts);
  VLUChar *ue;
  EXPECT_EQ(VLStringToLongU(l, u, n, &ue, 10, opts), v);
  EXPECT_EQ(ue, u + n);
  VLWChar w[64];
  n = VLLongToStringW(l, v, w, 64, opts);
  VLWChar *we;
  EXPECT_EQ(VLStringToLongW(l, w, n, &we, 10, opts), v);
  EXPECT_EQ(we, w + n);
  // Doubles: what is written reads back as the value cut to the precision.
  const double d = v / 64.0;
  const int prec = VLGetLocaleNumInfo(l, 63, 0);
  n = VLDoubleToString(l, d, b, sizeof b, 0);
  const double back = VLStringToDouble(l, b, n, &end, 0);
  EXPECT_EQ(end, b + n) << std::string(b, n);
  EXPECT_NEAR(back, d, std::pow(10.0, -std::min(prec, 6)) + std::fabs(d) * 1e-12) << std::string(b, n);
  n = VLDoubleToStringU(l, d, u, 64, 0);
  EXPECT_DOUBLE_EQ(VLStringToDoubleU(l, u, n, &ue, 0), back);
  n = VLDoubleToStringW(l, d, w, 64, 0);
  EXPECT_DOUBLE_EQ(VLStringToDoubleW(l, w, n, &we, 0), back);
}

TEST_F(Num, EveryTerritoryRoundTripsInEveryPageAndForm) {
  VLObjManager *m = vlglobals->objManager;
  std::vector<std::string> territories;
  for (uint16_t i = m->typeStart[1]; i < m->typeStart[2]; ++i) territories.push_back(m->entries[i].name);
  ASSERT_GT(territories.size(), 20u);
  std::mt19937 rng(13);
  for (const std::string &t : territories) {
    for (const char *page : kPages) {
      const std::string name = "English_" + t + "." + page;
      VLLocale *l = loc(name);
      if (!l) continue;
      for (int32_t v : {0, 1, -1, INT32_MAX, INT32_MIN, 999, 1000, -1000}) {
        roundTrip(l, v, 0, name);
        roundTrip(l, v, VL_NUM_UNSIGNED, name);
      }
      for (int i = 0; i < 24; ++i) {
        roundTrip(l, static_cast<int32_t>(rng()), i & 1 ? VL_NUM_UNSIGNED : 0, name);
        if (HasFailure()) return;
      }
      VLReleaseLocale(l);
      open_.pop_back();
    }
  }
}

// ---- Hostile input ----------------------------------------------------------------------------

TEST_F(Num, RandomBytesAndLongRunsAreReadWithinTheirLength) {
  std::mt19937 rng(7);
  for (const char *page : kPages) {
    VLLocale *l = loc(std::string("English_UnitedStates.") + page);
    ASSERT_NE(l, nullptr);
    for (int i = 0; i < 400; ++i) {
      const size_t len = rng() % 40;
      // Exactly len bytes on the heap, so a read past them is caught by the sanitizer.
      std::unique_ptr<char[]> s(new char[len ? len : 1]);
      const char *kNumberish = "0123456789,. \x0E\x0F+-";
      for (size_t k = 0; k < len; ++k) s[k] = static_cast<char>(i % 3 == 0 ? kNumberish[rng() % 16] : rng());
      char *end;
      VLShiftState es;
      VLStringToLong(l, s.get(), static_cast<int32_t>(len), &end, 0, VL_NUM_DIGITS);
      EXPECT_LE(end, s.get() + len);
      VLStringToDoubleEx(l, s.get(), i & 1, static_cast<int32_t>(len), &end, VL_NUM_MONEY | VL_NUM_DIGITS, &es);
      EXPECT_LE(end, s.get() + len);
      VLStringToLongEx(l, s.get(), 1, static_cast<int32_t>(len), &end, &es, 36, 0);
      char *p = s.get();
      while (p < s.get() + len && VLStrGetDigitEx(l, &p, &es, static_cast<int32_t>(s.get() + len - p), "+", "-", ",",
                                                  ".", 1, VL_NUM_DIGITS) >= 0) {
      }
      EXPECT_LE(p, s.get() + len);
    }
    if (!VLGetLocaleNumInfo(l, 86, 0)) continue;  // the runs below are ASCII
    const std::string digits(5000, '9'), groups(5000, ','), blanks(5000, ' ');
    char *end;
    EXPECT_EQ(VLStringToLong(l, digits.c_str(), -1, &end, 10, 0), INT32_MAX);
    EXPECT_EQ(end, digits.c_str() + digits.size());
    EXPECT_TRUE(std::isinf(VLStringToDouble(l, digits.c_str(), -1, &end, 0)));
    EXPECT_EQ(VLStringToLong(l, groups.c_str(), -1, &end, 10, 0), 0);
    EXPECT_EQ(VLStringToDouble(l, (blanks + "5").c_str(), -1, &end, 0), 5);
    EXPECT_EQ(fmtDouble(l, 1e308).size() > 300, true);
  }
}

// ---- The C library as oracle -------------------------------------------------------------------

// Locales built with localedef into a directory of their own, and the locale of this
// library each stands for.
struct Oracle {
  const char *native, *ours;
};
const Oracle kOracles[] = {
    {"en_US", "English_UnitedStates.UTF-8"},
    {"de_DE", "German_Germany.UTF-8"},
    {"ja_JP", "Japanese_Japan.UTF-8"},
    {"it_IT", "Italian_Italy.UTF-8"},
    {"pt_BR", "Portuguese_Brazil.UTF-8"},
};

class NumNative : public Num {
 protected:
  static void SetUpTestSuite() {
    dir_ = new ts::TempDir;
    for (const Oracle &o : kOracles)
      if (ts::localedef(o.native, "UTF-8", dir_->file(name(o)))) built_.push_back(o);
  }
  // With its code set named, so that no alias of the bare name is taken instead.
  static std::string name(const Oracle &o) { return std::string(o.native) + ".UTF-8"; }
  static void TearDownTestSuite() {
    delete dir_;
    built_.clear();
  }
  void SetUp() override {
    if (built_.empty()) GTEST_SKIP() << "localedef built none of the oracle locales";
    locpath_ = std::make_unique<ts::EnvScope>("LOCPATH", dir_->path.c_str());
    saved_ = std::setlocale(LC_ALL, nullptr);
    Num::SetUp();
  }
  void TearDown() override {
    std::setlocale(LC_ALL, saved_.c_str());
    locpath_.reset();
    Num::TearDown();
  }
  static inline ts::TempDir *dir_ = nullptr;
  static inline std::vector<Oracle> built_;
  std::string saved_;
  std::unique_ptr<ts::EnvScope> locpath_;
};

TEST_F(NumNative, GroupingAgreesWithPrintf) {
  std::mt19937 rng(3);
  for (const Oracle &o : built_) {
    ASSERT_NE(std::setlocale(LC_ALL, name(o).c_str()), nullptr) << o.native;
    VLLocale *l = loc(o.ours);
    ASSERT_NE(l, nullptr);
    for (int i = 0; i < 300; ++i) {
      const int32_t v = i < 4 ? (int32_t[]){0, -1, INT32_MAX, INT32_MIN}[i] : static_cast<int32_t>(rng()) >> (i % 31);
      char theirs[64];
      std::snprintf(theirs, sizeof theirs, "%'d", v);
      EXPECT_EQ(fmtLong(l, v), theirs) << o.native << " " << v;
    }
  }
}

// strfmon rounds where this library cuts, and leaves out the decimal separator of a
// currency without fraction digits; both are compared as such.
TEST_F(NumNative, CurrencyAgreesWithStrfmon) {
  const double amounts[] = {0, 7, 1234.5, -1234.56, 1234567.89, -0.25, 99999.99, 1234.567, -8.999};
  for (const Oracle &o : built_) {
    ASSERT_NE(std::setlocale(LC_ALL, name(o).c_str()), nullptr) << o.native;
    VLLocale *l = loc(o.ours);
    ASSERT_NE(l, nullptr);
    const lconv *lc = std::localeconv();
    const int frac = lc->frac_digits;
    const std::string decimal = lc->mon_decimal_point;
    for (double a : amounts) {
      // The value cut as "%f" and then the fraction digits leave it, which strfmon
      // then writes without rounding.
      char fixed[64];
      std::snprintf(fixed, sizeof fixed, "%f", a);
      std::string f = fixed;
      f = f.substr(0, f.find_first_not_of("-0123456789") + 1 + frac);
      const double cut = std::strtod(f.c_str(), nullptr);
      char theirs[128];
      ASSERT_GT(strfmon(theirs, sizeof theirs, "%n", cut), 0);
      std::string expect = theirs;
      if (frac == 0) {
        // The separator follows the last digit.
        size_t at = expect.find_last_of("0123456789");
        expect.insert(at + 1, decimal);
      }
      EXPECT_EQ(fmtMoney(l, a), expect) << o.native << " " << a;
    }
  }
}

// ---- The command line ---------------------------------------------------------------------------

std::string run(const std::string &args, const std::string &input = "", int *status = nullptr) {
  ts::TempDir d;
  std::ofstream(d.file("in")) << input;
  const std::string cmd =
      std::string(VL_TEST_TLX) + " " + args + " --dir " + VL_TEST_DEFS_DIR + " <" + d.file("in") + " 2>&1";
  FILE *p = popen(cmd.c_str(), "r");
  std::string out;
  char b[256];
  size_t n;
  while ((n = std::fread(b, 1, sizeof b, p)) > 0) out.append(b, n);
  int st = pclose(p);
  if (status) *status = WEXITSTATUS(st);
  return out;
}

TEST(NumTool, FormatAndParseFromArgumentsAndLines) {
  if (!ts::haveDefs()) GTEST_SKIP() << "no generated definitions";
  int st = -1;
  EXPECT_EQ(run("format number --locale German_Germany.UTF-8 1234567 -1234.5678", "", &st), "1.234.567\n-1.234,56\n");
  EXPECT_EQ(st, 0);
  EXPECT_EQ(run("format currency --locale German_Germany.UTF-8", "1234.5\n-2\n"), "1.234,50 \u20AC\n-2,00 \u20AC\n");
  EXPECT_EQ(run("format currency --intl --locale English_UnitedStates.UTF-8 3"), "USD3.00\n");
  EXPECT_EQ(run("parse number --locale German_Germany.UTF-8 1.234.567 -1.234,5"), "1234567\n-1234.5\n");
  EXPECT_EQ(run("parse number --locale German_Germany.UTF-8", "12\n1x2\n", &st),
            "12\ntlx parse: line 2, byte 1: not a number here: '1x2'\n");
  EXPECT_EQ(st, 1);
  run("format rubbish 1", "", &st);
  EXPECT_EQ(st, 2);
}

}  // namespace
