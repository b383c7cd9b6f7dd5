// Character primitives of the code page object, on small hand-made pages.
#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <random>

#include "container.h"
#include "cpbuild.h"
#include "codepage/cpbody.h"
#include "support/cpmem.h"

namespace {

using cpmem::add16;
using cpmem::Bytes;
using cpmem::Loaded;
using cpmem::Page;
using Units = std::vector<VLUChar>;

Page singleByte() {  // ASCII and e-acute; only the first Unicode row maps back
  Page p;
  p.uni[0xE9] = 0xE9;
  p.index[0] = {0, 0xFF, 0, 0xFF, 0, 0};
  p.low.assign(256, '?');
  for (int i = 0; i < 0x80; ++i) p.low[i] = static_cast<uint8_t>(i);
  p.low[0xE9] = 0xE9;
  return p;
}

// Leads 0x81-0x84 take two bytes; lead 0x84 leads to a third trie level that a two-byte
// walk must not reach. Unbounded, every node spans 0-255. Types: lead 0x81 has upper-case
// even and lower-case odd trail bytes.
Page doubleByte(bool bounded) {
  Page p;
  p.maxLen = 4;  // index kinds 2 and 3 below give three- and four-byte characters
  for (int b = 0x81; b <= 0x84; ++b) p.len[b] = 2;
  auto lo = [=](uint8_t v) { return bounded ? v : uint8_t{0}; };
  auto hi = [=](uint8_t v) { return bounded ? v : uint8_t{0xFF}; };
  p.nodes = {{0, 3, lo(0x81), hi(0x84), 1}, {0, 0, 0, 0xFF, 5},          {1, 0x3F, lo(0x40), hi(0x7E), 0},
             {1, 0x3F, lo(0x40), hi(0x7E), 64}, {1, 0x3F, lo(0x40), hi(0x41), 128}, {1, 0, 0, 0xFF, 130}};
  for (int i = 0; i < 192; ++i)
    p.values.push_back(static_cast<uint16_t>(i < 64 ? 0x4E00 + i : i < 128 ? 0x4FC0 + i : 0xFEA1 + i));
  p.typeNodes = {{0, 3, 1}, {1, 0, 2}, {1, 1, 0}, {1, 0, 2}, {1, 0, 2}};
  p.records = {{0x002, 1}, {0x004, -1}, {0x020, 0}};
  for (int i = 0; i < 0x80; ++i) p.low.push_back(static_cast<uint8_t>(i));
  auto row = [&p](int r, cpmem::Index x) {  // a row whose entries start at the tables' ends
    x.low = static_cast<uint16_t>(p.low.size()), x.high = static_cast<uint16_t>(p.high.size());
    p.index[r] = x;
  };
  p.index[0x00] = {0, 0x7F, 0, 0x7F, 0, 0};
  row(0x4E, {1, 0x3F, 0, 0x3E, 0, 0});
  for (int i = 0; i < 0x3F; ++i) add16(p.low, static_cast<uint16_t>(0x8140 + i));
  row(0x30, {1, 0x7F, 0x40, 0x7E, 0, 0});
  for (int i = 0; i < 0x7F; ++i) add16(p.low, static_cast<uint16_t>(0x8200 + i));
  row(0x60, {2, 1, 0, 1, 0, 0});
  add16(p.low, 0x0102), add16(p.low, 0x0304), p.high.insert(p.high.end(), {0x8F, 0x8E});
  row(0x61, {3, 1, 0, 1, 0, 0});
  add16(p.low, 0xA1A2), add16(p.low, 0xB1B2), add16(p.high, 0x8FA0), add16(p.high, 0);
  row(0x62, {4, 1, 0, 1, 0, 0});
  p.low.insert(p.low.end(), {0x40, 0x41}), p.high.insert(p.high.end(), {0x83, 0x00});
  p.index[0x63] = {9, 0, 0, 0xFF, 0, 0};
  p.full.assign(256, 0);
  p.full[0x31] = 0x8250;
  p.pairs = {{0x30, 0x824F}, {0x41, 0x8260}, {0x61, 0x8281}};
  return p;
}

Page shiftPage() {  // SO 0x0E, SI 0x0F; double-byte characters 0x42xx and 0x43xx
  Page p;
  p.flags = 0x0002, p.maxLen = 2, p.so = 0x0E, p.si = 0x0F, p.subst = 0x6F;
  p.uni[0xC1] = 0x41, p.uni[0xC2] = 0x42;
  p.nodes = {{0, 1, 0x42, 0x43, 1}, {1, 3, 0x40, 0x43, 0}, {1, 3, 0x40, 0x43, 4}};
  for (int i = 0; i < 8; ++i) p.values.push_back(static_cast<uint16_t>(0x4E00 + i));
  p.typeNodes = {{0, 1, 1}, {1, 1, 0}, {1, 0, 2}};
  p.records = {{0x002, 1}, {0x004, -1}, {0x020, 0}};
  p.low.assign(256, 0x6F);
  p.low[0] = 0, p.low[0x41] = 0xC1, p.low[0x42] = 0xC2;
  p.index[0x00] = {0, 0xFF, 0, 0x42, 0, 0};
  p.index[0x4E] = {1, 7, 0, 7, 256, 0};
  for (int i = 0; i < 8; ++i) add16(p.low, static_cast<uint16_t>((i < 4 ? 0x4240 : 0x433C) + i));
  p.index[0x4F] = {1, 0, 0, 0, static_cast<uint16_t>(p.low.size()), 0};
  add16(p.low, 0x420E);  // a trail byte equal to Shift-Out
  return p;
}

Page utf8Page() {
  Page p;
  p.maxLen = 3;
  for (int b = 0xC0; b <= 0xFF; ++b) p.len[b] = b < 0xE0 ? 2 : 3;
  return p;
}

const uint8_t *u8(const char *s) { return reinterpret_cast<const uint8_t *>(s); }
Bytes bytes(const uint8_t *p, int n) { return Bytes(p, p + n); }
Bytes wBytes(VLWChar w) {
  uint8_t b[4];
  return bytes(b, VLWToMb(b, w));
}

struct Pages : ::testing::Test {
  Loaded sb{singleByte().sections(), 850}, db{doubleByte(true).sections(), 2000};
  Loaded sh{shiftPage().sections(), 930}, ut{utf8Page().sections(), VL_CP_UTF8};
  void SetUp() override {
    for (const Loaded *l : {&sb, &db, &sh, &ut}) ASSERT_EQ(l->rc, 0u) << l->entry.id;
  }
};

TEST(CodePage, WToMbDropsZeroBytes) {
  std::pair<VLWChar, Bytes> cases[] = {{0x8140, {0x81, 0x40}}, {0x41, {0x41}}, {0, {0}},
                                       {0x12345678, {0x12, 0x34, 0x56, 0x78}}, {0x810041, {0x81, 0x41}},
                                       {0xFFFFFF, {0xFF, 0xFF, 0xFF}}, {0x01000000, {0x01, 0x00}}};
  for (const auto &[w, out] : cases) EXPECT_EQ(wBytes(w), out) << std::hex << w;
}

TEST_F(Pages, CharacterToUnicode) {
  struct {
    const Loaded &page;
    const char *in;
    VLUChar u;
  } cases[] = {{db, "\x81\x40", 0x4E00}, {db, "\x81\x7E", 0x4E3E}, {db, "\x82\x41", 0x5001}, {db, "\x83\x41", 0xFF22},
               {db, "\x81\x7F", 0xFFFD}, {db, "\x81\x3F", 0xFFFD},  // trail outside the leaf's bounds
               {db, "\x83\x42", 0xFFFD}, {db, "\x85", 0xFFFD},      // narrower leaf; lead outside the root's
               {db, "\x84\x40", 0xFFFD},                            // no leaf within two bytes
               {sh, "\x43\x41", 0x4E05},  // double-byte state: the maximum length, not the lead's
               {ut, "\xC2\x80", 0x80},   {ut, "\xDF\xBF", 0x7FF},   {ut, "\xE0\xA0\x80", 0x800},
               {ut, "\xEF\xBF\xBF", 0xFFFF}, {ut, "\xE0\x41\x41", 0x41}};  // continuations unchecked
  for (const auto &c : cases) {
    EXPECT_EQ(VLCpMbToUnicode(c.page.cp(), u8(c.in)), c.u) << c.in;
    VLWChar w = &c.page == &sh ? VLMbToWS(sh.cp(), u8(c.in), 1) : VLMbToW(c.page.cp(), u8(c.in));
    EXPECT_EQ(VLCpMbToUnicodeW(c.page.cp(), w), c.u) << c.in;
  }
  EXPECT_EQ(VLCpMbToUnicodeW(db.cp(), 0x844040), 0xFF23);  // three bytes reach the third level
  EXPECT_EQ(VLMbToW(ut.cp(), u8("\xE0\x41\x41\x41")), 0xE04141u);
  EXPECT_EQ(VLMbToWS(sh.cp(), u8("\x42\x40"), 1), 0x4240u);
  EXPECT_EQ(VLMbToWS(sh.cp(), u8("\x42\x40"), 0), 0x42u);
}

TEST_F(Pages, UnicodeToCharacter) {
  struct {
    const Loaded &page;
    VLUChar u;
    Bytes out;
  } cases[] = {
      {db, 0x0041, {0x41}}, {db, 0x4E00, {0x81, 0x40}}, {db, 0x307E, {0x82, 0x7E}},  // kinds 0 and 1
      {db, 0x4E3F, {'?'}},  {db, 0x3080, {'?'}},         {db, 0xFFFF, {'?'}},         // out of bounds
      {db, 0x6000, {0x8F, 0x01, 0x02}}, {db, 0x6001, {0x8E, 0x03, 0x04}},               // kind 2
      {db, 0x6100, {0x8F, 0xA0, 0xA1, 0xA2}}, {db, 0x6101, {0xB1, 0xB2}},               // kind 3
      {db, 0x6200, {0x83, 0x40}}, {db, 0x6201, {0x41}}, {db, 0x6355, {0x00}},           // kind 4; other
      {ut, 0x7F, {0x7F}}, {ut, 0x80, {0xC2, 0x80}}, {ut, 0x7FF, {0xDF, 0xBF}},
      {ut, 0x800, {0xE0, 0xA0, 0x80}}, {ut, 0xFFFF, {0xEF, 0xBF, 0xBF}}, {ut, 0xD800, {0xED, 0xA0, 0x80}}};
  for (const auto &c : cases) {
    uint8_t out[4];
    EXPECT_EQ(bytes(out, VLCpUnicodeToChar(c.page.cp(), c.u, out)), c.out) << std::hex << c.u;
    EXPECT_EQ(wBytes(VLCpUnicodeToCharW(c.page.cp(), c.u)), c.out) << std::hex << c.u;
  }
}

TEST_F(Pages, TypesCaseAndWidth) {
  struct {
    const char *in;
    uint32_t mask, type;
    Bytes out;
  } cases[] = {{"\x81\x40", 2, 2, {0x81, 0x41}}, {"\x81\x41", 4, 4, {0x81, 0x40}}, {"\x81\x41", 2, 4, {0x81, 0x41}},
               {"\x82\x40", 2, 0x20, {0x82, 0x40}}, {"A", 2, 0x400, {0x41}}};  // one byte reaches no leaf
  for (const auto &c : cases) {
    VLWChar w = VLMbToW(db.cp(), u8(c.in));
    EXPECT_EQ(VLGetMbCtype(db.cp(), u8(c.in))->type, c.type) << c.in;
    EXPECT_EQ(VLGetMbCtypeW(db.cp(), w)->type, c.type) << c.in;
    uint8_t out[4];
    EXPECT_EQ(bytes(out, VLCpMbCaseConv(db.cp(), u8(c.in), out, c.mask)), c.out) << c.in;
    EXPECT_EQ(wBytes(VLCpMbCaseConvW(db.cp(), w, c.mask)), c.out) << c.in;
  }
  uint8_t out[4];
  EXPECT_EQ(bytes(out, VLCpMbCaseConvS(sh.cp(), u8("\x42\x40"), out, 2)), (Bytes{0x42, 0x41}));
  EXPECT_EQ(bytes(out, VLCpMbCaseConvS(sh.cp(), u8("\x43\x40"), out, 2)), (Bytes{0x43, 0x40}));
  EXPECT_EQ(VLGetMbCtype(sb.cp(), u8("A"))->type, 0x400u);  // no type trie
  EXPECT_EQ(VLGetMbCtype(ut.cp(), u8("\xC3\xA9"))->type, 0x400u);
  std::pair<VLWChar, VLWChar> halfFull[] = {{0x30, 0x824F}, {0x41, 0x8260}, {0x61, 0x8281}, {0x40, 0}, {0x62, 0}};
  for (auto [h, f] : halfFull) EXPECT_EQ(VLCpMbHalfToFullW(db.cp(), h), f) << std::hex << h;
  std::pair<VLWChar, VLWChar> fullHalf[] = {{0x8250, 0x31}, {0x8260, 0x41}, {0x824F, 0x30}, {0x9999, 0}, {0, 0}};
  for (auto [f, h] : fullHalf) EXPECT_EQ(VLCpFullToHalfW(db.cp(), f), h) << std::hex << f;
  EXPECT_EQ(VLCpMbHalfToFullW(db.cp(), 0x31), 0u);  // the full-width table is not searched
  EXPECT_EQ(VLCpMbHalfToFullW(sb.cp(), 0x41), 0u);  // empty pair table
}

TEST_F(Pages, Strings) {
  struct {
    const Loaded &page;
    Bytes in;
    int32_t length;
    Units out;
  } toUni[] = {{sb, {'A', 0xE9, 0x80}, 3, {0x41, 0xE9, 0xFFFD}}, {sb, {'A', 0, 'B'}, 3, {0x41}},
               {db, {'A', 0x81, 0x40, 0x83, 0x41, 0x84, 0x40, 0}, -1, {0x41, 0x4E00, 0xFF22, 0xFFFD}},
               {db, {'A', 0x81, 0x40}, 2, {0x41}}, {db, {'A', 0x81, 0}, -1, {0x41}},  // cut characters left out
               {sh, {0xC1, 0x0E, 0x42, 0x40, 0x43, 0x41, 0x0F, 0xC2}, 8, {0x41, 0x4E00, 0x4E05, 0x42}},
               {sh, {0x0E, 0x42, 0x40, 0x42}, 4, {0x4E00}}, {sh, {0xC1, 0x0E, 0, 0x40}, 4, {0x41}},
               {ut, {'A', 0xC3, 0xA9, 0xE2, 0x82, 0xAC, 0xE2, 0x82, 0}, -1, {0x41, 0xE9, 0x20AC}},
               {ut, {0x80, 'A'}, 2, {0xFFFD, 0x41}}};  // a stray continuation byte stands alone
  for (const auto &c : toUni) {
    Units out(16);
    int32_t n = VLCpStrToUnicode(c.page.cp(), c.in.data(), c.length, out.data());
    out.resize(n < 0 ? 99 : static_cast<size_t>(n));
    EXPECT_EQ(out, c.out) << c.page.entry.id << " " << c.length;
  }
  VLUChar u[2];
  EXPECT_EQ(VLCpStrToUnicode(db.cp(), u8(""), -1, u), -1);
  EXPECT_EQ(VLCpStrToUnicode(db.cp(), u8("A"), 0, u), 0);
  struct {
    const Loaded &page;
    Units in;
    VLShiftState state;
    Bytes out;
  } fromUni[] = {{sh, {0x41, 0x4E00, 0x4E05, 0x42}, 0, {0xC1, 0x0E, 0x42, 0x40, 0x43, 0x41, 0x0F, 0xC2}},
                 {sh, {0x4E00}, 0, {0x0E, 0x42, 0x40, 0x0F}}, {sh, {0x41}, 1, {0x0F, 0xC1}},
                 {sh, {0x4E01}, 1, {0x42, 0x41, 0x0F}}, {sh, {0x41, 0, 0x42}, 0, {0xC1, 0x00, 0xC2}},
                 {sh, {0x4F00}, 0, {0x0E, 0x42, 0x0E, 0x0F}},  // a trail byte equal to SO is data
                 {db, {0x41, 0x4E00, 0x6100, 0x3080}, 0, {0x41, 0x81, 0x40, 0x8F, 0xA0, 0xA1, 0xA2, '?', 0}},
                 {ut, {0x41, 0x7FF, 0x800}, 0, {0x41, 0xDF, 0xBF, 0xE0, 0xA0, 0x80, 0}},
                 {db, {0x41, 0, 0x42}, 0, {0x41, 0}}};  // plain pages stop at 0 and add an uncounted 0
  for (const auto &c : fromUni) {
    Bytes out(32, 0xEE);
    int32_t n = VLCpUnicodeToStr(c.page.cp(), c.in.data(), static_cast<int32_t>(c.in.size()), c.state, out.data());
    out.resize(static_cast<size_t>(n) + (&c.page == &sh ? 0 : 1));
    EXPECT_EQ(out, c.out) << c.page.entry.id << " " << c.in[0];
  }
  // The 0 that ends the input is found at any place within or after a block of units, and
  // on either side of the stretches the input is searched in.
  std::vector<size_t> zeros;
  for (size_t at = 0; at <= 40; ++at) zeros.push_back(at);
  for (size_t at : {4095, 4096, 4097, 8191, 8192, 8193, 9000}) zeros.push_back(at);
  for (size_t at : zeros) {
    const size_t size = at <= 40 ? 40 : 9000;
    Units in(size, 0x41);
    if (at < in.size()) in[at] = 0;
    Bytes out(size + 8, 0xEE);
    EXPECT_EQ(VLCpUnicodeToStr(db.cp(), in.data(), static_cast<int32_t>(size), 0, out.data()), static_cast<int32_t>(at))
        << "0 at " << at;
    EXPECT_EQ(out[at], 0) << "0 at " << at;
    EXPECT_EQ(out[at + 1], 0xEE) << "0 at " << at;
  }
}

TEST_F(Pages, Lengths) {
  const uint8_t *s = u8("\xC1\x0E\x42\x40\x42\x41\x0F\xC2");
  int32_t bytesFor[] = {0, 2, 4, 7, 8};  // shift bytes behind a character count with it
  for (int32_t k = 0; k <= 4; ++k) EXPECT_EQ(VLCpStrCharToByteLen(sh.cp(), s, 0, k), bytesFor[k]) << k;
  EXPECT_EQ(VLCpStrCharToByteLen(sh.cp(), u8("\x42\x40\x0F\xC1"), 1, 1), 3);
  EXPECT_EQ(VLCpStrCharToByteLen(db.cp(), u8("A\x81\x40\x82\x41"), 0, 3), 5);
  struct {
    const Loaded &page;
    const char *s;
    VLShiftState state;
    int32_t bytes, chars;
  } cases[] = {{sh, "\xC1\x0E\x42\x40\x42\x41\x0F\xC2", 0, -1, 4}, {sh, "\xC1\x0E\x42", 0, 3, 1},
               {sh, "\xC1\x0E", 0, 2, 1}, {sh, "\x42\x40\x0F\xC1", 1, 4, 2}, {sh, "\x42\x40", 0, 2, 2},
               {sh, "\x42\x40", 0, 0, 0}, {db, "A\x81\x40\x82", 0, -1, 2}, {sb, "AB", 0, 5, 5},
               {ut, "A\xC3\xA9\xE2\x82", 0, 5, 2}};
  for (const auto &c : cases) EXPECT_EQ(VLCpStrByteToCharLen(c.page.cp(), u8(c.s), c.state, c.bytes), c.chars) << c.s;
}

// ---- First-generation objects -------------------------------------------------------

std::vector<Bytes> gen1(const Page &p) {
  mkdefs::CpSections v2, v1;
  v2.sections = p.sections();
  std::string err;
  EXPECT_TRUE(mkdefs::toGeneration1(v2, &v1, &err)) << err;
  return v1.sections;
}

struct Upgraded {
  void *body = nullptr, *trie = nullptr;
  VLObjEntry rec{};
  explicit Upgraded(std::vector<Bytes> v1) {
    body = VLCpV1toV2(v1[0].data(), static_cast<uint32_t>(v1[0].size()), v1[1].empty() ? nullptr : v1[1].data(),
                      static_cast<uint32_t>(v1[1].size()), &trie, &rec);
  }
  ~Upgraded() { vl::release(body), vl::release(trie); }
  Bytes section(int i) const {
    auto *p = static_cast<const uint8_t *>(i ? trie : body);
    return p ? Bytes(p, p + rec.sectionSize[i]) : Bytes{};
  }
};

TEST(CodePageV1, UpgradeRestoresTheLayout) {
  for (const Page &p : {doubleByte(true), singleByte(), utf8Page()}) {
    std::vector<Bytes> v1 = gen1(p);
    Upgraded up(v1);
    Bytes body = p.sections()[0], b = up.section(0), t = up.section(1);
    ASSERT_EQ(b.size(), body.size());
    // Nodes widen from 4 to 6 bytes with bounds 0-255; the values follow them.
    size_t nodes = (t.size() - v1[1].size()) / 2;
    EXPECT_EQ(b[vl::cp::kValueOff] << 8 | b[vl::cp::kValueOff + 1], t.empty() ? 0 : 6 * nodes);
    for (size_t i = 0; i < nodes; ++i) {
      const uint8_t *o = &v1[1][4 * i];
      EXPECT_EQ(Bytes(&t[6 * i], &t[6 * i + 6]), (Bytes{o[0], o[1], 0, 0xFF, o[2], o[3]})) << i;
    }
    EXPECT_EQ(Bytes(t.begin() + 6 * nodes, t.end()), Bytes(v1[1].begin() + 4 * nodes, v1[1].end()));
    std::memset(&b[vl::cp::kValueOff], 0, 2), std::memset(&body[vl::cp::kValueOff], 0, 2);
    EXPECT_EQ(b, body);
  }
  Page pairs = singleByte();  // a single-byte page keeps no tables, so no pair count either
  pairs.pairs = {{0x41, 0x8260}};
  EXPECT_EQ(Upgraded(gen1(pairs)).section(0), singleByte().sections()[0]);
  std::vector<Bytes> v1 = gen1(doubleByte(true));
  v1[0].resize(4371);
  EXPECT_FALSE(Upgraded(v1).body);
}

int allocs, frees, failAt;
TEST(CodePageV1, AllocationFailureLeaksNothing) {
  std::vector<Bytes> v1 = gen1(doubleByte(true));
  ASSERT_EQ(vlglobals, nullptr);
  vlalloc_cbk = [](uint32_t, size_t n) { return ++allocs == failAt ? nullptr : std::malloc(n); };
  vlfree_cbk = [](uint32_t, void *p) { return ++frees, std::free(p), 1; };
  for (failAt = 1; failAt <= 5; ++failAt) {  // body, two scratch blocks, trie; then none
    allocs = frees = 0;
    EXPECT_EQ(Upgraded(v1).body != nullptr, failAt == 5) << failAt;
    EXPECT_EQ(allocs - (failAt <= allocs), frees) << failAt;
  }
  vlalloc_cbk = VLDefAlloc, vlfree_cbk = VLDefFree;
}

TEST(CodePageV1, DamagedObjectsStayInBounds) {
  std::vector<Bytes> good = gen1(doubleByte(true));
  std::mt19937 rng(7);
  int accepted = 0;
  for (int round = 0; round < 400; ++round) {
    std::vector<Bytes> v1 = good;
    Bytes &t = v1[rng() % 2];
    size_t from = &t == &v1[0] ? 2300 : 0;  // index entries, flags, offsets and tables
    for (int k = 0; k < 3; ++k) t[from + rng() % (t.size() - from)] = static_cast<uint8_t>(rng());
    if (rng() % 4 == 0) v1[1].resize(rng() % v1[1].size());
    Upgraded up(v1);
    if (!up.body) continue;
    Loaded l({up.section(0), up.section(1), v1[2], v1[3]}, 2000);
    if (l.rc) continue;
    ++accepted;
    for (unsigned w = 0x8000; w <= 0x85FF; ++w) {
      uint8_t c[2] = {static_cast<uint8_t>(w >> 8), static_cast<uint8_t>(w)};
      VLCpMbToUnicode(l.cp(), c), VLGetMbCtype(l.cp(), c), VLCpFullToHalfW(l.cp(), VLCpMbHalfToFullW(l.cp(), w));
    }
    for (unsigned u = 0; u <= 0xFFFF; ++u) VLCpUnicodeToCharW(l.cp(), static_cast<VLUChar>(u));
  }
  EXPECT_GT(accepted, 100);
}

TEST(CodePageV1, LoadsThroughTheObjectManager) {
  ASSERT_EQ(vlglobals, nullptr);
  char tmpl[] = "/tmp/vlcpXXXXXX";
  ASSERT_TRUE(mkdtemp(tmpl));
  std::string dir = tmpl, err;
  auto put = [&](uint16_t id, const std::vector<Bytes> &s, uint32_t gen) {
    Bytes f;
    ASSERT_TRUE(mkdefs::containerFile(s, gen, &f, &err) &&
                mkdefs::writeFile(dir + "/" + mkdefs::objectFileName(VL_OBJ_CODEPAGE, id), f, &err)) << err;
  };
  put(367, singleByte().sections(), 2);
  put(2001, doubleByte(true).sections(), 2), put(2002, gen1(doubleByte(true)), 1);
  Bytes control;
  ASSERT_TRUE(mkdefs::controlFile({{367, 2, "A"}, {2001, 2, "D"}, {2002, 2, "D1"}}, &control, &err) &&
              mkdefs::writeFile(dir + "/control.nls", control, &err)) << err;

  ASSERT_EQ(VLInit(dir.c_str(), nullptr, nullptr, 0, 0), 0u);
  VLObjManager *m = vlglobals->objManager;
  uint32_t rc = 1;
  const VLCodePage *v2 = VLGetObjFromID(m, VL_OBJ_CODEPAGE, 2001, 0, &rc), *v1 = VLGetObjFromID(m, 2, 2002, 0, &rc);
  ASSERT_TRUE(v1 && v2);
  EXPECT_EQ(rc, 0u);
  EXPECT_EQ(v1->flags & 0x06, 0x06);
  for (unsigned w = 0x8000; w <= 0x85FF; ++w) {
    ASSERT_EQ(VLCpMbToUnicodeW(v1, w), VLCpMbToUnicodeW(v2, w)) << std::hex << w;
    const VLCtypeRecord *a = VLGetMbCtypeW(v1, w), *b = VLGetMbCtypeW(v2, w);
    ASSERT_TRUE(a->type == b->type && a->caseDelta == b->caseDelta) << std::hex << w;
  }
  for (unsigned u = 0; u <= 0xFFFF; ++u)
    ASSERT_EQ(VLCpUnicodeToCharW(v1, VLUChar(u)), VLCpUnicodeToCharW(v2, VLUChar(u))) << std::hex << u;

  VLUChar u[5] = {9, 9, 9, 9, 9};  // the ASCII helpers go through code page 367
  EXPECT_EQ(VLComStrToUnicode(u8("Ab\xE9"), 0xFFFFFFFFu, u), 3);
  EXPECT_EQ(Units(u, u + 5), (Units{0x41, 0x62, 0xE9, 0, 9}));
  EXPECT_EQ(VLComStrToUnicode(u8("Ab"), 1, u), 1);
  EXPECT_EQ(VLComStrToUnicode(u8(""), 0xFFFFFFFFu, u), -1);
  const VLUChar in[] = {0x41, 0xE9, 0x20AC, 0};
  uint8_t out[8];
  EXPECT_EQ(VLComUnicodeToStr(in, 0xFFFFFFFFu, out), 3);
  EXPECT_EQ(bytes(out, 4), (Bytes{0x41, 0xE9, '?', 0}));
  EXPECT_EQ(VLTerm(), 0u);
  EXPECT_EQ(VLComStrToUnicode(u8("A"), 1, u), -1);  // no library, no code page 367
  std::filesystem::remove_all(dir);
}

}  // namespace
