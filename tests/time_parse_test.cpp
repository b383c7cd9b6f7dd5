// Times read by patterns: numbers and words, the AM/PM adjustment, nested patterns,
// fields left alone, shift-sensitive input, the readers, and hostile patterns and text.
#include <gtest/gtest.h>

#include <cstring>
#include <ctime>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "support/gendefs.h"
#include "veltrin.h"

namespace {

// Every field set to a value no directive stores, so untouched fields show.
std::tm sentinel() {
  std::tm t{};
  t.tm_sec = t.tm_min = t.tm_hour = t.tm_mday = t.tm_mon = t.tm_year = t.tm_wday = t.tm_yday = -77;
  return t;
}

using ts::iconvTo;
using TimeParse = ts::DefsTest;

struct Fields {
  int year = -77, mon = -77, mday = -77, hour = -77, min = -77, sec = -77, wday = -77, yday = -77;
};
Fields fieldsOf(const std::tm &t) {
  return {t.tm_year, t.tm_mon, t.tm_mday, t.tm_hour, t.tm_min, t.tm_sec, t.tm_wday, t.tm_yday};
}
std::string show(const Fields &f) {
  char b[128];
  std::snprintf(b, sizeof b, "y%d m%d d%d %d:%d:%d wd%d yd%d", f.year, f.mon, f.mday, f.hour, f.min, f.sec, f.wday,
                f.yday);
  return b;
}

// What each directive stores (and that it stores no other field), and what is refused: text
// that does not match (37), a pattern that cannot be read (51), an unknown option (2).
TEST_F(TimeParse, DirectivesStoreTheirFieldsOrAreRefused) {
  VLLocale *l = loc("English_UnitedStates.US-ASCII");
  ASSERT_NE(l, nullptr);
  auto F = [](std::initializer_list<std::pair<int Fields::*, int>> set) {
    Fields f;
    for (auto &[m, v] : set) f.*m = v;
    return f;
  };
  struct Case {
    const char *what, *pattern, *input;
    int32_t consumed;
    Fields want;
    int rc = 0;
    uint32_t options = 0;
  } cases[] = {
      {"12 in the afternoon is noon", "%I %p", "12 PM", 5, F({{&Fields::hour, 12}})},
      {"12 in the morning is midnight", "%I %p", "12 AM", 5, F({{&Fields::hour, 0}})},
      {"1 in the afternoon is 13", "%I%p", "01PM", 4, F({{&Fields::hour, 13}})},
      {"the designator before the hour", "%p %#I", "PM 7", 4, F({{&Fields::hour, 19}})},
      {"a 24-hour clock is left as read", "%H %p", "15 AM", 5, F({{&Fields::hour, 15}})},
      {"07 is 1907", "%y", "07", 2, F({{&Fields::year, 7}})},
      {"four-digit years", "%Y", "2024", 4, F({{&Fields::year, 124}})},
      {"month 00 is stored as -1", "%m", "00", 2, F({{&Fields::mon, -1}})},
      {"the day of the year as read", "%j", "365", 3, F({{&Fields::yday, 365}})},
      {"day of the year 366 is accepted", "%j", "366", 3, F({{&Fields::yday, 366}})},
      {"one digit is enough", "%d.%m", "5.3", 3, F({{&Fields::mday, 5}, {&Fields::mon, 2}})},
      {"at most two digits", "%d", "123", 2, F({{&Fields::mday, 12}})},
      {"input beyond the pattern is left", "%H:%M", "10:20:30", 5, F({{&Fields::hour, 10}, {&Fields::min, 20}})},
      {"a weekday digit", "%w", "6", 1, F({{&Fields::wday, 6}})},
      {"full names", "%A %d %B %Y", "Sunday 07 September 1986", 24,
       F({{&Fields::wday, 0}, {&Fields::mday, 7}, {&Fields::mon, 8}, {&Fields::year, 86}})},
      {"abbreviated names", "%a%b", "WedDec", 6, F({{&Fields::wday, 3}, {&Fields::mon, 11}})},
      {"the percent sign", "%%%S", "%59", 3, F({{&Fields::sec, 59}})},
      {"the short date", "%x", "03/05/2024", 10, F({{&Fields::mon, 2}, {&Fields::mday, 5}, {&Fields::year, 124}})},
      {"date and time with the afternoon", "%c", "03/05/2024 01:02:03 PM", 22,
       F({{&Fields::mon, 2}, {&Fields::mday, 5}, {&Fields::year, 124}, {&Fields::hour, 13}, {&Fields::min, 2},
          {&Fields::sec, 3}})},
      {"the long date", "%#x", "Tuesday March 5 2024", 20,
       F({{&Fields::wday, 2}, {&Fields::mon, 2}, {&Fields::mday, 5}, {&Fields::year, 124}})},
      {"a day name in other letter case", "%a", "sun", -1, {}, 37},
      {"a literal that differs", "%H:%M", "10.20", -1, {}, 37},
      {"input that ends early", "%H:%M", "10:", -1, {}, 37},
      {"no digit", "%d", "x1", -1, {}, 37},
      {"hour 24", "%H", "24", -1, {}, 37},
      {"hour 13 on a 12-hour clock", "%I", "13", -1, {}, 37},
      {"minute 60", "%M", "60", -1, {}, 37},
      {"month 13", "%m", "13", -1, {}, 37},
      {"weekday 7", "%w", "7", -1, {}, 37},
      {"an unknown month", "%b", "Foo", -1, {}, 37},
      {"a percent sign that is missing", "%%", "x", -1, {}, 37},
      {"a pattern ending in a percent sign", "%d%", "05", -1, {}, 51},
      {"a pattern ending in the modifier", "%#", "05", -1, {}, 51},
      {"a week number has no reader", "%U", "05", -1, {}, 51},
      {"the zone has no reader", "%Z", "UTC", -1, {}, 51},
      {"a byte that is no directive", "%!", "!", -1, {}, 51},
      {"an unknown option bit", "%d", "05", -1, {}, 2, 0x8},
  };
  for (const Case &c : cases) {
    std::tm t = sentinel();
    EXPECT_EQ(VLStringToTime(l, &t, c.input, -1, c.pattern, -1, c.options), c.consumed) << c.what;
    EXPECT_EQ(VLGetError(l), c.rc) << c.what;
    if (c.consumed >= 0) {
      EXPECT_EQ(show(fieldsOf(t)), show(c.want)) << c.what;
    }
  }
  // Fields read before the failure stay stored.
  std::tm t = sentinel();
  EXPECT_EQ(VLStringToTime(l, &t, "10:xx", -1, "%H:%M", -1, 0), -1);
  EXPECT_EQ(t.tm_hour, 10);
  EXPECT_EQ(t.tm_min, -77);
  // An input length cuts the text: the digit after it is not read.
  EXPECT_EQ(VLStringToTime(l, &t, "123", 1, "%d", -1, 0), 1);
  EXPECT_EQ(t.tm_mday, 1);
}

TEST_F(TimeParse, WordsTheLongestMatchAndTheFirstOfEquals) {
  VLLocale *l = loc("English_UnitedStates.US-ASCII");
  ASSERT_NE(l, nullptr);
  struct Case {
    const char *what, *input;
    int first, count;
    int32_t index, end;
  } cases[] = {
      {"the full day name over its abbreviation", "Sundays", 16, 14, 0, 6},
      {"the abbreviation where the full name does not follow", "Sunny", 16, 14, 7, 3},
      {"the first of two equal words", "May 1", 34, 14, 0, 3},
      {"the afternoon designator", "PM", 56, 2, 1, 2},
  };
  for (const Case &c : cases) {
    int32_t index = -1, pos = 0;
    EXPECT_EQ(VLStrReadWord(l, &index, c.input, &pos, -1, c.first, c.count, 0), 0u) << c.what;
    EXPECT_EQ(index, c.index) << c.what;
    EXPECT_EQ(pos, c.end) << c.what;
  }
  int32_t index = -1, pos = 0;
  EXPECT_EQ(VLStrReadWord(l, &index, "Sun", &pos, 2, 23, 7, 0), VL_RC_NOTFOUND);  // the length cuts the word
  EXPECT_EQ(VLStrReadWord(l, &index, "Sun", &pos, -1, 23, 7, 5), VL_RC_BADARG);

  struct Num {
    const char *what, *input;
    int32_t width, max;
    int ascii;
    uint32_t error;
    int32_t value, end;
  } nums[] = {
      {"width stops the digits", "12345", 3, 999, 1, 0, 123, 3},
      {"above the maximum", "99", 2, 59, 1, 37, -1, 0},
      {"no digit", "x", 2, 59, 1, 37, -1, 0},
      {"EBCDIC digits", "\xF4\xF2", 2, 99, 0, 0, 42, 2},
      {"ASCII digits are not EBCDIC ones", "42", 2, 99, 0, 37, -1, 0},
      {"a huge width still stops at the maximum", "99999999999999999999999", 1 << 30, 99, 1, 37, -1, 0},
  };
  for (const Num &c : nums) {
    uint32_t error = 99;
    int32_t p = 0;
    EXPECT_EQ(VLStrReadNumber(&error, c.input, &p, -1, c.width, c.max, c.ascii), c.value) << c.what;
    EXPECT_EQ(error, c.error) << c.what;
    EXPECT_EQ(p, c.end) << c.what;
  }
  // In the double-byte state a number is read only after a shift-in.
  uint32_t error = 0;
  int32_t p = 0;
  VLShiftState st = 1;
  EXPECT_EQ(VLStrReadNumberEx(&error, "\xF1", &p, &st, -1, 2, 99, 0), -1);
  EXPECT_EQ(error, 37u);
  EXPECT_EQ(VLStrReadNumberEx(&error, "\x0F\xF1", &p, &st, -1, 2, 99, 0), 1);
  EXPECT_EQ(st, 0u);
  EXPECT_EQ(p, 2);
}

TEST_F(TimeParse, ShiftSensitiveInput) {
  VLLocale *l = loc("Japanese_Japan.IBM930");
  ASSERT_NE(l, nullptr);
  const std::string so = "\x0E", si = "\x0F";
  const std::string nen = iconvTo("年", "IBM930").substr(1, 2), getsu = iconvTo("月", "IBM930").substr(1, 2);
  struct Case {
    const char *what;
    std::string pattern, input;
    VLShiftState inState;
    int32_t consumed;
    Fields want;
  } cases[] = {
      {"the short date", iconvTo("%x", "IBM930"), iconvTo("2024年03月05日", "IBM930"), 0, 20,
       Fields{124, 2, 5, -77, -77, -77, -77, -77}},
      {"a day name and the afternoon", iconvTo("%A %p%I", "IBM930"), iconvTo("火曜日 午後02", "IBM930"), 0, 17,
       Fields{-77, -77, -77, 14, -77, -77, 2, -77}},
      {"runs the input joins that the pattern keeps apart", so + nen + si + so + getsu + si + iconvTo("%m", "IBM930"),
       so + nen + getsu + si + "\xF0\xF3", 0, 8, Fields{-77, 2, -77, -77, -77, -77, -77, -77}},
      {"input that begins double-byte", so + nen + si + iconvTo("%d", "IBM930"), nen + si + "\xF0\xF5", 1, 5,
       Fields{-77, -77, 5, -77, -77, -77, -77, -77}},
  };
  for (const Case &c : cases) {
    std::tm t = sentinel();
    int32_t n = VLStringToTimeEx(l, &t, c.input.data(), c.inState, static_cast<int32_t>(c.input.size()),
                                 c.pattern.data(), 0, static_cast<int32_t>(c.pattern.size()), 0);
    EXPECT_EQ(n, c.consumed) << c.what << " rc " << VLGetError(l);
    EXPECT_EQ(show(fieldsOf(t)), show(c.want)) << c.what;
  }
  // A double-byte character never matches the single-byte one with the same bytes.
  std::tm t = sentinel();
  const std::string pat = so + nen + si, in = nen;
  EXPECT_EQ(VLStringToTimeEx(l, &t, in.data(), 0, 2, pat.data(), 0, 4, 0), -1);
  EXPECT_EQ(VLGetError(l), VL_RC_NOTFOUND);
}

TEST_F(TimeParse, WideAndUnicodeForms) {
  VLLocale *l = loc("German_Germany.Latin1");
  ASSERT_NE(l, nullptr);
  const char16_t pu[] = u"%A, %#d. %B %Y";
  const char16_t iu[] = u"Donnerstag, 5. März 2026 und mehr";
  std::tm t = sentinel();
  EXPECT_EQ(VLStringToTimeU(l, &t, reinterpret_cast<const VLUChar *>(iu), -1, reinterpret_cast<const VLUChar *>(pu),
                            -1, 0),
            24);
  EXPECT_EQ(show(fieldsOf(t)), show(Fields{126, 2, 5, -77, -77, -77, 4, -77}));
  VLWChar pw[32], iw[40];
  for (size_t k = 0; k < sizeof pu / 2; ++k) pw[k] = pu[k];
  for (size_t k = 0; k < sizeof iu / 2; ++k) iw[k] = iu[k];  // Latin1 W values are the code points
  t = sentinel();
  EXPECT_EQ(VLStringToTimeW(l, &t, iw, -1, pw, -1, 0), 24);
  EXPECT_EQ(show(fieldsOf(t)), show(Fields{126, 2, 5, -77, -77, -77, 4, -77}));
  EXPECT_EQ(VLStringToTimeW(l, &t, iw, -1, pw, -1, VL_OPT_NULLTERM), -1);
  EXPECT_EQ(VLGetError(l), VL_RC_BADARG);
}

// Random patterns and random text in exactly sized heap blocks (the sanitizers see any
// read past them): every call ends with a result or a code, never a crash.
TEST_F(TimeParse, RandomPatternsAndTextAreSurvived) {
  std::mt19937 rng(20240305);
  const char alphabet[] = "%#aAbBcdHIjmMpSUwWxXyYzZe0123456789 :./\x0E\x0F\x81\x42\xC1\xF1\x6C\x7B\xE4\xC3";
  for (const char *name : {"English_UnitedStates.US-ASCII", "German_Germany.UTF-8", "Japanese_Japan.MS932",
                           "Japanese_Japan.IBM930"}) {
    VLLocale *l = loc(name);
    ASSERT_NE(l, nullptr);
    for (int round = 0; round < 3000; ++round) {
      const size_t pl = rng() % 12, il = rng() % 24;
      std::unique_ptr<char[]> pat(new char[pl + 1]), in(new char[il + 1]);
      for (size_t k = 0; k < pl; ++k) pat[k] = alphabet[rng() % (sizeof alphabet - 1)];
      for (size_t k = 0; k < il; ++k) in[k] = static_cast<char>(rng() % 3 ? alphabet[rng() % (sizeof alphabet - 1)] : rng());
      std::tm t{};
      t.tm_year = static_cast<int>(rng() % 300) - 100;
      t.tm_mon = static_cast<int>(rng() % 14) - 1;
      t.tm_mday = static_cast<int>(rng() % 33);
      t.tm_hour = static_cast<int>(rng() % 25);
      t.tm_wday = static_cast<int>(rng() % 8);
      t.tm_yday = static_cast<int>(rng() % 367);
      const size_t size = rng() % 40;
      const VLShiftState a = rng() & 1, b = rng() & 1;
      const uint32_t opts = (rng() & 1 ? VL_OPT_NULLTERM : 0) | (rng() % 4 == 0 ? VL_OPT_CHARLEN : 0);
      // A size in characters promises room for that many characters, shift bytes included.
      std::unique_ptr<char[]> out(new char[opts & VL_OPT_CHARLEN ? size * 6 : size + 1]);
      // Counted in characters, a length would promise that many: such calls take the 0 as the end.
      pat[pl] = 0;
      const int32_t plen = opts & VL_OPT_CHARLEN ? -1 : static_cast<int32_t>(pl);
      int32_t n = VLTimeToStringEx(l, &t, out.get(), a, static_cast<int32_t>(size), pat.get(), b, plen, opts);
      EXPECT_TRUE(n == -1 || (n >= 0 && n <= static_cast<int32_t>(size))) << n;
      int32_t m = VLStringToTimeEx(l, &t, in.get(), a, static_cast<int32_t>(il), pat.get(), b,
                                   static_cast<int32_t>(pl), 0);
      EXPECT_TRUE(m == -1 || (m >= 0 && m <= static_cast<int32_t>(il))) << m;
      // What was written reads back with the same pattern.
      if (n > 0 && !(opts & (VL_OPT_NULLTERM | VL_OPT_CHARLEN)) && a == 0) {
        std::tm back{};
        VLStringToTimeEx(l, &back, out.get(), 0, n, pat.get(), b, static_cast<int32_t>(pl), 0);
      }
      // The unit forms and the one-directive members over the same bytes as units.
      std::unique_ptr<VLWChar[]> pw(new VLWChar[pl]), iw(new VLWChar[il]), ow(new VLWChar[size + 1]);
      std::unique_ptr<VLUChar[]> pu(new VLUChar[pl]), iu(new VLUChar[il]), ou(new VLUChar[size + 1]);
      for (size_t k = 0; k < pl; ++k) pw[k] = pu[k] = static_cast<unsigned char>(pat[k]);
      for (size_t k = 0; k < il; ++k) iw[k] = iu[k] = static_cast<unsigned char>(in[k]);
      const int32_t sz = static_cast<int32_t>(size), pn = static_cast<int32_t>(pl), in_ = static_cast<int32_t>(il);
      EXPECT_LE(VLTimeToStringW(l, &t, ow.get(), sz, pw.get(), pn, opts), sz);
      EXPECT_LE(VLTimeToStringU(l, &t, ou.get(), sz, pu.get(), pn, opts), sz);
      EXPECT_LE(VLStringToTimeW(l, &t, iw.get(), in_, pw.get(), pn, 0), in_);
      EXPECT_LE(VLStringToTimeU(l, &t, iu.get(), in_, pu.get(), pn, 0), in_);
      int32_t pos = 0, pp = static_cast<int32_t>(rng() % (pl + 1)), ip = 0, pm = 0;
      VLShiftState st = a;
      if (pp < pn) VLStrExpandTimeEx(l, &t, out.get(), &pos, &st, static_cast<int32_t>(size), pat.get(), &pp, pn, 0);
      EXPECT_LE(pos, static_cast<int32_t>(size));
      pp = static_cast<int32_t>(rng() % (pl + 1));
      if (pp < pn) VLStrExtractTimeEx(l, &t, &pm, in.get(), &ip, &st, in_, pat.get(), &pp, pn, 0);
      EXPECT_LE(ip, in_);
    }
  }
}

}  // namespace
