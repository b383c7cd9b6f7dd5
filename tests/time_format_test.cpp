// Times written by patterns: every directive against the C library in its own locale,
// ranges, malformed patterns, every buffer size around the text, shift-sensitive output,
// the four forms and the writers.
#include <gtest/gtest.h>

#include <clocale>
#include <cstring>
#include <ctime>
#include <string>
#include <vector>

#include "support/gendefs.h"
#include "veltrin.h"

namespace {

std::tm at(int year, int mon, int mday, int hour = 0, int min = 0, int sec = 0) {
  std::tm t{};
  t.tm_year = year - 1900;
  t.tm_mon = mon - 1;
  t.tm_mday = mday;
  t.tm_hour = hour;
  t.tm_min = min;
  t.tm_sec = sec;
  t.tm_isdst = -1;
  std::time_t s = timegm(&t);  // fills the day of week and of year
  gmtime_r(&s, &t);
  return t;
}

using ts::iconvTo;

class TimeFormat : public ts::DefsTest {
 protected:
  // The text, or "<rc>" on failure.
  static std::string fmt(VLLocale *l, const std::tm &t, const std::string &pattern, uint32_t options = 0,
                         int32_t size = 256) {
    char b[256];
    int32_t n = VLTimeToString(l, &t, b, size, pattern.data(), static_cast<int32_t>(pattern.size()), options);
    return n < 0 ? "<" + std::to_string(VLGetError(l)) + ">" : std::string(b, static_cast<size_t>(n));
  }
};

// English names equal the C locale's, so strftime in "C" checks every shared directive
// over a whole leap year, every hour.
TEST_F(TimeFormat, SharedDirectivesAgreeWithStrftimeOverALeapYear) {
  VLLocale *l = loc("English_UnitedStates.US-ASCII");
  ASSERT_NE(l, nullptr);
  const std::string saved = std::setlocale(LC_TIME, nullptr);
  std::setlocale(LC_TIME, "C");
  const char *pattern = "%a %A %b %B %d %H %I %m %M %p %S %U %w %W %y %Y %% %#d|%#H|%#I|%#m|%#M|%#S";
  const char *oracle = "%a %A %b %B %d %H %I %m %M %p %S %U %w %W %y %Y %% %-d|%-H|%-I|%-m|%-M|%-S";
  int bad = 0;
  for (int day = 0; day < 366 && bad < 5; ++day) {
    for (int hour : {0, 1, 11, 12, 13, 23}) {
      std::tm t = at(1996, 1, 1 + day, hour, day % 60, (day * 7) % 60);
      char want[256];
      size_t n = std::strftime(want, sizeof want, oracle, &t);
      std::string got = fmt(l, t, pattern);
      if (got != std::string(want, n)) ++bad;
      EXPECT_EQ(got, std::string(want, n)) << "day " << day << " hour " << hour;
    }
  }
  std::setlocale(LC_TIME, saved.c_str());
}

TEST_F(TimeFormat, NestedPatternsAreTheLocalesOwn) {
  for (const char *name : {"English_UnitedStates.US-ASCII", "German_Germany.UTF-8", "Japanese_Japan.MS932"}) {
    VLLocale *l = loc(name);
    ASSERT_NE(l, nullptr);
    char p79[128], p80[128], p81[128];
    for (auto [item, p] : {std::pair{79, p79}, {80, p80}, {81, p81}}) ASSERT_GT(VLGetLocaleTextInfo(l, item, p, 128, 0), 1);
    std::tm t = at(2024, 3, 5, 14, 7, 9);
    EXPECT_EQ(fmt(l, t, "%x"), fmt(l, t, p80)) << name;
    EXPECT_EQ(fmt(l, t, "%#x"), fmt(l, t, p81)) << name;
    EXPECT_EQ(fmt(l, t, "%X"), fmt(l, t, p79)) << name;
    EXPECT_EQ(fmt(l, t, "[%c]"), "[" + fmt(l, t, p80) + " " + fmt(l, t, p79) + "]") << name;
    EXPECT_EQ(fmt(l, t, "%#c"), fmt(l, t, p81) + " " + fmt(l, t, p79)) << name;
  }
  // A pattern that names itself is stopped rather than followed for ever.
  VLLocale *l = loc("English_UnitedStates.US-ASCII");
  ASSERT_EQ(VLSetLocaleTextInfo(l, 80, "<%x>", -1, 0), 1);
  EXPECT_EQ(fmt(l, at(2024, 3, 5), "%x"), "<51>");
  EXPECT_EQ(fmt(l, at(2024, 3, 5), "%x", VL_OPT_DEFAULTS), "03/05/2024");
}

// Directives the C library writes otherwise, and what is refused: a malformed pattern (51),
// a field out of its range or a directive there is none of (37), an unknown option (2).
TEST_F(TimeFormat, DirectivesRangesAndRefusals) {
  VLLocale *l = loc("English_UnitedStates.US-ASCII");
  ASSERT_NE(l, nullptr);
  const std::tm ok = at(2024, 3, 5, 10, 20, 30);
  auto with = [](void (*change)(std::tm &), std::tm t = at(2024, 3, 5, 10, 20, 30)) {
    change(t);
    return t;
  };
  struct Case {
    const char *what, *pattern;
    std::tm t;
    const char *want;
    uint32_t options = 0;
  } cases[] = {
      {"1 January is day 000", "%j", at(2024, 1, 1), "000"},
      {"31 December of a leap year is day 365", "%j", at(2024, 12, 31), "365"},
      {"%#j drops the zeros", "%#j", at(2024, 2, 1), "31"},
      {"%y keeps the last two digits", "%y", at(2007, 6, 1), "07"},
      {"%Y keeps the last four digits", "%Y", with([](std::tm &t) { t.tm_year = 12345 - 1900; }), "2345"},
      {"%#d of day 0 is one zero", "%#d", with([](std::tm &t) { t.tm_mday = 0; }), "0"},
      {"hour 0 with %I is 12", "%I", at(2000, 1, 1, 0), "12"},
      {"hour 12 with %I is 12", "%I", at(2000, 1, 1, 12), "12"},
      {"hour 13 with %I is 01", "%I", at(2000, 1, 1, 13), "01"},
      {"%% and text around directives", "a%%b%dc", at(2000, 1, 9), "a%b09c"},
      {"%#% is a percent sign too", "%#%", at(2000, 1, 9), "%"},
      {"a pattern ending in a percent sign", "abc%", ok, "<51>"},
      {"a pattern ending in the modifier", "%d%#", ok, "<51>"},
      {"the zone name", "%Z", ok, "<37>"},
      {"the zone offset", "%z", ok, "<37>"},
      {"a letter without a directive", "%e", ok, "<37>"},
      {"a byte without a directive", "%;", ok, "<37>"},
      {"a leap second", "%S", with([](std::tm &t) { t.tm_sec = 60; }), "<37>"},
      {"minute 60", "%M", with([](std::tm &t) { t.tm_min = 60; }), "<37>"},
      {"hour 24", "%H", with([](std::tm &t) { t.tm_hour = 24; }), "<37>"},
      {"hour 24 for %p", "%p", with([](std::tm &t) { t.tm_hour = 24; }), "<37>"},
      {"hour -1 for %I", "%I", with([](std::tm &t) { t.tm_hour = -1; }), "<37>"},
      {"day 32", "%d", with([](std::tm &t) { t.tm_mday = 32; }), "<37>"},
      {"month 12", "%b", with([](std::tm &t) { t.tm_mon = 12; }), "<37>"},
      {"month -1", "%m", with([](std::tm &t) { t.tm_mon = -1; }), "<37>"},
      {"weekday 7", "%a", with([](std::tm &t) { t.tm_wday = 7; }), "<37>"},
      {"weekday 7 in a week number", "%U", with([](std::tm &t) { t.tm_wday = 7; }), "<37>"},
      {"year day 366", "%j", with([](std::tm &t) { t.tm_yday = 366; }), "<37>"},
      {"year day 366 in a week number", "%W", with([](std::tm &t) { t.tm_yday = 366; }), "<37>"},
      {"an unknown option bit", "%d", ok, "<2>", 0x2},
      {"a high option bit", "%d", ok, "<2>", 0x80000000u},
  };
  for (const Case &c : cases) EXPECT_EQ(fmt(l, c.t, c.pattern, c.options), c.want) << c.what;
  char b[8] = "keep";
  EXPECT_EQ(VLTimeToString(l, &ok, b, sizeof b, "%d", 0, 0), 0);
  EXPECT_STREQ(b, "keep");
  EXPECT_EQ(VLTimeToString(l, &ok, b, 0, "%d", -1, VL_OPT_CHARLEN), 0);
  EXPECT_EQ(VLGetError(l), VL_RC_BUFFER);
  EXPECT_EQ(VLTimeToString(l, nullptr, b, sizeof b, "%d", -1, 0), -1);
  EXPECT_EQ(VLGetError(l), VL_RC_BADARG);
}

// Every size from 0 to the text's own: all but the last give 40 with a prefix of whole
// characters and nothing written past the size.
void everySize(VLLocale *l, const std::tm &t, const std::string &pattern, const std::string &want,
               const std::string &what) {
  const bool shift = (l->flags & VL_LF_SHIFT) != 0;
  for (uint32_t options : {0u, uint32_t{VL_OPT_NULLTERM}}) {
    const size_t full = want.size() + (options ? 1 : 0);
    for (size_t size = 0; size <= full + 1; ++size) {
      std::vector<char> b(size + 4, '\x7F');
      int32_t n = VLTimeToString(l, &t, b.data(), static_cast<int32_t>(size), pattern.data(),
                                 static_cast<int32_t>(pattern.size()), options);
      SCOPED_TRACE(what + " size " + std::to_string(size) + " options " + std::to_string(options));
      for (size_t k = size; k < b.size(); ++k) ASSERT_EQ(b[k], '\x7F') << "written past the size at " << k;
      if (size >= full) {
        ASSERT_EQ(n, static_cast<int32_t>(full));
        EXPECT_EQ(std::string(b.data(), want.size()), want);
        continue;
      }
      ASSERT_EQ(n, -1);
      EXPECT_EQ(VLGetError(l), VL_RC_BUFFER);
      if (!options || size == 0) continue;
      // What was written is a prefix of whole characters, closed by a shift-in where the
      // prefix needs one, and nothing was given up that would have fitted.
      std::string got(b.data());
      std::string text = got;
      if (shift && !text.empty() && text.back() == '\x0F' && want.compare(0, text.size(), text) != 0) text.pop_back();
      EXPECT_EQ(want.compare(0, text.size(), text), 0) << got;
      EXPECT_GE(got.size() + 4, size - 1) << "gave up too early";
      VLUChar u[128];
      int32_t nu = VLCpStrToUnicode(l->codePage, reinterpret_cast<const unsigned char *>(got.data()),
                                    static_cast<int32_t>(got.size()), u);
      for (int32_t k = 0; k < nu; ++k) EXPECT_NE(u[k], 0xFFFD);
    }
  }
}

TEST_F(TimeFormat, EveryBufferSizeAroundTheText) {
  const std::tm t = at(2024, 3, 5, 14, 7, 9);
  struct Case {
    const char *locale, *pattern, *utf8, *iconvName;
  } cases[] = {
      {"English_UnitedStates.US-ASCII", "%A %#d %B %Y %H:%M:%S %p %j %U %W %w %y %%", "Tuesday 5 March 2024 14:07:09 PM 064 09 10 2 24 %", "US-ASCII"},
      {"German_Germany.UTF-8", "%a, %d. %B %Y", "Di, 05. März 2024", "UTF-8"},
      {"Japanese_Japan.MS932", "%Y年%m月%d日(%a) %p%I時", "2024年03月05日(火) 午後02時", "CP932"},
      {"Japanese_Japan.IBM930", "%x %A %X", "2024年03月05日 火曜日 14時07分09秒", "IBM930"},
  };
  for (const Case &c : cases) {
    VLLocale *l = loc(c.locale);
    ASSERT_NE(l, nullptr);
    // Patterns are in the locale's code page too.
    std::string pattern = iconvTo(c.pattern, c.iconvName), want = iconvTo(c.utf8, c.iconvName);
    ASSERT_EQ(fmt(l, t, pattern), want) << c.locale;
    everySize(l, t, pattern, want, c.locale);
  }
}

TEST_F(TimeFormat, ShiftSensitiveOutputAndPatterns) {
  VLLocale *l = loc("Japanese_Japan.IBM930");
  ASSERT_NE(l, nullptr);
  const std::tm t = at(2024, 3, 5, 14, 7, 9);
  const std::string year = iconvTo("年", "IBM930"), month = iconvTo("月", "IBM930");
  ASSERT_EQ(year.size(), 4u);  // SO, two bytes, SI
  const std::string yearDb = year.substr(1, 2), monthDb = month.substr(1, 2);
  const std::string so = "\x0E", si = "\x0F", digits24 = "\xF2\xF0\xF2\xF4", m03 = "\xF0\xF3";
  const std::string pY = iconvTo("%Y", "IBM930"), pm = iconvTo("%m", "IBM930"), px = iconvTo("%x", "IBM930");
  struct Case {
    const char *what;
    std::string pattern;
    VLShiftState bufState, patState;
    uint32_t options;
    std::string want;
  } cases[] = {
      {"the short date with its shift bytes", px, 0, 0, 0, iconvTo("2024年03月05日", "IBM930")},
      {"a double-byte run the pattern never closes stays open", pY + so + yearDb, 0, 0, 0, digits24 + so + yearDb},
      {"closed by the terminator", pY + so + yearDb, 0, 0, VL_OPT_NULLTERM, digits24 + so + yearDb + si + '\0'},
      {"two runs in a row become one", so + yearDb + si + so + monthDb + si, 0, 0, 0, so + yearDb + monthDb + si},
      {"a number after a run opens with a shift-in", so + yearDb + si + pm, 0, 0, 0, so + yearDb + si + m03},
      {"a buffer that begins double-byte", pY, 1, 0, 0, si + digits24},
      {"a buffer that begins double-byte takes a run as it is", so + yearDb + si, 1, 0, 0, yearDb + si},
      {"a pattern that begins double-byte", yearDb + si + pm, 0, 1, 0, so + yearDb + si + m03},
      {"a pattern that switches before a directive", so + yearDb + si + pY + so + monthDb + si, 0, 0, 0,
       so + yearDb + si + digits24 + so + monthDb + si},
  };
  for (const Case &c : cases) {
    char b[64];
    int32_t n = VLTimeToStringEx(l, &t, b, c.bufState, sizeof b, c.pattern.data(),
                                 c.patState, static_cast<int32_t>(c.pattern.size()), c.options);
    ASSERT_GE(n, 0) << c.what << " rc " << VLGetError(l);
    EXPECT_EQ(std::string(b, static_cast<size_t>(n)), c.want) << c.what;
  }
  // A pattern that ends inside a double-byte character is malformed.
  char b[64];
  const std::string cut = so + yearDb.substr(0, 1);
  EXPECT_EQ(VLTimeToStringEx(l, &t, b, 0, sizeof b, cut.data(), 0, static_cast<int32_t>(cut.size()), 0), -1);
  EXPECT_EQ(VLGetError(l), VL_RC_BADPATTERN);
  // Characters counted: the date has 11, the shift bytes are none.
  EXPECT_EQ(VLTimeToString(l, &t, b, 20, px.c_str(), -1, VL_OPT_CHARLEN), 11);
  EXPECT_EQ(VLTimeToString(l, &t, b, 11, px.c_str(), -1, VL_OPT_CHARLEN | VL_OPT_NULLTERM), -1);
  EXPECT_EQ(VLGetError(l), VL_RC_BUFFER);
  EXPECT_EQ(std::string(b), iconvTo("2024年03月05", "IBM930"));
  EXPECT_EQ(VLTimeToString(l, &t, b, 12, px.c_str(), -1, VL_OPT_CHARLEN | VL_OPT_NULLTERM), 12);
}

TEST_F(TimeFormat, WideAndUnicodeFormsAgreeWithTheBytes) {
  const std::tm t = at(2024, 12, 31, 23, 59, 58);
  for (const char *name : {"English_UnitedStates.US-ASCII", "German_Germany.Latin1", "Japanese_Japan.IBM930",
                           "Russian_Russia.UTF-8", "English_UnitedStates.IBM037"}) {
    VLLocale *l = loc(name);
    ASSERT_NE(l, nullptr);
    for (const char *p : {"%c", "%#c|%j|%U|%W|%w|%p|%I", "%#x %A"}) {
      // The pattern in each form: ASCII letters mapped into the page.
      VLUChar pu[64];
      size_t k = 0;
      for (; p[k]; ++k) pu[k] = static_cast<unsigned char>(p[k]);
      pu[k] = 0;
      char pb[64];
      int32_t nb = VLCpUnicodeToStr(l->codePage, pu, -1, 0, reinterpret_cast<unsigned char *>(pb));
      ASSERT_GT(nb, 0);
      pb[nb] = 0;
      VLWChar pw[64];
      for (int32_t i = 0; i <= nb; ++i) pw[i] = static_cast<unsigned char>(pb[i]);

      char b[256];
      VLWChar w[256];
      VLUChar u[256];
      int32_t n = VLTimeToString(l, &t, b, sizeof b, pb, -1, VL_OPT_NULLTERM);
      int32_t nw = VLTimeToStringW(l, &t, w, 256, pw, -1, VL_OPT_NULLTERM);
      int32_t nu = VLTimeToStringU(l, &t, u, 256, pu, -1, VL_OPT_NULLTERM);
      ASSERT_GT(n, 0) << name << " " << p << " rc " << VLGetError(l);
      ASSERT_GT(nw, 0) << name << " " << p;
      ASSERT_GT(nu, 0) << name << " " << p;
      VLUChar fromBytes[256];
      int32_t nfb = VLCpStrToUnicode(l->codePage, reinterpret_cast<unsigned char *>(b), n - 1, fromBytes);
      EXPECT_EQ(std::u16string(reinterpret_cast<char16_t *>(fromBytes), nfb),
                std::u16string(reinterpret_cast<char16_t *>(u), nu - 1))
          << name << " " << p;
      std::string fromW;
      for (int32_t i = 0; i + 1 < nw; ++i) {
        unsigned char c[4];
        int len = VLWToMb(c, w[i]);
        fromW.append(reinterpret_cast<char *>(c), len);
      }
      std::string plainNoShift;
      for (int32_t i = 0; i + 1 < n; ++i)
        if (!((l->flags & VL_LF_SHIFT) && (b[i] == 0x0E || b[i] == 0x0F))) plainNoShift += b[i];
      EXPECT_EQ(fromW, plainNoShift) << name << " " << p;
    }
  }
}

TEST_F(TimeFormat, WritersAndTheExpander) {
  VLLocale *l = loc("English_UnitedStates.US-ASCII");
  ASSERT_NE(l, nullptr);
  struct Num {
    const char *what;
    int32_t value, width, size;
    int ascii, modifier;
    uint32_t rc;
    const char *want;
  } nums[] = {
      {"zero-padded", 7, 3, 10, 1, 0, 0, "007"},
      {"the low digits only", 12345, 2, 10, 1, 0, 0, "45"},
      {"modifier drops zeros", 7, 3, 10, 1, 1, 0, "7"},
      {"modifier keeps one zero", 0, 3, 10, 1, 1, 0, "0"},
      {"EBCDIC digits", 42, 2, 10, 0, 0, 0, "\xF4\xF2"},
      {"filling the buffer is reported", 42, 2, 2, 1, 0, 40, "42"},
      {"cut digits stay", 1234, 4, 3, 1, 0, 40, "123"},
  };
  for (const Num &c : nums) {
    char b[16] = {0};
    int32_t pos = 0;
    EXPECT_EQ(VLStrWriteNumber(l, b, &pos, c.size, c.value, c.width, c.ascii, c.modifier), c.rc) << c.what;
    EXPECT_EQ(std::string(b, static_cast<size_t>(pos)), c.want) << c.what;
  }
  int32_t pos = 0;
  char b[16];
  EXPECT_EQ(VLStrWriteNumber(l, b, &pos, 16, 1, 0, 1, 0), VL_RC_BADARG);
  EXPECT_EQ(VLStrWriteWord(l, b, &pos, 16, 19, 2), VL_RC_BADARG);
  EXPECT_EQ(VLStrWriteWord(l, b, &pos, 16, 19, 0), 0u);
  EXPECT_EQ(VLStrWriteWord(l, b, &pos, 13, 16, 0), VL_RC_BUFFER);
  EXPECT_EQ(std::string(b, static_cast<size_t>(pos)), "WednesdaySund");
  EXPECT_EQ(VLStrWriteWord(l, b, &pos, 16, 99, 0), VL_RC_BADITEM);

  // The expander: one directive at a time, positions moving on.
  const std::tm t = at(2024, 3, 5, 14, 7, 9);
  const char *pattern = "%#d.%B";
  int32_t pp = 0;
  pos = 0;
  EXPECT_EQ(VLStrExpandTime(l, &t, b, &pos, 16, pattern, &pp, -1, 0), 0u);
  EXPECT_EQ(pp, 3);
  EXPECT_EQ(pos, 1);
  pp = 4;
  EXPECT_EQ(VLStrExpandTime(l, &t, b, &pos, 16, pattern, &pp, -1, 0), 0u);
  EXPECT_EQ(std::string(b, static_cast<size_t>(pos)), "5March");
  pp = 3;
  EXPECT_EQ(VLStrExpandTime(l, &t, b, &pos, 16, pattern, &pp, -1, 0), VL_RC_BADPATTERN);
  pp = 0;
  EXPECT_EQ(VLStrExpandTime(l, &t, b, &pos, 16, pattern, &pp, 2, 0), VL_RC_BADPATTERN);

  // In a shift-sensitive page the writers carry the state.
  VLLocale *j = loc("Japanese_Japan.IBM930");
  ASSERT_NE(j, nullptr);
  VLShiftState st = 0;
  pos = 0;
  EXPECT_EQ(VLStrWriteWordEx(j, b, &pos, &st, 16, 17, 0), 0u);  // a double-byte day name
  EXPECT_EQ(st, 1u);
  EXPECT_EQ(VLStrWriteNumberEx(j, b, &pos, &st, 16, 5, 2, 0, 0), 0u);
  EXPECT_EQ(st, 0u);
  EXPECT_EQ(std::string(b, static_cast<size_t>(pos)), iconvTo("月曜日", "IBM930") + "\xF0\xF5");
  // Two bytes left in the double-byte state: the shift-in and one digit.
  st = 1;
  pos = 14;
  EXPECT_EQ(VLStrWriteNumberEx(j, b, &pos, &st, 16, 5, 2, 0, 0), VL_RC_BUFFER);
  EXPECT_EQ(pos, 16);
  EXPECT_EQ(st, 0u);
}

}  // namespace
