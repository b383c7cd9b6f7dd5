// Streams: the same text in every chunking and with pauses anywhere reads back the same
// characters; every failure code at the place it belongs; push-back and deferred writes.
#include <gtest/gtest.h>

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <fstream>
#include <iterator>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "support/defdir.h"
#include "support/gendefs.h"

namespace {

using Bytes = std::string;

// The caller's medium: data to read or what was written, with a scripted temper.
struct Medium {
  explicit Medium(Bytes d = {}) : data(std::move(d)) {}
  Bytes data;
  size_t pos = 0;
  size_t chunk = 1000;           // most bytes one call moves
  std::vector<size_t> pauses;    // read positions where one call answers -1 first
  long failAt = -1;              // read position answering -5
  long zeroAt = -1;              // read position answering 0
  int refuse = 0;                // writes to refuse before accepting (-1: all)
  bool sink = false;             // a write medium
  Bytes written;
};
std::vector<Medium *> g_media;

int32_t transfer(uint32_t handle, void *buffer, int32_t count) {
  Medium &m = *g_media.at(handle);
  if (m.refuse) {
    if (m.refuse > 0) --m.refuse;
    return -1;
  }
  int32_t k = std::min<int32_t>(count, static_cast<int32_t>(m.chunk));
  if (!m.sink) {
    for (auto it = m.pauses.begin(); it != m.pauses.end(); ++it)
      if (*it == m.pos) {
        m.pauses.erase(it);
        return -1;
      }
    if (static_cast<long>(m.pos) == m.failAt) return -5;
    if (static_cast<long>(m.pos) == m.zeroAt) return 0;
    if (m.pos >= m.data.size()) return -1;
    k = std::min<int32_t>(k, static_cast<int32_t>(m.data.size() - m.pos));
    std::memcpy(buffer, m.data.data() + m.pos, static_cast<size_t>(k));
    m.pos += static_cast<size_t>(k);
    return k;
  }
  m.written.append(static_cast<char *>(buffer), static_cast<size_t>(k));
  return k;
}

class Stream : public ::testing::Test {
 protected:
  static void SetUpTestSuite() {
    dir_ = new ts::TempDir;
    ts::DefDir::standard().write(dir_->path);
  }
  static void TearDownTestSuite() { delete dir_; }
  void SetUp() override {
    lib_ = std::make_unique<ts::Library>(dir_->path.c_str());
    ASSERT_EQ(lib_->rc, 0u);
    uint32_t rc;
    for (auto [name, slot] : {std::pair{"English", &ascii_}, {"German.MS932", &dbcs_}, {"German.IBM-930", &ebcdic_}})
      ASSERT_NE(*slot = VLGetLocale(name, 0, &rc), nullptr) << name;
  }
  void TearDown() override {
    for (VLLocale *l : {ascii_, dbcs_, ebcdic_}) VLReleaseLocale(l);
    g_media.clear();
    lib_.reset();
    EXPECT_EQ(ts::hooks.live, 0);
  }
  VLStream *open(Medium &m, VLLocale *l, uint32_t mode = VL_STREAM_READ) {
    g_media.push_back(&m);
    m.sink = mode == VL_STREAM_WRITE;
    return VLOpenStream(l, transfer, static_cast<uint32_t>(g_media.size() - 1), mode);
  }
  // Every character until the medium is drained, calling again after pauses.
  std::vector<VLWChar> readAll(VLStream *s, VLLocale *l, const Medium &m, std::vector<int> *codes = nullptr) {
    std::vector<VLWChar> out;
    for (int guard = 0; guard < 1000; ++guard) {
      VLWChar c = VLReadCharW(s, l);
      if (codes) codes->push_back(VLGetError(l));
      if (c != static_cast<VLWChar>(-1)) out.push_back(c);
      else if (m.pos >= m.data.size() && m.pauses.empty()) break;
    }
    return out;
  }
  static inline ts::TempDir *dir_ = nullptr;
  std::unique_ptr<ts::Library> lib_;

 public:
  VLLocale *ascii_ = nullptr, *dbcs_ = nullptr, *ebcdic_ = nullptr;
};

struct TextCase {
  const char *name;
  VLLocale *Stream::*locale;
  Bytes data;
  std::vector<VLWChar> chars;
};
const TextCase kTexts[] = {
    {"ascii line", &Stream::ascii_, "Hi\n", {'H', 'i', '\n'}},
    {"double-byte between single", &Stream::dbcs_, "A\x81\x40" "B\x81\x41", {0x41, 0x8140, 0x42, 0x8141}},
    {"shift runs", &Stream::ebcdic_, "\xC1\x0E\x45\x41\x45\x42\x0F\xC2", {0xC1, 0x4541, 0x4542, 0xC2}},
    {"leading and empty runs", &Stream::ebcdic_, "\x0E\x45\x43\x0F\x0E\x0F\xC3\x0E\x0F", {0x4543, 0xC3}},
};

TEST_F(Stream, EveryChunkingAndEveryPauseReadsTheSameCharacters) {
  for (const TextCase &t : kTexts) {
    VLLocale *l = this->*t.locale;
    for (size_t chunk = 1; chunk <= 4; ++chunk)
      for (size_t pause = 0; pause <= t.data.size(); ++pause) {
        Medium m{t.data};
        m.chunk = chunk;
        m.pauses = {pause};
        VLStream *s = open(m, l);
        std::vector<int> codes;
        EXPECT_EQ(readAll(s, l, m, &codes), t.chars) << t.name << ", chunk " << chunk << ", pause at " << pause;
        for (int c : codes) EXPECT_TRUE(c == 0 || c == 61) << t.name << ": code " << c;
        EXPECT_EQ(codes.back(), 0) << t.name << ": clean end";
        EXPECT_EQ(VLCloseStream(s, l), 1);
      }
  }
}

TEST_F(Stream, RandomShiftTextInRandomPiecesAgreesWithTheStringConversion) {
  std::mt19937 rng(930);
  for (int round = 0; round < 200; ++round) {
    Bytes text;
    bool dbl = false;
    for (int n = 1 + static_cast<int>(rng() % 40); n > 0; --n) {
      if (rng() % 4 == 0) text += (dbl = !dbl) ? '\x0E' : '\x0F';
      if (dbl) text += {static_cast<char>(0x45 + rng() % 4), static_cast<char>(0x41 + rng() % 0xBD)};
      else text += static_cast<char>(0xC1 + rng() % 9);
    }
    std::vector<VLWChar> want(text.size() + 1);
    want.resize(static_cast<size_t>(
        VLMbToWideEx(ebcdic_, want.data(), static_cast<int32_t>(want.size()), text.data(), 0,
                     static_cast<int32_t>(text.size()), 0)));
    Medium m{text};
    m.chunk = 1 + rng() % 3;
    for (int k = static_cast<int>(rng() % 4); k > 0; --k) m.pauses.push_back(rng() % (text.size() + 1));
    VLStream *s = open(m, ebcdic_);
    EXPECT_EQ(readAll(s, ebcdic_, m), want) << "round " << round;
    VLCloseStream(s, ebcdic_);
  }
}

struct FailCase {
  const char *name;
  VLLocale *Stream::*locale;
  Bytes data;
  long failAt, zeroAt;
  int code;               // of the first read that fails
  VLWChar after;          // what the next read gives once the medium behaves
};
const FailCase kFailures[] = {
    {"a read error inside a double-byte character", &Stream::dbcs_, "\x81\x40", 1, -1, 63, 0x8140},
    {"no byte where a character was due", &Stream::ascii_, "AB", -1, 0, 64, 'A'},
    {"no byte inside a character", &Stream::dbcs_, "\x81\x40", -1, 1, 64, 0x8140},
    {"a read error right after Shift-Out", &Stream::ebcdic_, "\x0E\x45\x41", 1, -1, 64, 0x4541},
    {"a shift byte inside a double-byte character", &Stream::ebcdic_, "\x0E\x45\x0F\xC1", -1, -1, 64, 0xC1},
};

TEST_F(Stream, ReadFailuresGiveTheirCodeAndKeepWhatCanBeCompleted) {
  for (const FailCase &f : kFailures) {
    VLLocale *l = this->*f.locale;
    Medium m{f.data};
    m.failAt = f.failAt;
    m.zeroAt = f.zeroAt;
    VLStream *s = open(m, l);
    EXPECT_EQ(VLReadCharW(s, l), static_cast<VLWChar>(-1)) << f.name;
    EXPECT_EQ(VLGetError(l), f.code) << f.name;
    m.failAt = m.zeroAt = -1;
    EXPECT_EQ(VLReadCharW(s, l), f.after) << f.name << ": then";
    VLCloseStream(s, l);
  }
}

TEST_F(Stream, EndsOfDataInsideACharacterOrAfterAShiftByte) {
  struct {
    const char *name;
    VLLocale *Stream::*locale;
    Bytes data;
    int code;
    uint16_t kept;
  } cases[] = {
      {"inside a double-byte character", &Stream::dbcs_, "\x81", 61, 1},
      {"inside a shifted character", &Stream::ebcdic_, "\x0E\x45", 61, 1},
      {"after Shift-Out", &Stream::ebcdic_, "\x0E", 61, 0},
      {"after Shift-In", &Stream::ebcdic_, "\x0E\x45\x41\x0F", 0, 0},
  };
  for (auto &c : cases) {
    VLLocale *l = this->*c.locale;
    Medium m{c.data};
    VLStream *s = open(m, l);
    while (VLReadCharW(s, l) != static_cast<VLWChar>(-1)) {
    }
    EXPECT_EQ(VLGetError(l), c.code) << c.name;
    EXPECT_EQ(s->count, c.kept) << c.name;
    VLCloseStream(s, l);
  }
}

TEST_F(Stream, WrongDirectionAndBadModes) {
  Medium r{"A"}, w;
  VLStream *rs = open(r, ascii_), *ws = open(w, ascii_, VL_STREAM_WRITE);
  char a = 'A';
  EXPECT_EQ(VLReadCharW(ws, ascii_), static_cast<VLWChar>(-1));
  EXPECT_EQ(VLGetError(ascii_), 60);
  EXPECT_EQ(VLReadCharU(ws, ascii_), 0xFFFF);
  EXPECT_EQ(VLGetError(ascii_), 60);
  EXPECT_EQ(VLUngetChar(ws, ascii_, &a), 0);
  EXPECT_EQ(VLGetError(ascii_), 60);
  EXPECT_EQ(VLReadString(ws, ascii_, &a, 1, 0), -2);
  EXPECT_EQ(VLGetError(ascii_), 60);
  EXPECT_EQ(VLWriteChar(rs, ascii_, &a), 0);
  EXPECT_EQ(VLGetError(ascii_), 60);
  EXPECT_EQ(VLOpenStream(ascii_, transfer, 0, 0x80000052u), nullptr);
  EXPECT_EQ(VLGetError(ascii_), 2);
  EXPECT_EQ(VLCloseStream(rs, ascii_), 1);
  EXPECT_EQ(VLCloseStream(ws, ascii_), 1);
}

TEST_F(Stream, Utf16StreamsKeepAnOddByteUntilItsPartnerArrives) {
  const char16_t text[] = u"AB";
  Medium m{Bytes(reinterpret_cast<const char *>(text), 4) + "x"};
  m.chunk = 1;
  VLStream *s = open(m, ascii_);
  std::vector<std::pair<int, int>> got;
  for (int i = 0; i < 6; ++i) {
    int u = VLReadCharU(s, ascii_);
    got.push_back({u, VLGetError(ascii_)});
  }
  std::vector<std::pair<int, int>> want = {{0xFFFF, 63}, {'A', 0}, {0xFFFF, 63}, {'B', 0}, {0xFFFF, 63}, {0xFFFF, 61}};
  EXPECT_EQ(got, want);
  ts::hooks.failAt = ts::hooks.allocs + 1;
  EXPECT_EQ(VLReadCharU(s, ascii_), 0xFFFF);
  EXPECT_EQ(VLGetError(ascii_), 20);
  VLCloseStream(s, ascii_);
}

TEST_F(Stream, PushBackAcrossTheBufferAndAcrossShiftStates) {
  // A character cut by a pause waits in the buffer; pushed-back characters go before it.
  Medium m{"\x0E\x45\x41\x45\x42\x0F\xC2"};
  m.pauses = {4};
  VLStream *s = open(m, ebcdic_);
  EXPECT_EQ(VLReadCharW(s, ebcdic_), 0x4541u);
  EXPECT_EQ(VLReadCharW(s, ebcdic_), static_cast<VLWChar>(-1));
  EXPECT_EQ(VLGetError(ebcdic_), 61);
  EXPECT_EQ(VLUngetCharW(s, ebcdic_, 0xC1), 1);
  EXPECT_EQ(VLUngetCharW(s, ebcdic_, 0x4541), 1);
  EXPECT_EQ(readAll(s, ebcdic_, m), (std::vector<VLWChar>{0x4541, 0xC1, 0x4542, 0xC2}));
  VLCloseStream(s, ebcdic_);

  Medium u;
  u.data = "zz";
  VLStream *f = open(u, ascii_);
  for (int i = 0; i < 40; ++i) ASSERT_EQ(VLUngetCharU(f, ascii_, static_cast<VLUChar>(i)), 1);
  EXPECT_EQ(f->count, 80);
  EXPECT_EQ(VLUngetCharU(f, ascii_, 1), 0);
  EXPECT_EQ(VLGetError(ascii_), 40);
  EXPECT_EQ(VLReadCharU(f, ascii_), 39);
  VLCloseStream(f, ascii_);
}

TEST_F(Stream, RefusedWritesWaitAndGoOutInOrder) {
  Medium m;
  m.refuse = 1;
  m.chunk = 1;
  VLStream *s = open(m, ebcdic_, VL_STREAM_WRITE);
  EXPECT_EQ(VLWriteCharW(s, ebcdic_, 0xC1), 0);
  EXPECT_EQ(VLGetError(ebcdic_), 65);
  EXPECT_EQ(s->count, 1);
  for (VLWChar c : {0x4541u, 0x4542u, 0xC2u, 0x4543u}) EXPECT_EQ(VLWriteCharW(s, ebcdic_, c), 1);
  EXPECT_EQ(VLCloseStream(s, ebcdic_), 1);
  EXPECT_EQ(m.written, "\xC1\x0E\x45\x41\x45\x42\x0F\xC2\x0E\x45\x43\x0F");

  // A refused shift byte waits with its character, and the state follows it.
  Medium n;
  n.refuse = 1;
  VLStream *t = open(n, ebcdic_, VL_STREAM_WRITE);
  const char kanji[] = "\x45\x41";
  EXPECT_EQ(VLWriteCharEx(t, ebcdic_, kanji, 1), 0);
  EXPECT_EQ(VLWriteCharEx(t, ebcdic_, "\xC1", 0), 1);
  EXPECT_EQ(VLCloseStream(t, ebcdic_), 1);
  EXPECT_EQ(n.written, "\x0E\x45\x41\x0F\xC1");
}

TEST_F(Stream, AMediumThatRefusesEverything) {
  Medium m;
  m.refuse = -1;
  VLStream *s = open(m, dbcs_, VL_STREAM_WRITE);
  int written = 0;
  while (VLWriteChar(s, dbcs_, "\x81\x40") == 0 && VLGetError(dbcs_) == 65) ++written;
  EXPECT_EQ(written, 40);
  EXPECT_EQ(VLGetError(dbcs_), 40);
  EXPECT_EQ(s->count, 80);
  EXPECT_EQ(VLFlushStream(s, dbcs_), 0);
  EXPECT_EQ(VLGetError(dbcs_), 62);
  EXPECT_EQ(s->count, 0);
  EXPECT_EQ(VLWriteCharU(s, dbcs_, 0x4E00), 0);
  EXPECT_EQ(VLCloseStream(s, dbcs_), 0);
  EXPECT_EQ(VLGetError(dbcs_), 62);
  EXPECT_TRUE(m.written.empty());
}

struct LineCase {
  const char *name;
  Bytes data;
  int32_t size;
  uint32_t options;
  int32_t result;
  Bytes line;   // what the call stored
  Bytes rest;   // what a second call with a large buffer and no line end reads
};
const LineCase kLines[] = {
    {"CRLF removed", "ab\r\ncd", 10, VL_EOL_CRLF | VL_OPT_STRIPEOL, 2, "ab", "cd"},
    {"CRLF kept", "ab\r\ncd", 10, VL_EOL_CRLF, 4, "ab\r\n", "cd"},
    {"a lone LF does not end a CRLF line", "a\nb\r\nc", 10, VL_EOL_CRLF, 5, "a\nb\r\n", "c"},
    {"LF ends, CR stays", "ab\r\ncd", 10, VL_EOL_LF | VL_OPT_STRIPEOL, 3, "ab\r", "cd"},
    {"terminated", "ab\ncd", 10, VL_EOL_LF | VL_OPT_NULLTERM, 4, Bytes("ab\n\0", 4), "cd"},
    {"full output pushes back", "abcdef", 4, VL_OPT_NULLTERM, 4, Bytes("abc\0", 4), "def"},
    {"a CR in the last place still meets its LF", "ab\r\ncd", 3, VL_EOL_CRLF | VL_OPT_STRIPEOL, 2, "ab", "cd"},
    {"empty line", "\ncd", 10, VL_EOL_LF | VL_OPT_STRIPEOL, 0, "", "cd"},
    {"end of data", "", 10, VL_EOL_LF, -1, "", ""},
    {"room for the 0 alone", "ab", 1, VL_OPT_NULLTERM, 1, Bytes("\0", 1), "ab"},
    {"a bad option", "ab", 10, 0x10000, -2, "", "ab"},
};

TEST_F(Stream, ReadStringLinesInEveryOptionCombination) {
  for (const LineCase &c : kLines) {
    Medium m{c.data};
    VLStream *s = open(m, ascii_);
    char buf[16] = {};
    int32_t n = VLReadString(s, ascii_, buf, c.size, c.options);
    EXPECT_EQ(n, c.result) << c.name;
    EXPECT_EQ(Bytes(buf, n > 0 ? static_cast<size_t>(n) : 0), c.line) << c.name;
    char rest[16] = {};
    int32_t r = VLReadString(s, ascii_, rest, sizeof rest, 0);
    EXPECT_EQ(Bytes(rest, r > 0 ? static_cast<size_t>(r) : 0), c.rest) << c.name;
    VLCloseStream(s, ascii_);
  }
}

TEST_F(Stream, ReadStringForms) {
  // Ex writes the shift bytes its characters need and closes the run before the 0.
  Medium a{"\xC1\x0E\x45\x41\x0F\x25\xC2"};
  VLStream *s = open(a, ebcdic_);
  char buf[16];
  VLShiftState st = 0;
  EXPECT_EQ(VLReadStringEx(s, ebcdic_, buf, &st, 16, VL_EOL_LF | VL_OPT_NULLTERM), 7);
  EXPECT_EQ(Bytes(buf, 7), Bytes("\xC1\x0E\x45\x41\x0F\x25\0", 7));
  EXPECT_EQ(st, 0u);
  VLCloseStream(s, ebcdic_);

  // Without room for Shift-In and the 0 the double-byte character waits for the next call.
  Medium b{"\xC1\x0E\x45\x41"};
  s = open(b, ebcdic_);
  EXPECT_EQ(VLReadStringEx(s, ebcdic_, buf, &st, 4, VL_OPT_NULLTERM), 2);
  EXPECT_EQ(VLReadStringW(s, ebcdic_, reinterpret_cast<VLWChar *>(buf), 4, 0), 1);
  EXPECT_EQ(reinterpret_cast<VLWChar *>(buf)[0], 0x4541u);
  VLCloseStream(s, ebcdic_);

  // Characters count with VL_OPT_CHARLEN.
  Medium c{"A\x81\x40\x81\x41" "B"};
  s = open(c, dbcs_);
  EXPECT_EQ(VLReadString(s, dbcs_, buf, 3, VL_OPT_CHARLEN), 3);
  EXPECT_EQ(Bytes(buf, 5), "A\x81\x40\x81\x41");
  VLCloseStream(s, dbcs_);

  const char16_t text[] = u"x\u2028y";
  Medium d{Bytes(reinterpret_cast<const char *>(text), 6)};
  s = open(d, ascii_);
  VLUChar u[4];
  EXPECT_EQ(VLReadStringU(s, ascii_, u, 4, VL_EOL_LS | VL_OPT_STRIPEOL | VL_OPT_NULLTERM), 2);
  EXPECT_EQ(u[0], u'x');
  EXPECT_EQ(VLReadStringU(s, ascii_, u, 4, VL_EOL_LS), 1);
  EXPECT_EQ(u[0], u'y');
  EXPECT_EQ(VLReadStringU(s, ascii_, u, 4, VL_EOL_LS), -1);
  VLCloseStream(s, ascii_);
}

TEST_F(Stream, AllocationFailureOnOpen) {
  ts::hooks.failAt = ts::hooks.allocs + 1;
  Medium m;
  EXPECT_EQ(open(m, ascii_), nullptr);
  EXPECT_EQ(VLGetError(ascii_), 20);
}

// The worked example of the README: a shift-sensitive file read character by character
// through a transfer function over a descriptor and written back as UTF-16.
int32_t fdRead(uint32_t fd, void *buf, int32_t n) {
  ssize_t r;
  do r = read(static_cast<int>(fd), buf, static_cast<size_t>(n));
  while (r < 0 && errno == EINTR);
  return r > 0 ? static_cast<int32_t>(r) : r == 0 ? -1 : -2;
}
int32_t fdWrite(uint32_t fd, void *buf, int32_t n) {
  ssize_t r;
  do r = write(static_cast<int>(fd), buf, static_cast<size_t>(n));
  while (r < 0 && errno == EINTR);
  return r >= 0 ? static_cast<int32_t>(r) : errno == EAGAIN ? -1 : -2;
}

TEST(StreamExample, AShiftSensitiveFileBackAsUtf16AgreesWithIconv) {
  if (!ts::haveDefs()) GTEST_SKIP();
  const std::string utf8 = "Tokyo \xE6\x9D\xB1\xE4\xBA\xAC, Osaka \xE5\xA4\xA7\xE9\x98\xAA\n2024\xE5\xB9\xB4\n";
  ts::TempDir dir;
  std::ofstream(dir.file("in.930"), std::ios::binary) << ts::iconvTo(utf8, "IBM930");

  ASSERT_EQ(VLInit(VL_TEST_DEFS_DIR, nullptr, nullptr, 0, 0), 0u);
  uint32_t rc;
  VLLocale *ebcdic = VLGetLocale("Japanese_Japan.IBM930", 0, &rc);
  ASSERT_NE(ebcdic, nullptr);
  int in = open(dir.file("in.930").c_str(), O_RDONLY);
  int out = open(dir.file("out.u16").c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0644);
  VLStream *r = VLOpenStream(ebcdic, fdRead, static_cast<uint32_t>(in), VL_STREAM_READ);
  VLStream *w = VLOpenStream(ebcdic, fdWrite, static_cast<uint32_t>(out), VL_STREAM_WRITE);
  VLWChar c;
  while ((c = VLReadCharW(r, ebcdic)) != static_cast<VLWChar>(-1)) {
    VLUChar u;
    if (c < 0x100) {
      char b = static_cast<char>(c);
      VLStringToUnicode(&u, 1, ebcdic, &b, 1, 0);
    } else {
      u = VLCpMbToUnicodeW(ebcdic->codePage, c);
    }
    VLWriteCharU(w, ebcdic, u);
  }
  EXPECT_EQ(VLGetError(ebcdic), 0);
  EXPECT_EQ(VLCloseStream(r, ebcdic), 1);
  EXPECT_EQ(VLCloseStream(w, ebcdic), 1);
  close(in);
  close(out);
  std::ifstream back(dir.file("out.u16"), std::ios::binary);
  std::string got((std::istreambuf_iterator<char>(back)), {});
  EXPECT_EQ(got, ts::iconvTo(utf8, "UTF-16LE"));
  VLReleaseLocale(ebcdic);
  VLTerm();
}

}  // namespace
