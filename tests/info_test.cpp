// Information items: the four getter forms agree on every item of every locale; setters
// refuse bad values without touching the handle; sizes, sources and shift states.
#include <gtest/gtest.h>

#include <cstring>
#include <filesystem>
#include <random>
#include <string>
#include <vector>

#include "codepage/cpbody.h"
#include "store/store.h"
#include "support/sortmem.h"
#include "support/defdir.h"
#include "support/hooks.h"

namespace {

bool numItem(int i) { return i == 1 || i == 5 || i == 9 || i == 11 || i == 58 || i == 63 || i == 69 || i == 70 || (i >= 73 && i <= 78) || (i >= 82 && i <= 87); }
bool textItem(int i) { return i >= 1 && i <= 88 && (!numItem(i)); }
bool charItem(int i) { return i == 59 || i == 60 || i == 61 || i == 66 || i == 67; }

std::string get(VLLocale *l, int item, uint32_t options = 0, int32_t size = 512) {
  char b[512];
  int32_t n = VLGetLocaleTextInfo(l, item, b, size, options);
  return n < 1 ? "<" + std::to_string(n) + ">" : std::string(b, static_cast<size_t>(n - 1));
}
std::string getEx(VLLocale *l, int item, VLShiftState state, int32_t size = 512) {
  char b[512];
  int32_t n = VLGetLocaleTextInfoEx(l, item, b, state, size, 0);
  return n < 1 ? "<" + std::to_string(n) + ">" : std::string(b, static_cast<size_t>(n - 1));
}

// Every item through the plain, Ex, W and U getters, from both sources: the same text.
void checkAllForms(VLLocale *l, const std::string &what, bool unicodeToo = true) {
  const VLCodePage *cp = l->codePage;
  const bool shift = (l->flags & VL_LF_SHIFT) != 0;
  for (int item = 0; item <= 90; ++item) {
    for (uint32_t src : {0u, 1u}) {
      SCOPED_TRACE(what + " item " + std::to_string(item) + " source " + std::to_string(src));
      char plain[512], ex[512];
      VLWChar w[256];
      VLUChar u[256];
      int32_t np = VLGetLocaleTextInfo(l, item, plain, sizeof plain, src);
      int32_t nx = VLGetLocaleTextInfoEx(l, item, ex, 0, sizeof ex, src);
      int32_t nw = VLGetLocaleTextInfoW(l, item, w, 256, src);
      int32_t nu = VLGetLocaleTextInfoU(l, item, u, 256, src);
      if (!textItem(item)) {
        EXPECT_TRUE(np == -1 && nx == -1 && nw == -1 && nu == -1);
        EXPECT_EQ(VLGetError(l), VL_RC_BADITEM);
      }
      EXPECT_EQ(VLGetLocaleNumInfo(l, item, static_cast<int32_t>(src)) >= 0, numItem(item));
      if (!textItem(item)) continue;
      ASSERT_GT(np, 0);
      EXPECT_EQ(plain[np - 1], 0);
      EXPECT_EQ(std::string(plain, np), std::string(ex, nx));
      // W values packed back into bytes, shift bytes around double-byte runs.
      std::string fromW;
      bool wide = false;
      for (int32_t i = 0; i + 1 < nw; ++i) {
        unsigned char b[4];
        int k = VLWToMb(b, w[i]);
        if (shift && (k > 1) != wide) fromW += static_cast<char>((wide = k > 1) ? vl::cp::shiftOut(cp) : vl::cp::shiftIn(cp));
        fromW.append(reinterpret_cast<char *>(b), static_cast<size_t>(k));
      }
      if (wide) fromW += static_cast<char>(vl::cp::shiftIn(cp));
      EXPECT_EQ(fromW, std::string(plain, np - 1));
      // Characters counted: as many as W values.
      EXPECT_EQ(VLGetLocaleTextInfo(l, item, plain, 512, src | VL_OPT_CHARLEN), nw);
      // UTF-16 brought into the code page gives the same bytes (a character item whose
      // value has no single byte reads as empty in the code page only).
      unsigned char fromU[1024] = {0};
      int32_t k = VLCpUnicodeToStr(cp, u, nu - 1, 0, fromU);
      if (unicodeToo && !(charItem(item) && np == 1)) {
        EXPECT_EQ(std::string(reinterpret_cast<char *>(fromU), k), std::string(plain, np - 1));
      }
    }
  }
}

class Info : public ::testing::Test {
 protected:
  static void SetUpTestSuite() {
    dir_ = new ts::TempDir;
    ts::DefDir d = ts::DefDir::standard();
    ts::Bytes sortBody;
    std::string err;
    sortmem::sampleBody().bytes(&sortBody, &err);
    d.add(3, 5, "Phonebook", {sortBody});
    // A page where "." is a double-byte character: no handle can take it as punctuation.
    auto wideDot = ts::doubleByteSource(934, "WIDEDOT");
    wideDot.fromUni[u'.'] = "\x82\x40";
    d.addCodePage(wideDot);
    d.write(dir_->path, "Latin1 ISO-8859-1\n");
  }
  static void TearDownTestSuite() { delete dir_; }
  void TearDown() override {
    lib_.reset();
    EXPECT_EQ(ts::hooks.live, 0);
  }
  VLLocale *open(const char *name, const char *dir = nullptr) {
    lib_.reset();
    lib_ = std::make_unique<ts::Library>(dir ? dir : dir_->path.c_str());
    uint32_t rc;
    return VLGetLocale(name, 0, &rc);
  }
  static inline ts::TempDir *dir_ = nullptr;
  std::unique_ptr<ts::Library> lib_;
};

TEST_F(Info, BuiltinLocaleValues) {
  ts::TempDir empty;
  VLLocale *l = open("", empty.path.c_str());
  ASSERT_EQ(lib_->rc, VL_RC_DEFAULTS);
  ASSERT_NE(l, nullptr);
  const std::pair<int, const char *> texts[] = {
      {2, "English"}, {3, "EN"}, {6, "UnitedStates"}, {8, "United States"}, {10, "US-ASCII"}, {12, "Binary"},
      {13, "UnitedStates"}, {14, "US-ASCII"}, {15, "Binary"}, {16, "Sunday"}, {22, "Saturday"}, {29, "Sat"},
      {30, "January"}, {41, "December"}, {42, ""}, {54, "Dec"}, {56, "AM"}, {57, "PM"}, {59, "."}, {60, ","},
      {62, "3;0"}, {64, "$"}, {65, "USD"}, {71, ""}, {72, "-"}, {79, "%#I:%M:%S %p"}, {81, "%A, %B %d, %Y"},
      {88, "English_UnitedStates.US-ASCII@Binary"}};
  for (auto [item, want] : texts) EXPECT_EQ(get(l, item), want) << item;
  const std::pair<int, int> nums[] = {{1, 1}, {5, 1}, {9, 1}, {11, 0}, {58, 0}, {63, 2}, {69, 2}, {70, 2},
                                      {73, 1}, {74, 0}, {75, 1}, {76, 0}, {77, 1}, {78, 1}, {82, 0}, {83, 0},
                                      {84, 840}, {85, 1}, {86, 1}, {87, 0}};
  for (auto [item, want] : nums) EXPECT_EQ(VLGetLocaleNumInfo(l, item, 0), want) << item;
  checkAllForms(l, "built-in");
  VLReleaseLocale(l);
}

// Every language with its defaults, every territory and every code page under the first
// language.
TEST_F(Info, FormsAgreeOnGeneratedDefinitions) {
  if (!std::filesystem::exists(VL_TEST_DEFS_DIR "/control.nls")) GTEST_SKIP() << "no generated definitions";
  lib_ = std::make_unique<ts::Library>(VL_TEST_DEFS_DIR);
  ASSERT_EQ(lib_->rc, 0u);
  VLObjManager *m = vlglobals->objManager;
  std::vector<std::string> names;
  const char *first = m->entries[m->typeStart[0]].name;
  for (int t = 0; t < 3; ++t)
    for (uint16_t i = m->typeStart[t]; i < m->typeStart[t + 1]; ++i)
      names.push_back(t == 0   ? std::string(m->entries[i].name)
                      : t == 1 ? std::string(first) + "_" + m->entries[i].name
                               : std::string(first) + "." + m->entries[i].name);
  for (const std::string &n : names) {
    uint32_t rc;
    VLLocale *l = VLGetLocale(n.c_str(), 0, &rc);
    ASSERT_NE(l, nullptr) << n << " rc " << rc;
    checkAllForms(l, n);
    VLReleaseLocale(l);
  }
}

TEST_F(Info, SizesSourcesAndOptions) {
  VLLocale *l = open("German_Germany.MS932");
  ASSERT_NE(l, nullptr);
  char b[16];
  EXPECT_EQ(VLGetLocaleTextInfo(l, 59, b, 10, 0), 2);  // one character and the NUL
  EXPECT_STREQ(b, ",");
  EXPECT_EQ(get(l, 30, 0, 3), "Ge");  // cut, terminated
  EXPECT_EQ(get(l, 30, 0, 1), "");
  EXPECT_EQ(VLGetLocaleTextInfo(l, 30, b, 0, 0), 0);
  EXPECT_EQ(VLGetLocaleTextInfo(l, 30, nullptr, 4, 0), -1);
  EXPECT_EQ(VLGetError(l), VL_RC_BADARG);
  EXPECT_EQ(VLGetLocaleTextInfo(l, 30, b, 4, 0x8), -1);
  EXPECT_EQ(VLGetError(l), VL_RC_BADARG);
  EXPECT_EQ(VLGetLocaleNumInfo(l, 63, 2), -1);
  EXPECT_EQ(VLGetError(l), VL_RC_BADARG);
  VLLocale blank{};  // a record without objects
  EXPECT_EQ(VLGetLocaleTextInfo(&blank, 2, b, 16, 0), -1);
  EXPECT_EQ(VLSetLocaleNumInfo(&blank, 63, 1, 0), 0);
  EXPECT_EQ(blank.lastError, static_cast<int32_t>(VL_RC_BADARG));
  // A double-byte character never split: U+4E01 is 0x81 0x41 here.
  ASSERT_EQ(VLSetLocaleTextInfo(l, 64, "A\x81\x41" "B", -1, 0), 1);
  EXPECT_EQ(get(l, 64, 0, 3), "A");
  EXPECT_EQ(get(l, 64, 0, 4), "A\x81\x41");
  EXPECT_EQ(VLGetLocaleTextInfo(l, 64, b, 3, VL_OPT_CHARLEN), 3);  // two characters and the NUL
  EXPECT_STREQ(b, "A\x81\x41");
  VLUChar u[8];
  EXPECT_EQ(VLGetLocaleTextInfoU(l, 64, u, 8, 0), 4);
  EXPECT_EQ(u[1], 0x4E01);
  EXPECT_EQ(get(l, 64, VL_OPT_DEFAULTS), std::string(1, static_cast<char>(vl::cp::subst(l->codePage))))
      << "the territory's euro sign has no form here";
  // Overrides against defaults.
  EXPECT_EQ(VLSetLocaleNumInfo(l, 63, 5, 0), 1);
  EXPECT_EQ(VLGetLocaleNumInfo(l, 63, 0), 5);
  EXPECT_EQ(VLGetLocaleNumInfo(l, 63, 1), 2);
  EXPECT_EQ(VLSetLocaleNumInfo(l, 75, 0, 0), 1);
  EXPECT_EQ(VLGetLocaleNumInfo(l, 75, 0), 0);
  EXPECT_EQ(VLGetLocaleNumInfo(l, 75, 1), 1);
  EXPECT_EQ(VLSetLocaleNumInfo(l, 78, 0x1203, 0), 1);
  EXPECT_EQ(VLGetLocaleNumInfo(l, 78, 0), 3);
  EXPECT_EQ(l->setMask, 0x1u | 0x20u | 0x400u | 0x20000u);
  EXPECT_EQ(l->setMaskU, 0x40);
  // Sorts: by id, removed by 0, by name.
  EXPECT_EQ(VLSetLocaleNumInfo(l, 11, 5, 0), 1);
  EXPECT_EQ(get(l, 88), "German_Germany.MS932@Phonebook");
  EXPECT_EQ(l->flags & VL_LF_BINARY, 0);
  EXPECT_EQ(VLSetLocaleNumInfo(l, 11, 0, 0), 1);
  EXPECT_EQ(VLGetLocaleNumInfo(l, 11, 0), 0);
  EXPECT_EQ(get(l, 12), "Binary");
  EXPECT_EQ(get(l, 88), "German_Germany.MS932@Binary");
  EXPECT_EQ(l->flags & VL_LF_BINARY, VL_LF_BINARY);
  EXPECT_EQ(VLSetLocaleTextInfo(l, 12, "phonebook", -1, 0), 1);
  EXPECT_EQ(VLGetLocaleNumInfo(l, 11, 0), 5);
  VLReleaseLocale(l);
}

// Everything a setter may change, pointers included: a refused value changes none of it.
struct Image {
  VLLocale raw;
  std::vector<std::string> texts;
  std::vector<std::u16string> textsU;
  explicit Image(const VLLocale *l) : raw(*l) {
    for (int i = 0; i < 8; ++i) {
      texts.emplace_back(l->texts[i]);
      textsU.emplace_back(reinterpret_cast<const char16_t *>(l->textsU[i]));
    }
  }
  bool operator==(const Image &o) const {
    const VLLocale &a = raw, &b = o.raw;
    return a.language == b.language && a.territory == b.territory && a.codePage == b.codePage && a.sort == b.sort &&
           a.setMask == b.setMask && !std::memcmp(a.num, b.num, sizeof a.num) && a.flags == b.flags &&
           !std::memcmp(a.chars, b.chars, sizeof a.chars) && !std::memcmp(a.texts, b.texts, sizeof a.texts) &&
           a.setMaskU == b.setMaskU && !std::memcmp(a.wchars, b.wchars, sizeof a.wchars) &&
           !std::memcmp(a.textsU, b.textsU, sizeof a.textsU) && texts == o.texts && textsU == o.textsU;
  }
};

TEST_F(Info, RefusedValuesLeaveTheHandleAlone) {
  struct Case {
    const char *locale;
    int item;
    const char *data;  // null: the numeric setter
    int32_t value;     // text length, or the number
    uint32_t options;
    uint32_t rc;
  } cases[] = {
      {"English", 60, ".", -1, 0, VL_RC_NOTFOUND},    // equal to the decimal separator
      {"English", 60, "5", -1, 0, VL_RC_NOTFOUND},    // a digit
      {"English", 59, ",", -1, 0, VL_RC_NOTFOUND},
      {"English", 59, "\0", 1, 0, VL_RC_NOTFOUND},    // the decimal separator cannot be empty
      {"English", 66, ",x", -1, 0, VL_RC_NOTFOUND},
      {"English", 67, "0", -1, 0, VL_RC_NOTFOUND},
      {"English", 65, "EUR", -1, 0, VL_RC_BADITEM},   // not settable
      {"English", 63, "5", -1, 0, VL_RC_BADITEM},     // numeric
      {"English", 89, "x", -1, 0, VL_RC_BADITEM},
      {"English", 0, "x", -1, 0, VL_RC_BADITEM},
      {"English", 64, "x", -1, 0x1, VL_RC_BADARG},
      {"English", 2, "Klingon", -1, 0, VL_RC_NOTFOUND},
      {"English", 6, "Atlantis", -1, 0, VL_RC_NOTFOUND},
      {"English", 10, "EBCDIC-X", -1, 0, VL_RC_NOTFOUND},
      {"English", 12, "Dictionary", -1, 0, VL_RC_NOTFOUND},
      {"English", 6, "Germany", 6, 0, VL_RC_NOTFOUND}, // "German" is no territory
      {"English.MS932", 59, "\x81\x40", -1, 0, VL_RC_NOTFOUND},  // a double-byte character
      {"English.MS932", 2, "\x81\x40", -1, 0, VL_RC_NOTFOUND},
      {"German_UnitedStates.IBM-930", 60, "\xF5", -1, 0, VL_RC_NOTFOUND},  // EBCDIC digit five
      {"German_UnitedStates.IBM-930", 61, "\x0E\x45\x41\x0F", -1, 0, VL_RC_NOTFOUND},
      {"German_UnitedStates.IBM-930", 2, "\xC5\x0E\x45\x41\x0F", -1, 0, VL_RC_NOTFOUND},
      {"German_UnitedStates.IBM-930", 2, "English", -1, 0, VL_RC_NOTFOUND},  // ASCII bytes mean nothing here
      {"English", 10, "WIDEDOT", -1, 0, VL_RC_NOSBCSPUNCT},
      {"English", 1, nullptr, 3, 0, VL_RC_NOTFOUND},
      {"English", 5, nullptr, 277, 0, VL_RC_NOTFOUND},
      {"English", 9, nullptr, 934, 0, VL_RC_NOSBCSPUNCT},
      {"English", 11, nullptr, 6, 0, VL_RC_NOTFOUND},
      {"English", 73, nullptr, 2, 0, VL_RC_NOTFOUND},
      {"English", 58, nullptr, 1, 0, VL_RC_BADITEM},
      {"English", 84, nullptr, 1, 0, VL_RC_BADITEM},
      {"English", 64, nullptr, 0, 0, VL_RC_BADITEM},
  };
  lib_ = std::make_unique<ts::Library>(dir_->path.c_str());
  for (const Case &c : cases) {
    SCOPED_TRACE(std::string(c.locale) + " item " + std::to_string(c.item));
    uint32_t rc;
    VLLocale *l = VLGetLocale(c.locale, 0, &rc);
    ASSERT_NE(l, nullptr);
    Image before(l);
    int ok = c.data ? VLSetLocaleTextInfo(l, c.item, c.data, c.value, c.options)
                    : VLSetLocaleNumInfo(l, c.item, c.value, 0);
    EXPECT_EQ(ok, 0);
    EXPECT_EQ(VLGetError(l), static_cast<int32_t>(c.rc));
    EXPECT_TRUE(Image(l) == before);
    EXPECT_EQ(VLSetLocaleTextInfo(l, 64, nullptr, 3, 0), 0);
    EXPECT_EQ(VLGetError(l), static_cast<int32_t>(VL_RC_BADARG));
    EXPECT_TRUE(Image(l) == before);
    VLReleaseLocale(l);
  }
}

TEST_F(Info, OutOfMemoryLeavesTheTextAlone) {
  VLLocale *l = open("English");
  ASSERT_NE(l, nullptr);
  for (long k = 1; k <= 3; ++k) {
    Image before(l);
    ts::hooks.failAt = ts::hooks.allocs + k;
    EXPECT_EQ(VLSetLocaleTextInfo(l, 64, "a longer currency", -1, 0), 0) << k;
    EXPECT_EQ(VLGetError(l), static_cast<int32_t>(VL_RC_NOMEM));
    EXPECT_TRUE(Image(l) == before) << k;
  }
  ts::hooks.failAt = -1;
  VLReleaseLocale(l);
}

TEST_F(Info, SettersInEveryForm) {
  VLLocale *l = open("German_Germany.Latin1");
  ASSERT_NE(l, nullptr);
  const VLWChar w[] = {'U', 'S', '$', 0};
  const VLUChar u[] = {u'\u00a3', 'x', 0};
  EXPECT_EQ(VLSetLocaleTextInfoW(l, 64, w, -1, 0), 1);
  EXPECT_EQ(get(l, 64), "US$");
  EXPECT_EQ(VLSetLocaleTextInfoU(l, 64, u, 1, 0), 1);
  EXPECT_EQ(get(l, 64), "\xA3");
  EXPECT_EQ(VLSetLocaleTextInfo(l, 79, "%H.%M and more", 5, 0), 1);
  EXPECT_EQ(get(l, 79), "%H.%M");
  EXPECT_EQ(VLSetLocaleTextInfo(l, 64, "abc", 0, 0), 1) << "length 0 changes nothing";
  EXPECT_EQ(get(l, 64), "\xA3");
  // A separator override survives a change of territory; the others follow it.
  EXPECT_EQ(VLSetLocaleTextInfo(l, 60, " ", 1, 0), 1);
  EXPECT_EQ(VLSetLocaleTextInfo(l, 6, "UNITEDSTATES", -1, 0), 1);
  EXPECT_EQ(get(l, 59), ".");
  EXPECT_EQ(get(l, 60), " ");
  EXPECT_EQ(get(l, 60, VL_OPT_DEFAULTS), ",");
  EXPECT_EQ(VLSetLocaleTextInfo(l, 10, "iso-8859-1", -1, 0), 1) << "an alias";
  EXPECT_EQ(VLSetLocaleTextInfo(l, 10, "MS932", -1, 0), 1);
  EXPECT_EQ(VLSetLocaleNumInfo(l, 1, 1, 0), 1);
  EXPECT_EQ(VLSetLocaleTextInfo(l, 60, "", 1, 0), 1) << "no group separator";
  EXPECT_EQ(get(l, 88), "English_UnitedStates.MS932@Binary");
  EXPECT_EQ(get(l, 60), "");
  VLReleaseLocale(l);
}

TEST_F(Info, ShiftStatesInAnEbcdicPage) {
  VLLocale *l = open("German_UnitedStates.IBM-930");
  ASSERT_NE(l, nullptr);
  // Names are ASCII in the store and EBCDIC in the page.
  EXPECT_EQ(get(l, 2), "\xC7\x85\x99\x94\x81\x95");
  EXPECT_EQ(VLSetLocaleTextInfo(l, 2, "\xC5\x95\x87\x93\x89\xA2\x88", -1, 0), 1);
  EXPECT_EQ(VLGetLocaleNumInfo(l, 1, 0), 1);
  // Ex input starting in the double-byte state, then single-byte "A".
  ASSERT_EQ(VLSetLocaleTextInfoEx(l, 64, "\x45\x41\x0F\xC1", 1, -1, 0), 1);
  EXPECT_STREQ(l->texts[1], "\x0E\x45\x41\x0F\xC1");
  EXPECT_EQ(getEx(l, 64, 0), "\x0E\x45\x41\x0F\xC1");
  EXPECT_EQ(getEx(l, 64, 1), "\x45\x41\x0F\xC1");
  EXPECT_EQ(get(l, 64), "\x0E\x45\x41\x0F\xC1");
  EXPECT_EQ(getEx(l, 64, 0, 4), "") << "the double-byte character needs SO, 2 bytes, SI and NUL";
  EXPECT_EQ(getEx(l, 64, 0, 5), "\x0E\x45\x41\x0F");
  EXPECT_EQ(getEx(l, 64, 1, 2), "\x0F") << "a closing shift-in even when nothing else fits";
  EXPECT_EQ(getEx(l, 59, 1, 10), std::string("\x0F") + static_cast<char>(l->chars[2])) << "one character";
  // A double-byte character cut short in the input is dropped, and the text closed.
  ASSERT_EQ(VLSetLocaleTextInfoEx(l, 72, "\xC1\x0E\x45\x41\x46", 0, -1, 0), 1);
  EXPECT_STREQ(l->texts[4], "\xC1\x0E\x45\x41\x0F");
  // Counting characters: two characters are A and one double-byte character.
  ASSERT_EQ(VLSetLocaleTextInfo(l, 71, "\xC1\x0E\x45\x41\x45\x42\x0F", 2, VL_OPT_CHARLEN), 1);
  EXPECT_STREQ(l->texts[3], "\xC1\x0E\x45\x41\x0F");
  VLUChar u[8];
  EXPECT_EQ(VLGetLocaleTextInfoU(l, 71, u, 8, 0), 3);
  EXPECT_EQ(u[1], 0x4E00);
  VLReleaseLocale(l);
}

// Arbitrary bytes, lengths and options through every setter: nothing breaks, and the
// byte forms still agree (arbitrary bytes need not be characters, so UTF-16 may differ).
TEST_F(Info, ArbitraryInputKeepsTheFormsInAgreement) {
  std::mt19937 rng(12345);
  for (const char *name : {"German_Germany.Latin1", "English.MS932", "German_UnitedStates.IBM-930"}) {
    VLLocale *l = open(name);
    ASSERT_NE(l, nullptr) << name;
    for (int round = 0; round < 400; ++round) {
      char data[48];
      VLWChar w[12];
      VLUChar u[12];
      for (char &c : data) c = static_cast<char>(rng() % 4 ? rng() % 256 : "\x0E\x0F\x81,.;0"[rng() % 7]);
      for (VLWChar &c : w) c = rng() % 2 ? rng() % 0x100 : 0x8100 + rng() % 0x200;
      for (VLUChar &c : u) c = static_cast<VLUChar>(rng() % 2 ? rng() % 0x80 : rng());
      data[47] = 0;
      w[11] = 0;
      u[11] = 0;
      int item = 55 + static_cast<int>(rng() % 30);
      int32_t len = static_cast<int32_t>(rng() % 14) - 2;
      uint32_t opt = rng() % 3 ? 0 : VL_OPT_CHARLEN;
      switch (rng() % 4) {
        case 0: VLSetLocaleTextInfo(l, item, data, len, opt); break;
        case 1: VLSetLocaleTextInfoEx(l, item, data, rng() % 2, len, opt); break;
        case 2: VLSetLocaleTextInfoW(l, item, w, len, opt); break;
        default: VLSetLocaleTextInfoU(l, item, u, len, opt); break;
      }
    }
    checkAllForms(l, std::string("arbitrary ") + name, false);
    VLReleaseLocale(l);
  }
}

// The tool prints items numbered and named, and marks what the handle overrides.
TEST_F(Info, ToolListsItems) {
  std::string cmd = std::string(VL_TEST_TLX) + " info German_Germany.Latin1 --items 2,59-60,88 --dir " + dir_->path;
  FILE *p = popen(cmd.c_str(), "r");
  ASSERT_NE(p, nullptr);
  std::string out;
  char line[256];
  while (fgets(line, sizeof line, p)) out += line;
  EXPECT_EQ(pclose(p), 0);
  EXPECT_NE(out.find("  2   language name"), std::string::npos) << out;
  EXPECT_NE(out.find(" 59   decimal separator              \",\""), std::string::npos) << out;
  EXPECT_NE(out.find(" 88   locale name                    \"German_Germany.Latin1@Binary\""), std::string::npos) << out;
  EXPECT_EQ(out.find(" 16 "), std::string::npos) << "only the items asked for";
}

}  // namespace
