// Conversion: the string members' limits and endings, the streaming engine against itself
// in every chunk size, and every generated code page through `tlx convert` against iconv.
#include <gtest/gtest.h>
#include <iconv.h>

#include <cstdio>
#include <filesystem>
#include <functional>
#include <fstream>
#include <iterator>
#include <random>

#include "codepage/cpbody.h"
#include <sstream>
#include "support/defdir.h"
#include "support/hooks.h"

namespace {

using Bytes = std::string;

std::string hex(const Bytes &s) {
  std::string out;
  char b[4];
  for (unsigned char c : s) {
    std::snprintf(b, sizeof b, "%02X ", c);
    out += b;
  }
  return out;
}

// The whole input through the engine in chunks of inStep bytes into buffers of outStep.
struct Streamed {
  Bytes out;
  uint32_t lastRc = 0;
};
Streamed stream(VLLocale *to, VLLocale *from, const Bytes &in, size_t inStep, size_t outStep) {
  Streamed s;
  VLConversion *h = VLOpenConversion(to, from);
  if (!h) return s;
  std::vector<unsigned char> buf(outStep);
  size_t at = 0;
  do {
    size_t n = std::min(inStep, in.size() - at);
    auto *p = reinterpret_cast<const unsigned char *>(in.data() + at);
    uint32_t left = static_cast<uint32_t>(n);
    do {
      unsigned char *o = buf.data();
      uint32_t room = static_cast<uint32_t>(outStep);
      s.lastRc = VLConvertBuffer(h, &o, &room, &p, &left, 0);
      s.out.append(reinterpret_cast<char *>(buf.data()), static_cast<size_t>(o - buf.data()));
    } while (s.lastRc == VL_RC_CNV_FULL);
    at += n;
  } while (at < in.size());
  VLCloseConversion(h);
  return s;
}

// ---- Small code pages: ASCII 367, Latin1 819, double-byte 932, shift-sensitive 930 ----

class Convert : public ::testing::Test {
 protected:
  static void SetUpTestSuite() {
    dir_ = new ts::TempDir;
    ts::DefDir::standard().write(dir_->path);
  }
  static void TearDownTestSuite() { delete dir_; }
  void SetUp() override {
    lib_ = std::make_unique<ts::Library>(dir_->path.c_str());
    ASSERT_EQ(lib_->rc, 0u);
    for (auto [name, slot] : {std::pair{"English", &ascii_}, {"German", &latin_}, {"German.MS932", &dbcs_},
                              {"German.IBM-930", &ebcdic_}}) {
      uint32_t rc;
      *slot = VLGetLocale(name, 0, &rc);
      ASSERT_NE(*slot, nullptr) << name;
    }
  }
  void TearDown() override {
    for (VLLocale *l : {ascii_, latin_, dbcs_, ebcdic_}) VLReleaseLocale(l);
    lib_.reset();
    EXPECT_EQ(ts::hooks.live, 0);
  }
  static ts::TempDir *dir_;
  std::unique_ptr<ts::Library> lib_;

 public:  // the cases name the locales by member pointer
  VLLocale *ascii_ = nullptr, *latin_ = nullptr, *dbcs_ = nullptr, *ebcdic_ = nullptr;
};
ts::TempDir *Convert::dir_;

// 0x4E00 + n: the n-th double-byte character of both test pages.
const Bytes kSjisKanji2 = "\x81\x40\x81\x41";      // U+4E00 U+4E01 in the 932 page
const Bytes kEbcdicKanji2 = "\x45\x41\x45\x42";    // the same two in the 930 page
const Bytes kEbcdicAbc = "\x81\x82\x83";            // abc

TEST_F(Convert, StringMembersLimitsAndEndings) {
  struct Case {
    const char *what;
    VLLocale *Convert::*to, *Convert::*from;
    Bytes in;
    int32_t inLen, outSize;
    uint32_t options, fromState;
    bool ex;
    int32_t result;
    Bytes out;  // the bytes written, terminator included
  } cases[] = {
      {"plain copy", &Convert::latin_, &Convert::ascii_, "abc", 3, 10, 0, 0, false, 3, "abc"},
      {"to the 0: appended, not counted", &Convert::latin_, &Convert::ascii_, "abc", -1, 10, 0, 0, false, 3,
       Bytes("abc\0", 4)},
      {"to the 0, no room for it", &Convert::latin_, &Convert::ascii_, "abc", -1, 3, 0, 0, false, 3, "abc"},
      {"nullterm reserves and counts", &Convert::latin_, &Convert::ascii_, "abc", 3, 3, 8, 0, false, 3,
       Bytes("ab\0", 3)},
      {"cut at a character", &Convert::dbcs_, &Convert::ascii_, "a", 1, 10, 0, 0, false, 1, "a"},
      {"double-byte not split", &Convert::dbcs_, &Convert::dbcs_, "a" + kSjisKanji2, 5, 4, 0, 0, false, 3,
       "a\x81\x40"},
      {"partial last character dropped", &Convert::latin_, &Convert::dbcs_, "a\x81", 2, 10, 0, 0, false, 1, "a"},
      {"charlen counts characters", &Convert::dbcs_, &Convert::dbcs_, kSjisKanji2 + "ab", 3, 2, VL_OPT_CHARLEN, 0,
       false, 2, kSjisKanji2},
      {"charlen with nullterm", &Convert::dbcs_, &Convert::dbcs_, kSjisKanji2, 2, 2, VL_OPT_CHARLEN | 8, 0, false, 2,
       Bytes("\x81\x40\0", 3)},
      {"empty input, nullterm", &Convert::latin_, &Convert::ascii_, "", 0, 5, 8, 0, false, 1, Bytes("\0", 1)},
      {"empty input", &Convert::latin_, &Convert::ascii_, "", 0, 5, 0, 0, false, 0, ""},
      {"no room at all", &Convert::latin_, &Convert::ascii_, "abc", 3, 0, 8, 0, false, 0, ""},
      {"unmappable: substitution byte", &Convert::ascii_, &Convert::latin_, "a\xE9", 2, 10, 0, 0, false, 2,
       "a\x1A"},
      {"into a shift page: runs opened and closed", &Convert::ebcdic_, &Convert::dbcs_, "abc" + kSjisKanji2 + "a",
       -1, 20, 0, 0, true, 10, "\x81\x82\x83\x0E\x45\x41\x45\x42\x0F\x81" + Bytes("\0", 1)},
      {"shift page, nullterm closes the run", &Convert::ebcdic_, &Convert::dbcs_, "a" + kSjisKanji2, 5, 10, 8, 0,
       true, 8, "\x81\x0E\x45\x41\x45\x42\x0F" + Bytes("\0", 1)},
      {"one byte left: last double-byte character gives way", &Convert::ebcdic_, &Convert::dbcs_,
       "a" + kSjisKanji2, 5, 7, 8, 0, true, 6, "\x81\x0E\x45\x41\x0F" + Bytes("\0", 1)},
      {"only Shift-Out before the dropped character: it goes too", &Convert::ebcdic_, &Convert::dbcs_,
       "a" + kSjisKanji2, 5, 5, 8, 0, true, 2, Bytes("\x81\0", 2)},
      {"exactly full, no terminator asked: the run stays open", &Convert::ebcdic_, &Convert::dbcs_,
       "a" + kSjisKanji2, -1, 6, 0, 0, true, 6, "\x81\x0E" + kEbcdicKanji2},
      {"one byte short of Shift-In and 0: the run stays open", &Convert::ebcdic_, &Convert::dbcs_,
       "a" + kSjisKanji2, -1, 7, 0, 0, true, 6, "\x81\x0E" + kEbcdicKanji2},
      {"plain member ignores shift state", &Convert::latin_, &Convert::ebcdic_, "\x0E\x81", 2, 10, 0, 0, false, 2,
       "\x1A" "a"},
      {"Ex member reads the runs", &Convert::dbcs_, &Convert::ebcdic_, "\x81\x0E" + kEbcdicKanji2 + "\x0F\x82", 8, 10,
       0, 0, true, 6, "a" + kSjisKanji2 + "b"},
      {"Ex member from state 1", &Convert::dbcs_, &Convert::ebcdic_, kEbcdicKanji2 + "\x0F\x81", 6, 10, 0, 1, true, 5,
       kSjisKanji2 + "a"},
      {"shift byte last: nothing more", &Convert::dbcs_, &Convert::ebcdic_, "\x81\x0E", 2, 10, 0, 0, true, 1, "a"},
  };
  for (const auto &c : cases) {
    char out[32];
    std::memset(out, '#', sizeof out);
    int32_t n = c.ex ? VLConvertStringEx(this->*c.to, out, 0, c.outSize, this->*c.from, c.in.data(), c.fromState,
                                         c.inLen, c.options)
                     : VLConvertString(this->*c.to, out, c.outSize, this->*c.from, c.in.data(), c.inLen, c.options);
    EXPECT_EQ(n, c.result) << c.what;
    // Bytes behind the terminator may hold a character that was taken back.
    EXPECT_EQ(hex(Bytes(out, c.out.size())), hex(c.out)) << c.what;
    EXPECT_EQ(out[c.out.size()] == '#' || c.out.back() == '\0', true) << c.what;
    EXPECT_EQ(VLGetError(this->*c.to), 0) << c.what;
  }
}

TEST_F(Convert, RejectedOptionWords) {
  char b[8];
  VLWChar w[8] = {'a', 0};
  VLUChar u[8] = {'a', 0};
  struct Case {
    const char *what;
    std::function<int32_t(uint32_t)> call;
    std::vector<uint32_t> bad, good;
  } cases[] = {
      {"ConvertString", [&](uint32_t o) { return VLConvertString(latin_, b, 8, ascii_, "a", 1, o); }, {1, 0x10, 0x8000},
       {0, 8, 0x4000, 0x4008}},
      {"UnicodeToStringEx",
       [&](uint32_t o) { return VLUnicodeToStringEx(latin_, b, 0, 8, u, 1, o); }, {2, 0x80000040}, {0, 0x4008}},
      {"StringToUnicode", [&](uint32_t o) { return VLStringToUnicode(u, 8, latin_, "a", 1, o); }, {0x20}, {0, 8}},
      {"ConvertStringW", [&](uint32_t o) { return VLConvertStringW(latin_, w, 8, ascii_, w, 1, o); }, {4}, {0x4008}},
      {"WideToMb", [&](uint32_t o) { return VLWideToMb(latin_, b, 8, w, 1, o); }, {8, 0x4008, 1}, {0, 0x4000}},
      {"MbToWide accepts anything", [&](uint32_t o) { return VLMbToWide(latin_, w, 8, "a", 1, o); }, {},
       {0, 8, 0xFFFFFFFF}},
  };
  for (const auto &c : cases) {
    for (uint32_t o : c.bad) {
      EXPECT_EQ(c.call(o), -1) << c.what << " " << o;
      EXPECT_EQ(VLGetError(latin_), 2) << c.what << " " << o;
    }
    for (uint32_t o : c.good) {
      EXPECT_GE(c.call(o), 0) << c.what << " " << o;
      EXPECT_EQ(VLGetError(latin_), 0) << c.what << " " << o;
    }
  }
}

TEST_F(Convert, WideAndUnicodeForms) {
  VLWChar w[16];
  VLUChar u[16];
  char b[16];
  // To the 0: the terminator becomes a W 0 and is counted.
  EXPECT_EQ(VLMbToWide(dbcs_, w, 16, ("a" + kSjisKanji2).c_str(), -1, 0), 4);
  EXPECT_EQ(std::vector<VLWChar>(w, w + 4), (std::vector<VLWChar>{'a', 0x8140, 0x8141, 0}));
  EXPECT_EQ(VLMbToWide(dbcs_, w, 16, kSjisKanji2.c_str(), 2, VL_OPT_CHARLEN), 2);  // characters counted
  EXPECT_EQ(VLMbToWideEx(ebcdic_, w, 16, ("\x0E" + kEbcdicKanji2 + "\x0F\x81").c_str(), 0, 7, 0), 3);
  EXPECT_EQ(std::vector<VLWChar>(w, w + 3), (std::vector<VLWChar>{0x4541, 0x4542, 0x81}));
  // Back, shift bytes inserted and the run left open; the 0 of the input is converted.
  const VLWChar wide[] = {0x81, 0x4541, 0};
  EXPECT_EQ(VLWideToMbEx(ebcdic_, b, 0, 16, wide, 2, 0), 4);
  EXPECT_EQ(hex(Bytes(b, 4)), hex("\x81\x0E\x45\x41"));
  EXPECT_EQ(VLWideToMb(dbcs_, b, 16, wide, -1, 0), 4);
  EXPECT_EQ(hex(Bytes(b, 4)), hex(Bytes("\x81\x45\x41\0", 4)));
  EXPECT_EQ(VLWideToMb(latin_, b, 1, wide, 2, VL_OPT_CHARLEN), 1);
  // W values between pages go through one UTF-16 unit each.
  const VLWChar sj[] = {'a', 0x8140, 0x8260, 0};  // a, U+4E00, full-width A
  EXPECT_EQ(VLConvertStringW(ebcdic_, w, 16, dbcs_, sj, -1, 0), 3);
  EXPECT_EQ(std::vector<VLWChar>(w, w + 4), (std::vector<VLWChar>{0x81, 0x4541, 0x3F, 0}));
  EXPECT_EQ(VLStringToUnicodeW(u, 3, dbcs_, sj, 3, VL_OPT_NULLTERM), 3);
  EXPECT_EQ(std::u16string(reinterpret_cast<char16_t *>(u), 3), std::u16string(u"a\u4E00\0", 3));
  const VLUChar uni[] = {'b', 0x4E01, 0xFF21, 0};
  EXPECT_EQ(VLUnicodeToStringW(dbcs_, w, 16, uni, -1, 0), 3);
  EXPECT_EQ(std::vector<VLWChar>(w, w + 3), (std::vector<VLWChar>{'b', 0x8141, 0x8260}));
  EXPECT_EQ(VLStringToUnicodeEx(u, 16, ebcdic_, (kEbcdicAbc + "\x0E\x45\x41").c_str(), 0, 2, VL_OPT_CHARLEN), 2);
  EXPECT_EQ(VLUnicodeToString(dbcs_, b, 2, uni, 3, VL_OPT_CHARLEN), 2);  // characters, not bytes
  EXPECT_EQ(hex(Bytes(b, 3)), hex("b\x81\x41"));
  EXPECT_EQ(VLConversionRatio(latin_, latin_), 1);
  EXPECT_EQ(VLConversionRatio(ebcdic_, latin_), 3);
  EXPECT_EQ(VLConversionRatio(dbcs_, latin_), 2);
}

TEST_F(Convert, EngineHoldsCutCharactersAndUndeliveredBytes) {
  VLConversion *h = VLOpenConversion(ebcdic_, dbcs_);
  ASSERT_NE(h, nullptr);
  unsigned char out[8];
  unsigned char *o = out;
  uint32_t room = 8;
  const unsigned char *p = reinterpret_cast<const unsigned char *>("\x81");
  uint32_t left = 1;
  EXPECT_EQ(VLConvertBuffer(h, &o, &room, &p, &left, 0), VL_RC_CNV_PARTIAL);
  EXPECT_EQ(left, 0u);
  EXPECT_EQ(o, out);
  // The second byte arrives; then one byte of room for Shift-Out and two bytes.
  p = reinterpret_cast<const unsigned char *>("\x40");
  left = 1;
  room = 1;
  EXPECT_EQ(VLConvertBuffer(h, &o, &room, &p, &left, 0), VL_RC_CNV_FULL);
  EXPECT_EQ(o - out, 1);
  EXPECT_EQ(h->pendingOutCount, 2);
  room = 1;
  EXPECT_EQ(VLConvertBuffer(h, &o, &room, &p, &left, 0), VL_RC_CNV_FULL);  // still one held
  room = 0;
  EXPECT_EQ(VLConvertBuffer(h, &o, &room, &p, &left, 0), VL_RC_CNV_FULL);
  room = 4;
  EXPECT_EQ(VLConvertBuffer(h, &o, &room, &p, &left, 0), VL_RC_OK);
  EXPECT_EQ(hex(Bytes(reinterpret_cast<char *>(out), static_cast<size_t>(o - out))), hex("\x0E\x45\x41"));
  EXPECT_EQ(h->targetState, 1);  // no closing Shift-In from the engine
  EXPECT_EQ(VLConvertBuffer(nullptr, &o, &room, &p, &left, 0), VL_RC_BADARG);
  EXPECT_EQ(VLCloseConversion(h), 0u);
  ts::hooks.failAt = ts::hooks.allocs + 1;
  EXPECT_EQ(VLOpenConversion(ebcdic_, nullptr), nullptr);
  EXPECT_EQ(VLGetError(ebcdic_), static_cast<int32_t>(VL_RC_NOMEM));
  ts::hooks.failAt = -1;
}

TEST_F(Convert, EngineGivesTheSameBytesInEveryChunkSize) {
  const Bytes sj = "ab" + kSjisKanji2 + "c\xB1\x82\x60" + kSjisKanji2 + "\x81";  // ends cut
  const Bytes eb = "\x0E\x0F\x81\x0E" + kEbcdicKanji2 + "\x0F\x82\x83\x0E\x45\x43\x0F\x0E\x0F";
  struct Case {
    VLLocale *Convert::*to, *Convert::*from;
    Bytes in;
    uint32_t lastRc;
  } cases[] = {
      {&Convert::ebcdic_, &Convert::dbcs_, sj, VL_RC_CNV_PARTIAL},
      {&Convert::dbcs_, &Convert::ebcdic_, eb, VL_RC_OK},
      {&Convert::ebcdic_, &Convert::ebcdic_, eb, VL_RC_OK},
      {&Convert::latin_, &Convert::dbcs_, sj, VL_RC_CNV_PARTIAL},
  };
  for (const auto &c : cases) {
    Streamed whole = stream(this->*c.to, this->*c.from, c.in, c.in.size(), 256);
    EXPECT_EQ(whole.lastRc, c.lastRc);
    for (size_t in = 1; in <= c.in.size(); ++in)
      for (size_t out = 1; out <= 6; ++out) {
        Streamed s = stream(this->*c.to, this->*c.from, c.in, in, out);
        ASSERT_EQ(hex(s.out), hex(whole.out)) << "chunks " << in << "/" << out;
        EXPECT_EQ(s.lastRc, c.lastRc);
      }
  }
}

// ---- Generated code pages against iconv ------------------------------------------------

class ConvertGenerated : public ::testing::Test {
 protected:
  void SetUp() override {
    if (!std::filesystem::exists(std::string(VL_TEST_DEFS_DIR) + "/control.nls"))
      GTEST_SKIP() << "no generated definitions in " << VL_TEST_DEFS_DIR;
    ASSERT_EQ(VLInit(VL_TEST_DEFS_DIR, nullptr, nullptr, 0, VL_OPT_NOBUILTIN), 0u);
  }
  void TearDown() override { VLTerm(); }
};

// iconv's bytes for a UTF-16LE text, or nothing when it refuses any of it.
bool viaIconv(const char *to, const char *from, const Bytes &in, Bytes *out) {
  iconv_t cd = iconv_open(to, from);
  if (cd == reinterpret_cast<iconv_t>(-1)) return false;
  out->assign(in.size() * 4 + 16, '\0');
  char *ip = const_cast<char *>(in.data()), *op = out->data();
  size_t il = in.size(), ol = out->size();
  bool ok = iconv(cd, &ip, &il, &op, &ol) != static_cast<size_t>(-1) && iconv(cd, nullptr, nullptr, &op, &ol) == 0;
  out->resize(out->size() - ol);
  iconv_close(cd);
  return ok;
}

Bytes runTool(const std::string &args, const std::string &inPath) {
  std::string cmd = std::string(VL_TEST_TLX) + " convert --dir " + VL_TEST_DEFS_DIR + " " + args + " " + inPath;
  FILE *f = popen(cmd.c_str(), "r");
  Bytes out;
  if (!f) return out;
  char buf[4096];
  size_t n;
  while ((n = std::fread(buf, 1, sizeof buf, f)) > 0) out.append(buf, n);
  EXPECT_EQ(pclose(f), 0) << cmd;
  return out;
}

Bytes le16(const std::u16string &s) {
  Bytes b;
  for (char16_t c : s) b += {static_cast<char>(c & 0xFF), static_cast<char>(c >> 8)};
  return b;
}

// Every code page of the alias file with the first of its names that iconv knows.
struct Page {
  std::string name, iconvName;
  uint16_t id;
};
std::vector<Page> generatedPages() {
  std::vector<Page> out;
  std::ifstream in(std::string(VL_TEST_DEFS_DIR) + "/alias.txt");
  std::vector<std::vector<std::string>> lines;
  for (std::string line; std::getline(in, line);) {
    if (line.empty() || line[0] == '#') continue;
    std::istringstream words(line);
    if (line[0] != ' ' && line[0] != '\t') lines.emplace_back();
    if (lines.empty()) continue;
    for (std::string w; words >> w;) lines.back().push_back(w);
  }
  for (const auto &names : lines) {
    uint32_t rc;
    VLObjEntry *e = VLGetObjFromName(vlglobals->objManager, VL_OBJ_CODEPAGE, names[0].c_str(),
                                     static_cast<int32_t>(names[0].size()), 0, &rc);
    if (!e) continue;
    for (const std::string &n : names) {
      iconv_t cd = iconv_open(n.c_str(), "UTF-16LE");
      if (cd == reinterpret_cast<iconv_t>(-1)) continue;
      iconv_close(cd);
      out.push_back({names[0], n, e->id});
      break;
    }
  }
  return out;
}

TEST_F(ConvertGenerated, ToolAgreesWithIconvOnEveryCodePage) {
  ts::TempDir tmp;
  std::mt19937 rng(1234);
  std::vector<Page> pages = generatedPages();
  EXPECT_GT(pages.size(), 30u);
  for (const Page &page : pages) {
    SCOPED_TRACE(page.name);
    uint32_t rc;
    VLObjEntry *e = VLGetObjFromID(vlglobals->objManager, VL_OBJ_CODEPAGE, page.id, 0, &rc);
    ASSERT_NE(e, nullptr);
    VLLocale loc{};
    loc.codePage = e;
    loc.flags = static_cast<uint16_t>((vl::cp::maxLen(e) == 1 ? VL_LF_SINGLEBYTE : 0) |
                                      (vl::cp::isShift(e) ? VL_LF_SHIFT : 0));
    // The repertoire both sides round-trip and agree on, one character at a time.
    std::u16string shared;
    size_t disagree = 0;
    std::string firstDisagreement;
    for (uint32_t u = 1; u < 0xFFFE; ++u) {
      if (u >= 0xD800 && u < 0xE000) continue;
      VLUChar one[1] = {static_cast<VLUChar>(u)};
      char mine[8];
      int32_t n = VLUnicodeToStringEx(&loc, mine, 0, 8, one, 1, VL_OPT_NULLTERM);
      VLUChar back[4];
      if (n < 2 || VLStringToUnicodeEx(back, 4, &loc, mine, 0, n - 1, 0) != 1 || back[0] != u) continue;
      Bytes theirs, again;
      if (!viaIconv(page.iconvName.c_str(), "UTF-16LE", le16(std::u16string(1, static_cast<char16_t>(u))), &theirs) ||
          !viaIconv("UTF-16LE", page.iconvName.c_str(), theirs, &again) || again != le16(std::u16string(1, char16_t(u))))
        continue;
      if (theirs != Bytes(mine, static_cast<size_t>(n - 1))) {
        if (!disagree++) firstDisagreement = "U+" + std::to_string(u) + ": " + hex(mine) + "vs " + hex(theirs);
        continue;
      }
      shared += static_cast<char16_t>(u);
    }
    // Both built from the same mappings: any single-character disagreement is a fault.
    EXPECT_EQ(disagree, 0u) << firstDisagreement;
    ASSERT_GT(shared.size(), 60u);
    // Random text of shared characters with runs, so that shift bytes come and go.
    std::u16string text;
    std::uniform_int_distribution<size_t> pick(0, shared.size() - 1), run(1, 6);
    while (text.size() < 3000) {
      char16_t c = shared[pick(rng)];
      for (size_t k = run(rng); k--;) text += c < 0x80 ? shared[pick(rng) % 64] : c;
    }
    Bytes u16 = le16(text), cpBytes;
    ASSERT_TRUE(viaIconv(page.iconvName.c_str(), "UTF-16LE", u16, &cpBytes));
    std::string u16Path = tmp.file("in16"), cpPath = tmp.file("incp");
    std::ofstream(u16Path, std::ios::binary) << u16;
    std::ofstream(cpPath, std::ios::binary) << cpBytes;
    std::string id = std::to_string(page.id);
    EXPECT_EQ(hex(runTool("-f UTF-16LE -t " + id, u16Path)), hex(cpBytes));
    EXPECT_EQ(runTool("-f " + page.name + " -t UTF-16LE", cpPath) == u16, true);
    // The one-shot members over the whole text: long runs take the loop's bulk paths.
    std::vector<VLUChar> units(text.size() + 1);
    ASSERT_EQ(VLStringToUnicodeEx(units.data(), static_cast<int32_t>(units.size()), &loc, cpBytes.data(), 0,
                                  static_cast<int32_t>(cpBytes.size()), 0),
              static_cast<int32_t>(text.size()));
    EXPECT_TRUE(std::equal(text.begin(), text.end(), units.begin()));
    std::vector<char> back(cpBytes.size() + 8);
    ASSERT_EQ(VLUnicodeToStringEx(&loc, back.data(), 0, static_cast<int32_t>(back.size()),
                                  reinterpret_cast<const VLUChar *>(text.data()), static_cast<int32_t>(text.size()),
                                  VL_OPT_NULLTERM),
              static_cast<int32_t>(cpBytes.size() + 1));
    EXPECT_EQ(hex(Bytes(back.data(), cpBytes.size())), hex(cpBytes));
    // A unit the page lacks, inside a run of plain ones, still becomes the substitution byte
    // (UTF-8 lacks none).
    std::u16string plain(40, u'a');
    plain[21] = page.id == VL_CP_UTF8 ? u'b' : u'\uFFFD';
    char sub[48];
    ASSERT_EQ(VLUnicodeToString(&loc, sub, 48, reinterpret_cast<const VLUChar *>(plain.data()), 40, 0), 40);
    EXPECT_EQ(static_cast<uint8_t>(sub[21]), page.id == VL_CP_UTF8 ? 'b' : vl::cp::subst(e));
    EXPECT_EQ(sub[20], sub[22]);
    // Split reads: the engine, code page to code page, in every chunk size.
    uint32_t rc2;
    VLObjEntry *utf8 = VLGetObjFromID(vlglobals->objManager, VL_OBJ_CODEPAGE, VL_CP_UTF8, 0, &rc2);
    ASSERT_NE(utf8, nullptr);
    VLLocale u8{};
    u8.codePage = utf8;
    Bytes head = cpBytes.substr(0, 160);
    Streamed whole = stream(&u8, &loc, head, head.size(), 1024);
    for (size_t in = 1; in <= head.size(); in += in < 16 ? 1 : 7)
      ASSERT_EQ(stream(&u8, &loc, head, in, in % 5 + 1).out, whole.out) << "chunk " << in;
  }
}

TEST(ConvertTool, ErrorsLikeIconv) {
  if (!std::filesystem::exists(std::string(VL_TEST_DEFS_DIR) + "/control.nls")) GTEST_SKIP();
  ts::TempDir tmp;
  std::ofstream(tmp.file("cut"), std::ios::binary) << "ab\x82";
  std::string tool = std::string(VL_TEST_TLX) + " convert --dir " + VL_TEST_DEFS_DIR;
  struct Case {
    std::string args;
    int status;
  } cases[] = {
      {"-f SJIS -t UTF-8 " + tmp.file("cut") + " 2>" + tmp.file("err"), 1},
      {"-f NOSUCH -t UTF-8 /dev/null 2>/dev/null", 1},
      {"-f 932 2>/dev/null", 64},
      {"--help >/dev/null", 0},
      {"-f 932 -t 1252 " + tmp.file("absent") + " 2>/dev/null", 1},
  };
  for (const auto &c : cases) {
    int st = std::system((tool + " " + c.args + " >/dev/null").c_str());
    EXPECT_EQ(WEXITSTATUS(st), c.status) << c.args;
  }
  std::ifstream err(tmp.file("err"));
  std::string msg((std::istreambuf_iterator<char>(err)), {});
  EXPECT_NE(msg.find("byte offset 2"), std::string::npos) << msg;
}

// Runs a shell command with its output in files; the exit status, stdout and stderr.
struct Ran {
  int status;
  Bytes out, err;
};
Ran run(const ts::TempDir &tmp, const std::string &cmd) {
  int st = std::system((cmd + " >" + tmp.file("out") + " 2>" + tmp.file("err")).c_str());
  auto slurp = [](const std::string &path) {
    std::ifstream in(path, std::ios::binary);
    return Bytes((std::istreambuf_iterator<char>(in)), {});
  };
  return {WEXITSTATUS(st), slurp(tmp.file("out")), slurp(tmp.file("err"))};
}

// The position iconv names in its message, as our "byte offset N"; empty when it names none.
std::string offsetOf(const Bytes &iconvErr) {
  size_t at = iconvErr.find("position ");
  if (at == Bytes::npos) return "";
  size_t from = at + 9, to = iconvErr.find_first_not_of("0123456789", from);
  return "byte offset " + iconvErr.substr(from, to - from);
}

// Text iconv converts exactly, or refuses at the same byte, or drops with -c: the tool does
// the same, with the same output before the stop and the same exit status.
TEST(ConvertTool, InvalidAndUnconvertibleTextLikeIconv) {
  if (!std::filesystem::exists(std::string(VL_TEST_DEFS_DIR) + "/control.nls")) GTEST_SKIP();
  ts::TempDir tmp;
  const std::string tool = std::string(VL_TEST_TLX) + " convert --dir " + VL_TEST_DEFS_DIR;
  struct Case {
    const char *what;
    Bytes in;
    const char *from, *to;
  } cases[] = {
      {"emoji between letters", "a\xF0\x9F\x98\x80" "b", "UTF-8", "UTF-16LE"},
      {"emoji stays itself", "a\xF0\x9F\x98\x80" "b", "UTF-8", "UTF-8"},
      {"rare ideograph, big-endian", "\xF0\xA0\x80\x8B", "UTF-8", "UTF-16BE"},
      {"surrogate pair to UTF-8", Bytes("a\0\x3D\xD8\x00\xDE" "b\0", 8), "UTF-16LE", "UTF-8"},
      {"unpaired high surrogate", Bytes("a\0\x3D\xD8" "b\0", 6), "UTF-16LE", "UTF-8"},
      {"unpaired low surrogate", Bytes("a\0\x00\xDE" "b\0", 6), "UTF-16LE", "UTF-8"},
      {"high surrogate at the end", Bytes("a\0\x3D\xD8", 4), "UTF-16LE", "UTF-8"},
      {"bytes that are never UTF-8", "a\xFF\xFE" "b", "UTF-8", "UTF-16LE"},
      {"overlong slash", "a\xC0\xAF" "b", "UTF-8", "UTF-16LE"},
      {"overlong three bytes", "a\xE0\x80\xAF" "b", "UTF-8", "UTF-16LE"},
      {"encoded surrogate", "a\xED\xA0\x80" "b", "UTF-8", "UTF-16LE"},
      {"past U+10FFFF", "a\xF4\x90\x80\x80" "b", "UTF-8", "UTF-16LE"},
      {"truncated inside", "a\xE2\x82" "b", "UTF-8", "UTF-16LE"},
      {"truncated at the end", "ab\xE2\x82", "UTF-8", "UTF-16LE"},
      {"emoji into a single-byte page", "a\xF0\x9F\x98\x80" "b", "UTF-8", "CP1252"},
      {"a letter the page lacks", "x\xE3\x81\x82y", "UTF-8", "CP1252"},
      {"Japanese into a shift page", "a\xE6\x97\xA5\xE6\x9C\xAC" "b", "UTF-8", "IBM930"},
      {"emoji into a shift page", "\xE6\x97\xA5\xF0\x9F\x98\x80", "UTF-8", "IBM930"},
      {"invalid double-byte pair", "a\x81\x20" "b", "CP932", "UTF-8"},
  };
  for (const Case &c : cases) {
    std::ofstream(tmp.file("in"), std::ios::binary) << c.in;
    int stopped = 0;
    for (const char *drop : {"", "-c "}) {
      SCOPED_TRACE(std::string(c.what) + " " + drop);
      std::string args = std::string(drop) + "-f " + c.from + " -t " + c.to + " " + tmp.file("in");
      Ran theirs = run(tmp, "iconv " + args), mine = run(tmp, tool + " " + args);
      EXPECT_EQ(hex(mine.out), hex(theirs.out));
      // Dropping changes the text, so -c still ends with 1 (older iconv says 0 there).
      if (*drop)
        EXPECT_EQ(mine.status, stopped) << mine.err;
      else
        EXPECT_EQ(mine.status, stopped = theirs.status) << mine.err;
      EXPECT_NE(mine.err.find(offsetOf(theirs.err)), Bytes::npos) << mine.err << " / " << theirs.err;
    }
  }
  // Asked for, the target's own substitution character stands in (U+FFFD in UTF-16).
  std::ofstream(tmp.file("in"), std::ios::binary) << "a\xF0\x9F\x98\x80" "b\xFF";
  Ran sub = run(tmp, tool + " --substitute -f UTF-8 -t CP1252 " + tmp.file("in"));
  EXPECT_EQ(sub.status, 0);
  EXPECT_EQ(hex(sub.out), hex("a\x1A" "b\x1A"));
  sub = run(tmp, tool + " --substitute -f UTF-8 -t UTF-16LE " + tmp.file("in"));
  EXPECT_EQ(hex(sub.out), hex(Bytes("a\0\x3D\xD8\x00\xDE" "b\0\xFD\xFF", 10)));
  // The bare Windows number of UTF-8 is a name too; without definitions the tool says so.
  EXPECT_EQ(run(tmp, tool + " -f 65001 -t UTF-16LE " + tmp.file("in") + " --substitute").status, 0);
  Ran none = run(tmp, std::string(VL_TEST_TLX) + " convert --dir " + tmp.file("nowhere") + " -f UTF-8 -t 1252 " +
                          tmp.file("in"));
  EXPECT_EQ(none.status, 1);
  EXPECT_NE(none.err.find("no definitions found"), Bytes::npos) << none.err;
  EXPECT_NE(none.err.find(tmp.file("nowhere")), Bytes::npos) << none.err;
}

}  // namespace
