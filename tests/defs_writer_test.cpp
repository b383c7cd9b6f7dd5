// The definition writer: container bytes, Unicode type words, and code page objects built
// from small sources and read back through the library's load check and primitives.
#include <gtest/gtest.h>


#include "container.h"
#include "cpbuild.h"
#include "frame/frame.h"
#include "support/cpmem.h"
#include "support/defdir.h"
#include "ucd.h"

namespace {

using namespace mkdefs;

uint16_t be16(const Bytes &b, size_t at) { return static_cast<uint16_t>(b.at(at) << 8 | b.at(at + 1)); }
uint32_t be32(const Bytes &b, size_t at) { return static_cast<uint32_t>(be16(b, at)) << 16 | be16(b, at + 2); }

const UnicodeProps &ucd() { return ts::unicode(); }

TEST(DefsContainer, HeaderAndSections) {
  Bytes f;
  std::string err;
  ASSERT_TRUE(containerFile({Bytes(5, 0xAA), Bytes(), Bytes(3, 0xBB)}, 2, &f, &err)) << err;
  EXPECT_EQ(be32(f, 0), 0x476CF462u);
  EXPECT_EQ(be32(f, 4), 0x20000000u);
  EXPECT_EQ(be16(f, 8), 3);
  EXPECT_EQ(be16(f, 10), 5);  // section 0: size beside the count, offset at 12
  EXPECT_EQ(be32(f, 12), 76u);
  EXPECT_EQ(be16(f, 16), 0);  // empty section 1
  EXPECT_EQ(be32(f, 20), 0u);
  EXPECT_EQ(be16(f, 24), 3);
  EXPECT_EQ(be32(f, 28), 84u);  // 4-byte aligned after section 0
  for (size_t at : {18, 26, 34})
    EXPECT_EQ(be16(f, at), 0) << at;
  for (size_t at = 36; at < 76; ++at) EXPECT_EQ(f[at], 0) << at;
  ASSERT_EQ(f.size(), 87u);
  EXPECT_EQ(f[76], 0xAA);
  EXPECT_EQ(f[84], 0xBB);

  ASSERT_TRUE(containerFile({Bytes(1)}, 1, &f, &err));
  EXPECT_EQ(be32(f, 4), 0x10000000u);
}

TEST(DefsContainer, RefusesWhatCannotBeRead) {
  Bytes f;
  std::string err;
  const std::vector<std::vector<Bytes>> bad = {{}, {Bytes(1), Bytes(1), Bytes(1), Bytes(1), Bytes(1)},
                                               {Bytes(1), Bytes(65536)}};
  for (const auto &sections : bad) EXPECT_FALSE(containerFile(sections, 2, &f, &err)) << sections.size();
  EXPECT_NE(err.find("section 1"), std::string::npos) << err;
  EXPECT_TRUE(containerFile({Bytes(65535)}, 2, &f, &err));
}

TEST(DefsContainer, ControlRowsSortedByTypeThenId) {
  Bytes f;
  std::string err;
  ASSERT_TRUE(controlFile({{850, 2, "IBM850"}, {1, 1, "UnitedStates"}, {437, 2, "IBM437"}, {7, 0, "German"},
                           {1, 0, std::string(33, 'x')}},
                          &f, &err))
      << err;
  ASSERT_EQ(be16(f, 10), 5 * 38);
  const size_t t = be32(f, 12);
  const std::vector<std::pair<uint16_t, uint8_t>> order = {{1, 0}, {7, 0}, {1, 1}, {437, 2}, {850, 2}};
  for (size_t i = 0; i < order.size(); ++i) {
    EXPECT_EQ(be16(f, t + 38 * i), order[i].first) << i;
    EXPECT_EQ(f[t + 38 * i + 2], order[i].second) << i;
    EXPECT_EQ(f[t + 38 * i + 3], 0) << i;
    EXPECT_EQ(f[t + 38 * i + 37], 0) << i;  // the name is always terminated
  }
  EXPECT_EQ(std::string(reinterpret_cast<const char *>(&f[t + 38 * 3 + 4])), "IBM437");

  EXPECT_FALSE(controlFile({{1, 0, std::string(34, 'x')}}, &f, &err));
  EXPECT_FALSE(controlFile({{1, 0, "A"}, {1, 0, "B"}}, &f, &err));
  EXPECT_FALSE(controlFile({{1, 4, "A"}}, &f, &err));
  EXPECT_EQ(objectFileName(2, 850), "cp_00850.nls");
  EXPECT_EQ(objectFileName(3, 65535), "so_65535.nls");
}

TEST(DefsUnicode, TypeWords) {
  const std::vector<std::pair<uint16_t, uint32_t>> cases = {
      {0x0041, 0x10000A13},  // alpha upper xdigit ASCII, L, half-width
      {0x0030, 0x10002218},  // digit xdigit ASCII, EN, half-width
      {0x0020, 0x101002C0},  // space blank ASCII, WS, half-width
      {0x0009, 0x000803C0},  // control space blank ASCII, S
      {0x4E00, 0x40000801},  // ideograph
      {0x30A2, 0x04000801},  // katakana
      {0x3042, 0x08000801},  // hiragana
      {0xFF71, 0x14000801},  // half-width katakana
      {0xFF21, 0x20000813},  // full-width A
      {0x0301, 0x00C00400},  // non-spacing diacritic, direction not applicable
      {0x093F, 0x01000801},  // vowel sign
      {0x0640, 0x80001001},  // kashida, AL
      {0x05D0, 0x00001001},  // R
      {0x0661, 0x00010008},  // digit, AN
      {0x00B2, 0x00002008},  // superscript two counts as a digit
      {0x20AC, 0x02008020},  // punctuation, ET, symbol
      {0x2028, 0x00100140},  // line separator
      {0x0378, 0x400},       // unassigned
      {0xE000, 0x400},       // private use
      {0xD800, 0x400},       // surrogate
  };
  for (const auto &[u, word] : cases) EXPECT_EQ(ucd().typeWord.at(u), word) << std::hex << u;
  EXPECT_EQ(ucd().lower.at(0x41), 0x61);
  EXPECT_EQ(ucd().upper.at(0xE9), 0xC9);
  EXPECT_EQ(ucd().upper.at(0x41), 0x41);
  const std::vector<std::pair<uint16_t, uint16_t>> widths = {{0x41, 0xFF21}, {0xFF71, 0x30A2}, {0x20, 0x3000}, {0xA2, 0xFFE0}};
  for (const auto &[half, full] : widths) {
    EXPECT_EQ(ucd().wide.at(half), full) << std::hex << half;
    EXPECT_EQ(ucd().narrow.at(full), half) << std::hex << full;
  }
}

// A double-byte page in the manner of the Japanese ones: ASCII, half-width katakana
// singles, lead bytes 0x81-0x9F and 0xE0 of two bytes, 0x8F of three.
CpSource sample() {
  CpSource s;
  s.id = 9001;
  s.name = "Sample";
  s.maxLen = 3;
  s.lenByLead.fill(1);
  auto map2 = [&](const std::string &b, uint16_t u, bool back = true) {
    s.toUni[b] = u;
    if (back) s.fromUni[u] = b;
  };
  for (int b = 0; b < 0x80; ++b) map2(std::string(1, static_cast<char>(b)), static_cast<uint16_t>(b));
  map2("\xA1", 0xFF61);
  for (int b = 0x81; b <= 0x9F; ++b) s.lenByLead[b] = 2;
  s.lenByLead[0xE0] = 2;
  s.lenByLead[0x8F] = 3;
  map2("\x81\x40", 0x3000);
  map2("\x81\x42", 0x3002);
  map2("\x81\xFC", 0x3000, false);  // duplicate: decodes, never encoded
  for (int i = 0; i < 26; ++i) {
    map2(std::string("\x82") + static_cast<char>(0x60 + i), static_cast<uint16_t>(0xFF21 + i));
    map2(std::string("\x82") + static_cast<char>(0x81 + i), static_cast<uint16_t>(0xFF41 + i));
  }
  // Thirty rows of ideographs: their type records must be shared.
  uint16_t u = 0x4E00;
  for (int lead = 0x88; lead <= 0x9F; ++lead) {
    if (lead == 0x8F) continue;
    for (int t = 0x40; t <= 0xFC; ++t)
      if (t != 0x7F) map2(std::string(1, static_cast<char>(lead)) + static_cast<char>(t), u++);
  }
  map2("\xE0\x40", 0x00E9);  // e-acute here, its capital in another row
  map2("\xE0\x50", 0x00C9);
  map2("\x8F\xA1\xA1", 0x4E02 + 0x4000);
  map2("\x8F\xA2\xA3", 0x00C0);  // capital A-grave: no lower case here
  s.fromUni[0x00A5] = "\x5C";    // one-way: yen sign to backslash
  return s;
}

uint32_t packW(const std::string &s) {
  uint32_t w = 0;
  for (unsigned char c : s) w = w << 8 | c;
  return w;
}
const unsigned char *uc(const std::string &s) { return reinterpret_cast<const unsigned char *>(s.data()); }

TEST(DefsCodePage, DoubleByteReadsBackThroughTheLibrary) {
  const CpSource src = sample();
  CpSections cp;
  std::string err;
  ASSERT_TRUE(buildCodePage(src, ucd(), &cp, &err)) << err;
  cpmem::Loaded l(cp.sections, src.id);
  ASSERT_EQ(l.rc, 0u);

  for (const auto &[bytes, u] : src.toUni) {
    std::string z = bytes + std::string(4, '\0');
    const uint16_t got = bytes.size() == 1 ? vl::rd16(static_cast<const uint8_t *>(l.cp()->section[0]) + 778 + 2 * uc(bytes)[0])
                                           : VLCpMbToUnicode(l.cp(), uc(z));
    EXPECT_EQ(got, u) << std::hex << packW(bytes);
    const uint32_t type = bytes.size() == 1 ? vl::rd32(static_cast<const uint8_t *>(l.cp()->section[0]) + 1292 + 4 * uc(bytes)[0])
                                            : VLGetMbCtype(l.cp(), uc(z))->type;
    EXPECT_EQ(type, ucd().typeWord[u]) << std::hex << packW(bytes);
  }
  for (const auto &[u, bytes] : src.fromUni) EXPECT_EQ(VLCpUnicodeToCharW(l.cp(), u), packW(bytes)) << std::hex << u;

  // Tight bounds: undefined trail bytes decode to U+FFFD; unmapped units give the substitution byte.
  for (const char *bad : {"\xE0\x45", "\xE0\x3F", "\xE0\x51", "\x8F\xA1\xA2", "\x8F\xA3\xA1", "\x82\x7F"})
    EXPECT_EQ(VLCpMbToUnicode(l.cp(), uc(bad)), 0xFFFD) << packW(bad);
  for (uint16_t u : {0x1234, 0x4E01 + 0x4000, 0xFFFF}) EXPECT_EQ(VLCpUnicodeToCharW(l.cp(), u), src.subst) << u;

  // Case deltas lead to the other case in this code page, or nowhere.
  const std::vector<std::tuple<std::string, uint32_t, uint32_t>> cases = {
      {"\x82\x60", 0x002, 0x8281}, {"\x82\x81", 0x004, 0x8260},
      {"\xE0\x40", 0x004, 0xE050}, {"\xE0\x50", 0x002, 0xE040}, {"\x8F\xA2\xA3", 0x002, 0x8FA2A3},
  };
  for (const auto &[bytes, mask, want] : cases) EXPECT_EQ(VLCpMbCaseConvW(l.cp(), packW(bytes), mask), want) << bytes;

  EXPECT_EQ(VLCpMbHalfToFullW(l.cp(), 'A'), 0x8260u);
  EXPECT_EQ(VLCpMbHalfToFullW(l.cp(), 0xA1), 0x8142u);
  EXPECT_EQ(VLCpMbHalfToFullW(l.cp(), 0x7F), 0u);
  EXPECT_EQ(VLCpFullToHalfW(l.cp(), 0x8260), 'A');
  EXPECT_EQ(VLCpFullToHalfW(l.cp(), 0x8140), ' ');

  // Thirty ideograph rows share their type records: without sharing they alone would
  // take 30 x 256 records.
  EXPECT_LT(cp.sections[0].size(), 9000u);
}

TEST(DefsCodePage, Utf8KeepsItsFixedTables) {
  CpSource s;
  s.id = 57352;
  s.name = "UTF-8";
  s.maxLen = 3;
  for (int b = 0; b < 256; ++b) s.lenByLead[b] = b < 0xC0 ? 1 : b < 0xE0 ? 2 : 3;
  CpSections cp;
  std::string err;
  ASSERT_TRUE(buildCodePage(s, ucd(), &cp, &err)) << err;
  cpmem::Loaded l(cp.sections, s.id);
  ASSERT_EQ(l.rc, 0u);
  const Bytes &body = cp.sections[0];
  EXPECT_EQ(body[10 + 0xC3], 2);
  EXPECT_EQ(body[10 + 0xF0], 3);
  EXPECT_EQ(be16(body, 778 + 2 * 'A'), 'A');
  EXPECT_EQ(be16(body, 778 + 2 * 0x80), 0xFFFD);
  EXPECT_EQ(VLCpMbHalfToFullW(l.cp(), 'A'), 0xEFBCA1u);
  // The whole BMP's type records do not fit one section: the trie is left out, and said so.
  EXPECT_EQ(be16(body, 4370), 0);
  EXPECT_FALSE(cp.note.empty());
}

TEST(DefsCodePage, OverflowNamesTheSection) {
  CpSource s;
  s.id = 9003;
  s.name = "Huge";
  s.maxLen = 3;
  s.lenByLead.fill(1);
  // Distinct ideographs and syllables: no value run repeats, while their few type records
  // keep the body small, so the conversion trie is what overflows.
  std::vector<uint16_t> units;
  for (auto [from, to] : {std::pair{0x3400, 0x4DBF}, {0x4E00, 0x9FFF}, {0xAC00, 0xD7A3}})
    for (int u = from; u <= to; ++u) units.push_back(static_cast<uint16_t>(u));
  size_t k = 0;
  for (int lead : {0x81, 0x82}) {
    s.lenByLead[lead] = 3;
    for (int b = 0x40; b <= 0xFE; ++b)
      for (int c = 0x40; c < 0xA4; ++c)
        s.toUni[{static_cast<char>(lead), static_cast<char>(b), static_cast<char>(c)}] = units.at(k++);
  }
  CpSections cp;
  std::string err;
  EXPECT_FALSE(buildCodePage(s, ucd(), &cp, &err));
  EXPECT_NE(err.find("section 1 (conversion trie)"), std::string::npos) << err;
}

}  // namespace
