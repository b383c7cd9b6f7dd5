// VLMapString in its four forms: selectors, special casing from hand-made language
// tables, shift bytes, output cuts, and agreement of every form with the UTF-16 form on
// every generated code page.
#include <gtest/gtest.h>

#include <unistd.h>
#include <sys/wait.h>

#include <array>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "codepage/cpbody.h"
#include "frame/frame.h"
#include "iconvcp.h"
#include "ucd.h"
#include "veltrin.h"

namespace {

constexpr uint32_t kUpper = VL_MAP_UPPER, kLower = VL_MAP_LOWER;
constexpr uint32_t kUpperSimple = VL_MAP_UPPER | VL_MAP_NOSPECIAL, kLowerSimple = VL_MAP_LOWER | VL_MAP_NOSPECIAL;

// A language object in memory whose tables 44 (upper) and 45 (lower) hold the given
// entries: key unit, second key unit or 0, one or two result units.
struct FakeLanguage {
  std::vector<uint8_t> body;
  VLObjEntry entry{};
  FakeLanguage(std::vector<std::array<uint16_t, 4>> upper, std::vector<std::array<uint16_t, 4>> lower) {
    body.assign(120, 0);
    auto put = [&](size_t at, uint16_t v) { std::memcpy(body.data() + at, &v, 2); };
    put(6, static_cast<uint16_t>(upper.size()));
    put(8, static_cast<uint16_t>(lower.size()));
    for (auto [table, rows] : {std::pair{98, &upper}, std::pair{100, &lower}}) {
      put(static_cast<size_t>(table), static_cast<uint16_t>(body.size()));
      for (const auto &e : *rows)
        for (uint16_t v : e) {
          body.resize(body.size() + 2);
          put(body.size() - 2, v);
        }
    }
    entry.type = VL_OBJ_LANGUAGE;
    entry.section[0] = body.data();
  }
};

// German sharp s and the Turkish i's, and pair keys: A with a combining ring, and I with
// a combining dot (which the single entry for I shadows).
FakeLanguage &specialLanguage() {
  static FakeLanguage lang({{0xDF, 0, 'S', 'S'}, {'i', 0, 0x130, 0}},
                           {{'I', 0x307, 'i', 0}, {'I', 0, 0x131, 0}, {0x130, 0, 'i', 0}, {'A', 0x30A, 0xE5, 0}});
  return lang;
}

class MapString : public ::testing::Test {
 protected:
  static void SetUpTestSuite() {
    if (!std::filesystem::exists(std::string(VL_TEST_DEFS_DIR) + "/control.nls")) return;
    up_ = VLInit(VL_TEST_DEFS_DIR, nullptr, nullptr, 0, VL_OPT_NOBUILTIN) == 0;
  }
  static void TearDownTestSuite() {
    if (up_) VLTerm();
    up_ = false;
  }
  void SetUp() override {
    if (!up_) GTEST_SKIP() << "no generated definitions in " << VL_TEST_DEFS_DIR;
  }
  void TearDown() override {
    for (VLLocale *l : held_) VLReleaseLocale(l);
  }
  // A handle on the named locale; a copy of it speaks the hand-made language when asked.
  VLLocale *locale(const char *name) {
    uint32_t rc = 0;
    VLLocale *l = VLGetLocale(name, 0, &rc);
    EXPECT_NE(l, nullptr) << name << " " << rc;
    if (l) held_.push_back(l);
    return l;
  }
  VLLocale withSpecial(const char *name) {
    VLLocale copy = *locale(name);
    copy.language = &specialLanguage().entry;
    return copy;
  }
  static inline bool up_ = false;
  std::vector<VLLocale *> held_;
};

std::u16string mapU(VLLocale *l, const std::u16string &in, uint32_t sel, int32_t cap = 64, int32_t inLen = -2) {
  VLUChar out[64] = {};
  int32_t n = VLMapStringU(l, out, cap, reinterpret_cast<const VLUChar *>(in.data()),
                           inLen == -2 ? static_cast<int32_t>(in.size()) : inLen, sel);
  return n < 0 ? u"<refused>" : std::u16string(reinterpret_cast<char16_t *>(out), static_cast<size_t>(n));
}

std::string mapBytes(VLLocale *l, const std::string &in, uint32_t sel, int32_t cap = 64) {
  char out[64] = {};
  int32_t n = VLMapString(l, out, cap, in.data(), static_cast<int32_t>(in.size()), sel);
  return n < 0 ? "<refused>" : std::string(out, static_cast<size_t>(n));
}

std::string mapEx(VLLocale *l, const std::string &in, uint32_t sel, int32_t cap = 64, VLShiftState st = 0) {
  char out[64] = {};
  int32_t n = VLMapStringEx(l, out, cap, in.data(), st, static_cast<int32_t>(in.size()), sel);
  return n < 0 ? "<refused>" : std::string(out, static_cast<size_t>(n));
}

TEST_F(MapString, UnicodeForm) {
  VLLocale plain = withSpecial("English_UnitedStates.Latin1");
  plain.language = nullptr;
  struct Row {
    const char *what;
    uint32_t sel;
    std::u16string in, want;
    int32_t cap = 64, inLen = -2;
  };
  const Row rows[] = {
      {"upper-cases ASCII, Latin-1 and y with diaeresis", kUpper, u"abc\u00E9\u00FF", u"ABC\u00C9\u0178"},
      {"lower-cases Greek with tonos and sigma", kLower, u"\u0386\u03A3", u"\u03AC\u03C3"},
      {"leaves Georgian small letters in upper case", kUpper, u"\u10D0", u"\u10D0"},
      {"a negative length maps and counts the terminator", kUpper, u"ab", std::u16string(u"AB\0", 3), 64, -1},
      {"stops at the output count", kUpper, u"abcd", u"AB", 2},
      {"widens ASCII and the space", VL_MAP_FULLWIDTH, u"A 1", u"\uFF21\u3000\uFF11"},
      {"narrows katakana and the ideographic comma", VL_MAP_HALFWIDTH, u"\u30A2\u3001\uFF41", u"\uFF71\uFF64a"},
      {"reads digits of any script", VL_MAP_DIGITS, u"\u0663x\u06F4\u00B2\u2089\uFF15\u0967", u"3x42951"},
      {"copies with selector 0", 0, u"aB", u"aB"},
      {"drops the character-length bit", kUpperSimple | VL_OPT_CHARLEN, u"ab", u"AB"},
  };
  for (const Row &r : rows) EXPECT_EQ(mapU(&plain, r.in, r.sel, r.cap, r.inLen), r.want) << r.what;
}

TEST_F(MapString, SpecialCasingInUnicode) {
  VLLocale sp = withSpecial("English_UnitedStates.Latin1");
  struct Row {
    const char *what;
    uint32_t sel;
    std::u16string in, want;
    int32_t cap = 64;
  };
  const Row rows[] = {
      {"sharp s upper-cases to SS", kUpper, u"stra\u00DFe", u"STRASSE"},
      {"without special casing sharp s stays", kUpperSimple, u"stra\u00DFe", u"STRA\u00DFE"},
      {"dotted i upper-cases to dotted capital I", kUpper, u"i\u0131", u"\u0130I"},
      {"capital I lower-cases to dotless i", kLower, u"I\u0130", u"\u0131i"},
      {"a pair key takes both units", kLower, u"A\u030Ax", u"\u00E5x"},
      {"the unit alone is looked up before the pair", kLower, u"I\u0307", u"\u0131\u0307"},
      {"simple lower-casing ignores the table", kLowerSimple, u"I", u"i"},
      {"a two-unit result that does not fit ends the mapping", kUpper, u"a\u00DF", u"A", 2},
  };
  for (const Row &r : rows) EXPECT_EQ(mapU(&sp, r.in, r.sel, r.cap), r.want) << r.what;
  EXPECT_EQ(sp.lastError, 0);
}

// Byte and W forms use the special table only for results their code page holds.
TEST_F(MapString, SpecialCasingInCodePages) {
  struct Row {
    const char *what;
    const char *locale;
    uint32_t sel;
    std::string in, want;
  };
  const Row rows[] = {
      {"Latin-1 sharp s", "German_Germany.Latin1", kUpper, "stra\xDF" "e", "STRASSE"},
      {"Latin-1 sharp s, simple", "German_Germany.Latin1", kUpperSimple, "stra\xDF" "e", "STRA\xDF" "E"},
      {"Latin-1 has no dotted capital I: simple upper case", "German_Germany.Latin1", kUpper, "i", "I"},
      {"Turkish page: dotted capital I", "German_Germany.ISO-8859-9", kUpper, "i", "\xDD"},
      {"Turkish page: dotless i", "German_Germany.ISO-8859-9", kLower, "I\xDD", "\xFDi"},
      {"UTF-8 sharp s", "German_Germany.UTF-8", kUpper, "\xC3\x9F", "SS"},
      {"UTF-8 dotless i", "German_Germany.UTF-8", kLower, "I", "\xC4\xB1"},
  };
  for (const Row &r : rows) {
    VLLocale sp = withSpecial(r.locale);
    EXPECT_EQ(mapBytes(&sp, r.in, r.sel), r.want) << r.what;
    EXPECT_EQ(mapEx(&sp, r.in, r.sel), r.want) << r.what << " (Ex)";
    std::vector<VLWChar> w(16), out(16);
    int32_t n = VLMbToWide(&sp, w.data(), 16, r.in.data(), static_cast<int32_t>(r.in.size()), 0);
    int32_t m = VLMapStringW(&sp, out.data(), 16, w.data(), n, r.sel);
    std::vector<VLWChar> want(16);
    int32_t k = VLMbToWide(&sp, want.data(), 16, r.want.data(), static_cast<int32_t>(r.want.size()), 0);
    EXPECT_EQ(std::vector<VLWChar>(out.begin(), out.begin() + std::max(m, 0)),
              std::vector<VLWChar>(want.begin(), want.begin() + k))
        << r.what << " (W)";
  }
}

TEST_F(MapString, RefusesBadSelectorsInEveryForm) {
  VLLocale *l = locale("English_UnitedStates.Latin1");
  ASSERT_TRUE(l);
  const uint32_t bad[] = {0x80000026u, 0x80000020u, VL_MAP_FULLWIDTH | VL_MAP_NOSPECIAL, 0x11u, 1u,
                          VL_MAP_UPPER | 0x1000u, VL_MAP_COPY | VL_MAP_NOSPECIAL};
  char out[8];
  VLUChar outU[8];
  VLWChar outW[8];
  const VLUChar inU[] = {'a', 0};
  const VLWChar inW[] = {'a', 0};
  for (uint32_t sel : bad) {
    struct Form {
      const char *name;
      int32_t got;
    } forms[] = {
        {"plain", VLMapString(l, out, 8, "a", 1, sel)},
        {"Ex", VLMapStringEx(l, out, 8, "a", 0, 1, sel)},
        {"W", VLMapStringW(l, outW, 8, inW, 1, sel)},
        {"U", VLMapStringU(l, outU, 8, inU, 1, sel)},
    };
    for (const Form &f : forms) {
      EXPECT_EQ(f.got, -1) << f.name << " selector " << std::hex << sel;
    }
    EXPECT_EQ(l->lastError, 2);
  }
  EXPECT_EQ(VLMapString(l, out, 8, "a", 1, kUpper), 1);
  EXPECT_EQ(l->lastError, 0);
}

// A shift-sensitive page: the Ex form writes the shift bytes its results need and
// closes a cut output.
TEST_F(MapString, ShiftBytesFollowTheMappedWidth) {
  VLLocale *l = locale("English_UnitedStates.IBM930");
  ASSERT_TRUE(l);
  const std::string fullA = "\x0E\x42\xC1\x0F", fullAB = "\x0E\x42\xC1\x42\xC2\x0F";
  struct Row {
    const char *what;
    uint32_t sel;
    std::string in, want;
    int32_t cap = 64;
    VLShiftState st = 0;
  };
  const Row rows[] = {
      {"widening opens and closes a double-byte run", VL_MAP_FULLWIDTH, "\xC1\xC2", fullAB},
      {"narrowing leaves the run", VL_MAP_HALFWIDTH, fullAB, "\xC1\xC2"},
      {"a run that does not fit with its Shift-In is left out", VL_MAP_FULLWIDTH, "\xC1", "", 3},
      {"a cut output is closed", VL_MAP_FULLWIDTH, "\xC1\xC2", fullA, 5},
      {"starting in the double-byte state", VL_MAP_HALFWIDTH, "\x42\xC1\x0F\xC2", "\x0F\xC1\xC2", 64, 1},
  };
  for (const Row &r : rows) EXPECT_EQ(mapEx(l, r.in, r.sel, r.cap, r.st), r.want) << r.what;
  VLLocale *latin = locale("English_UnitedStates.IBM939");
  ASSERT_TRUE(latin);
  EXPECT_EQ(mapEx(latin, "\x81\x0E\x42\x82\x0F", kUpperSimple), "\xC1\x0E\x42\xC2\x0F")
      << "each state keeps its case partner";
}

TEST_F(MapString, CharacterLengthsInThePlainForm) {
  VLLocale *l = locale("English_UnitedStates.MS932");
  ASSERT_TRUE(l);
  char out[16] = {};
  // Full-width a, b and a plain c, upper-cased; two characters fit the request.
  EXPECT_EQ(VLMapString(l, out, 2, "\x82\x81\x82\x82" "c", 3, kUpperSimple | VL_OPT_CHARLEN), 2);
  EXPECT_EQ(std::string(out, 4), "\x82\x60\x82\x61");
  EXPECT_EQ(VLMapString(l, out, 3, "ab", 2, VL_MAP_COPY | VL_OPT_CHARLEN), 2);
  EXPECT_EQ(std::string(out, 2), "ab");
}

// Every character each generated page holds, mapped alone by every selector in the byte
// forms and the W form, against the UTF-16 form on its unit. Two things the page decides:
// beyond the unit mappings' ranges its case deltas follow the database, and in a shift page
// a character keeps its case when the partner lives in the other state.
TEST_F(MapString, EveryFormAgreesWithUnicodeOnEveryPage) {
  static mkdefs::UnicodeProps ucd;
  std::string err;
  ASSERT_TRUE(mkdefs::loadUnicode("", &ucd, &err)) << err;
  VLLocale *base = locale("English_UnitedStates.Latin1");
  ASSERT_TRUE(base);
  const uint32_t sels[] = {kUpper, kLower, VL_MAP_FULLWIDTH, VL_MAP_HALFWIDTH, VL_MAP_DIGITS};
  size_t pages = 0, checked = 0, pageDecides = 0;
  for (const mkdefs::CodePageDef &def : mkdefs::codeCodePageDefs()) {
    uint32_t rc = 0;
    VLObjEntry *cp = VLGetObjFromID(vlglobals->objManager, VL_OBJ_CODEPAGE, def.id, 0, &rc);
    if (!cp) continue;
    VLLocale l = *base;
    l.language = nullptr;
    l.codePage = cp;
    l.flags = static_cast<uint16_t>((l.flags & ~(VL_LF_SINGLEBYTE | VL_LF_SHIFT)) |
                                    (vl::cp::maxLen(cp) == 1 ? VL_LF_SINGLEBYTE : 0) |
                                    (vl::cp::isShift(cp) ? VL_LF_SHIFT : 0));
    const bool shift = vl::cp::isShift(cp);
    ++pages;
    auto decode = [&](VLWChar w) -> VLUChar {
      return w <= 0xFF ? vl::cp::sbcsUni(cp, static_cast<uint8_t>(w)) : VLCpMbToUnicodeW(cp, w);
    };
    auto held = [&](VLUChar u, VLWChar *w) {
      *w = VLCpUnicodeToCharW(cp, u);
      return u != 0xFFFD && decode(*w) == u;
    };
    // The bytes of a W value in the state it needs, as the Ex form writes them alone.
    auto bytesOf = [&](VLWChar w) {
      unsigned char b[4];
      std::string s(reinterpret_cast<char *>(b), static_cast<size_t>(VLWToMb(b, w)));
      return shift && w > 0xFF ? "\x0E" + s + "\x0F" : s;
    };
    size_t bad = 0;
    for (uint32_t u = 1; u < 0x10000 && bad < 5; ++u) {
      VLWChar w;
      if (!held(static_cast<VLUChar>(u), &w)) continue;
      for (uint32_t sel : sels) {
        VLUChar in = static_cast<VLUChar>(u), r = 0;
        ASSERT_EQ(VLMapStringU(&l, &r, 1, &in, 1, sel), 1);
        VLWChar rw = 0;
        const bool rHeld = held(r, &rw);
        if (sel == kUpper || sel == kLower) {
          const uint16_t db = sel == kUpper ? ucd.upper[u] : ucd.lower[u];
          const bool otherState = shift && rHeld && (rw > 0xFF) != (w > 0xFF);
          if (def.id != VL_CP_UTF8 && (db != r || otherState)) {
            ++pageDecides;
            continue;
          }
        }
        ++checked;
        VLWChar gotW = 0;
        VLMapStringW(&l, &gotW, 1, &w, 1, sel);
        // The result is a character standing for the mapped unit, else the character itself.
        const bool ok = decode(gotW) == r || (gotW == w && !rHeld);
        const std::string in1 = bytesOf(w), want = bytesOf(gotW);
        char out[16];
        int32_t n = VLMapStringEx(&l, out, 16, in1.data(), 0, static_cast<int32_t>(in1.size()), sel);
        std::string gotEx(out, static_cast<size_t>(std::max(n, 0)));
        std::string gotPlain = want;
        if (!shift) {
          n = VLMapString(&l, out, 16, in1.data(), static_cast<int32_t>(in1.size()), sel);
          gotPlain.assign(out, static_cast<size_t>(std::max(n, 0)));
        }
        if (!ok || gotEx != want || gotPlain != want) {
          ++bad;
          ADD_FAILURE() << def.name << std::hex << " U+" << u << " selector " << sel << ": W " << gotW
                        << " for U+" << r << (ok ? ", byte forms differ" : "");
        }
      }
    }
  }
  EXPECT_GT(pages, 20u);
  EXPECT_GT(checked, 100000u);
  RecordProperty("page_decides", static_cast<int>(pageDecides));
}

}  // namespace

namespace {

struct ToolRun {
  int status;
  std::string out, err;
};

// A file under /tmp removed afterwards.
struct TempFile {
  std::string path;
  explicit TempFile(const std::string &content) {
    char p[] = "/tmp/maptestXXXXXX";
    int fd = mkstemp(p);
    path = p;
    EXPECT_EQ(write(fd, content.data(), content.size()), static_cast<ssize_t>(content.size()));
    close(fd);
  }
  ~TempFile() { std::remove(path.c_str()); }
};

// Runs tlx map with the generated definitions; redirect is appended to the command line.
ToolRun runMap(const std::string &args, const std::string &redirect = "") {
  TempFile err("");
  const std::string cmd =
      std::string(VL_TEST_TLX) + " map --dir " + VL_TEST_DEFS_DIR + " " + args + " " + redirect + " 2>" + err.path;
  ToolRun r;
  FILE *p = popen(cmd.c_str(), "r");
  char buf[4096];
  size_t n;
  while (p && (n = std::fread(buf, 1, sizeof buf, p)) > 0) r.out.append(buf, n);
  r.status = p ? WEXITSTATUS(pclose(p)) : -1;
  std::ifstream e(err.path);
  r.err.assign(std::istreambuf_iterator<char>(e), {});
  return r;
}

// Lines of mixed text, long enough for several chunks, with characters of every length
// straddling the chunk ends.
std::string longText(const std::string &line, char lf, size_t bytes) {
  std::string t;
  for (size_t i = 0; t.size() < bytes; ++i) {
    t += line;
    if (i % 7 != 6) t += lf;  // some lines run on into the next
  }
  return t;
}

TEST_F(MapString, ToolStreamsLikeOneCall) {
  struct Row {
    const char *what;
    const char *locale;
    const char *option;
    uint32_t sel;
    std::string line;
  };
  const Row rows[] = {
      {"UTF-8 upper case", "German_Germany.UTF-8", "--upper --simple", kUpperSimple,
       "Gr\xC3\xBC\xC3\x9F" "e \xCE\xB1\xCE\xB2 \xE3\x81\x82 stra\xC3\x9F" "e"},
      {"MS932 full width", "Japanese_Japan.MS932", "--full-width", VL_MAP_FULLWIDTH, "abc \x82\xA0\xB1 123"},
      {"IBM930 half width", "English_UnitedStates.IBM930", "--half-width", VL_MAP_HALFWIDTH,
       "\xC1\x0E\x42\xC1\x42\xC2\x44\x5C\x0F\xC2\x40\x0E\x42\xF1\x45\x41\x0F"},
      {"Latin-1 digits", "German_Germany.Latin1", "--digits", VL_MAP_DIGITS, "x\xB2y\xB3 12"},
  };
  for (const Row &r : rows) {
    VLLocale *l = locale(r.locale);
    ASSERT_TRUE(l) << r.locale;
    const std::string text = longText(r.line, static_cast<char>(vl::cp::body(l->codePage)[vl::cp::kLf]), 200 * 1024);
    std::vector<char> want(text.size() * 6 + 16);
    int32_t n = VLMapStringEx(l, want.data(), static_cast<int32_t>(want.size()), text.data(), 0,
                              static_cast<int32_t>(text.size()), r.sel);
    ASSERT_GT(n, 0) << r.what;
    TempFile in(text);
    ToolRun run = runMap(std::string(r.option) + " --locale " + r.locale + " " + in.path);
    EXPECT_EQ(run.status, 0) << r.what << ": " << run.err;
    EXPECT_TRUE(run.out == std::string(want.data(), static_cast<size_t>(n))) << r.what;
  }
}

TEST_F(MapString, ToolCommandLine) {
  TempFile cut("abc\xC3"), sharp("stra\xDF" "e\n"), abc("ABC\n");
  struct Row {
    const char *what;
    std::string args, redirect;
    int status;
    std::string out, errHas;
  };
  const Row rows[] = {
      {"standard input in a single-byte page", "--upper --simple --locale German_Germany.Latin1", "<" + sharp.path, 0,
       "STRA\xDF" "E\n", ""},
      {"a platform locale name", "--lower --locale C", "<" + abc.path, 0, "abc\n", ""},
      {"an incomplete last character", "--upper --locale German_Germany.UTF-8 " + cut.path, "", 1, "ABC",
       "byte offset 3"},
      {"a missing file", "--upper --locale German_Germany.UTF-8 /nonexistent/x", "", 1, "", "/nonexistent/x"},
      {"no mapping", "--locale German_Germany.UTF-8", "</dev/null", 2, "", "usage"},
      {"two mappings", "--upper --lower", "</dev/null", 2, "", "one mapping"},
      {"simple with width", "--simple --full-width", "</dev/null", 2, "", "--simple"},
      {"an unknown locale", "--upper --locale Nowhere_Nothing.X", "</dev/null", 1, "", "no locale"},
  };
  for (const Row &r : rows) {
    ToolRun run = runMap(r.args, r.redirect);
    EXPECT_EQ(run.status, r.status) << r.what << ": " << run.err;
    EXPECT_EQ(run.out, r.out) << r.what;
    EXPECT_NE(run.err.find(r.errHas), std::string::npos) << r.what << ": " << run.err;
  }
}

}  // namespace
