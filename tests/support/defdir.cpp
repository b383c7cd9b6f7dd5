#include "support/defdir.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <stdexcept>

namespace ts {

TempDir::TempDir() {
  char tmpl[] = "/tmp/vltestXXXXXX";
  char *p = mkdtemp(tmpl);
  if (!p) throw std::runtime_error("mkdtemp");
  path = p;
}
TempDir::~TempDir() {
  std::error_code ec;
  std::filesystem::remove_all(path, ec);
}

Bytes textBody(int headerWords, const Words &words, const Texts &texts) {
  Bytes b(static_cast<size_t>(headerWords) * 2, 0);
  for (auto [w, v] : words) mkdefs::set16(b, static_cast<size_t>(w) * 2, v);
  for (auto &[w, t] : texts) {
    mkdefs::set16(b, static_cast<size_t>(w) * 2, static_cast<uint16_t>(b.size()));
    for (char16_t c : t) mkdefs::put16(b, c);
    mkdefs::put16(b, 0);
  }
  return b;
}

Bytes languageBody(uint16_t territory, uint16_t codePage, uint16_t sort, const std::u16string &code,
                   const std::u16string &name) {
  Words w{{0, territory}, {1, codePage}, {2, sort}};
  Texts t{{5, code}, {6, name}};
  for (int i = 7; i <= 48; ++i) t[i] = name.substr(0, 2) + std::u16string(1, static_cast<char16_t>(u'A' + (i - 7) % 26));
  Bytes b = textBody(51, w, t);
  mkdefs::set16(b, 98, static_cast<uint16_t>(b.size()));
  mkdefs::set16(b, 100, static_cast<uint16_t>(b.size()));
  return b;
}

Bytes territoryBody(const std::u16string &currency, const std::u16string &code, uint16_t decimal, uint16_t group) {
  Words w{{0, decimal}, {1, group}, {2, ';'}, {3, decimal}, {4, group}, {5, 2}, {6, 2}, {7, 2},
          {8, 0x0101}, {9, 0}, {10, 0x0A}};
  Texts t{{11, code}, {12, code + u" land"}, {13, u"3;0"}, {14, u"3;0"}, {15, currency}, {16, u"XXX"},
          {17, u""}, {18, u"-"}, {19, u"%H:%M:%S"}, {20, u"%d.%m.%y"}, {21, u"%A, %d. %B %Y"}};
  return textBody(22, w, t);
}

const mkdefs::UnicodeProps &unicode() {
  static mkdefs::UnicodeProps props = [] {
    mkdefs::UnicodeProps p;
    std::string err;
    if (!mkdefs::loadUnicode("/usr/share/unicode", &p, &err)) throw std::runtime_error("unicode data: " + err);
    return p;
  }();
  return props;
}

namespace {
void mapBoth(mkdefs::CpSource &s, const std::string &bytes, uint16_t u) {
  s.toUni[bytes] = u;
  s.fromUni[u] = bytes;
}
}  // namespace

mkdefs::CpSource singleByteSource(uint16_t id, const std::string &name) {
  mkdefs::CpSource s;
  s.id = id;
  s.name = name;
  s.lenByLead.fill(1);
  for (int b = 0; b < 256; ++b)
    if (b < 0x80 || b >= 0xA0) mapBoth(s, std::string(1, static_cast<char>(b)), static_cast<uint16_t>(b));
  return s;
}

mkdefs::CpSource doubleByteSource(uint16_t id, const std::string &name) {
  mkdefs::CpSource s;
  s.id = id;
  s.name = name;
  s.maxLen = 2;
  s.lenByLead.fill(1);
  for (int b = 0; b < 0x80; ++b) mapBoth(s, std::string(1, static_cast<char>(b)), static_cast<uint16_t>(b));
  // Half-width katakana at A1-DF, double-byte characters 81-9F x 40-7E, 80-FC.
  for (int b = 0xA1; b <= 0xDF; ++b) mapBoth(s, std::string(1, static_cast<char>(b)), static_cast<uint16_t>(0xFF61 + b - 0xA1));
  for (int lead = 0x81; lead <= 0x9F; ++lead) {
    s.lenByLead[static_cast<size_t>(lead)] = 2;
    for (int t = 0x40; t <= 0xFC; ++t) {
      if (t == 0x7F) continue;
      int n = (lead - 0x81) * 188 + (t - 0x40);
      std::string seq{static_cast<char>(lead), static_cast<char>(t)};
      uint16_t u = lead == 0x82 && t >= 0x60 && t < 0x60 + 26 ? static_cast<uint16_t>(0xFF21 + t - 0x60)  // full-width A-Z
                   : lead == 0x82 && t >= 0x81 && t < 0x81 + 26 ? static_cast<uint16_t>(0xFF41 + t - 0x81) // full-width a-z
                                                                : static_cast<uint16_t>(0x4E00 + n);
      mapBoth(s, seq, u);
    }
  }
  s.lenByLead[0x80] = 2;
  mapBoth(s, "\x80\x40", 0x00A0);  // a no-break space that is double-byte here
  return s;
}

mkdefs::CpSource shiftSource(uint16_t id, const std::string &name) {
  mkdefs::CpSource s;
  s.id = id;
  s.name = name;
  s.ascii = false;
  s.shift = true;
  s.maxLen = 2;
  s.subst = 0x3F;
  s.lf = 0x25;
  s.cr = 0x0D;
  s.ls = 0x25;
  s.ps = 0x25;
  s.lenByLead.fill(1);
  // A small EBCDIC repertoire: space, digits, upper and lower letters.
  mapBoth(s, "\x40", ' ');
  mapBoth(s, "\x25", '\n');
  mapBoth(s, std::string(1, '\0'), 0);
  for (int i = 0; i < 10; ++i) mapBoth(s, std::string(1, static_cast<char>(0xF0 + i)), static_cast<uint16_t>('0' + i));
  const int upper[] = {0xC1, 0xC2, 0xC3, 0xC4, 0xC5, 0xC6, 0xC7, 0xC8, 0xC9, 0xD1, 0xD2, 0xD3, 0xD4,
                       0xD5, 0xD6, 0xD7, 0xD8, 0xD9, 0xE2, 0xE3, 0xE4, 0xE5, 0xE6, 0xE7, 0xE8, 0xE9};
  for (int i = 0; i < 26; ++i) {
    mapBoth(s, std::string(1, static_cast<char>(upper[i])), static_cast<uint16_t>('A' + i));
    mapBoth(s, std::string(1, static_cast<char>(upper[i] - 0x40)), static_cast<uint16_t>('a' + i));
  }
  for (int lead = 0x45; lead <= 0x48; ++lead)
    for (int t = 0x41; t <= 0xFE; ++t)
      mapBoth(s, std::string{static_cast<char>(lead), static_cast<char>(t)},
              static_cast<uint16_t>(0x4E00 + (lead - 0x45) * 190 + (t - 0x41)));
  mapBoth(s, "\x40\x40", 0x3000);  // ideographic space
  return s;
}

void DefDir::addCodePage(const mkdefs::CpSource &src) {
  mkdefs::CpSections cs;
  std::string err;
  if (!mkdefs::buildCodePage(src, unicode(), &cs, &err)) throw std::runtime_error("code page: " + err);
  add(2, src.id, src.name, cs.sections, 2);
}

DefDir DefDir::standard() {
  DefDir d;
  d.add(0, 1, "English", {languageBody(840, 367, 0, u"en", u"English")});
  d.add(0, 2, "German", {languageBody(276, 819, 0, u"de", u"German")});
  d.add(1, 276, "Germany", {territoryBody(u"\u20ac", u"DE", ',', '.')});
  d.add(1, 250, "France", {territoryBody(u"\u20ac", u"FR", ',', 0x00A0)});
  d.add(1, 840, "UnitedStates", {territoryBody(u"$", u"US")});
  auto ascii = singleByteSource(367, "US-ASCII");
  for (int b = 0x80; b < 0x100; ++b) ascii.toUni.erase(std::string(1, static_cast<char>(b)));
  for (int u = 0x80; u < 0x100; ++u) ascii.fromUni.erase(static_cast<uint16_t>(u));
  d.addCodePage(ascii);
  d.addCodePage(singleByteSource(819, "Latin1"));
  d.addCodePage(doubleByteSource(932, "MS932"));
  d.addCodePage(shiftSource(930, "IBM-930"));
  return d;
}

void DefDir::write(const std::string &dir, const std::string &aliases) const {
  std::vector<mkdefs::ControlRow> rows;
  std::string err;
  for (const Object &o : objects) {
    rows.push_back({o.id, o.type, o.name});
    Bytes f;
    if (!mkdefs::containerFile(o.sections, o.generation, &f, &err)) throw std::runtime_error(err);
    writeBytes(objectPath(dir, o.type, o.id), f);
  }
  Bytes c;
  if (!mkdefs::controlFile(rows, &c, &err)) throw std::runtime_error(err);
  writeBytes(dir + "/control.nls", c);
  if (!aliases.empty()) {
    std::ofstream(dir + "/alias.txt") << aliases;
  }
}

Bytes readFile(const std::string &path) {
  std::ifstream in(path, std::ios::binary);
  return Bytes(std::istreambuf_iterator<char>(in), {});
}

void writeBytes(const std::string &path, const Bytes &b) {
  std::ofstream out(path, std::ios::binary | std::ios::trunc);
  out.write(reinterpret_cast<const char *>(b.data()), static_cast<std::streamsize>(b.size()));
}

std::string objectPath(const std::string &dir, uint8_t type, uint16_t id) {
  return dir + "/" + mkdefs::objectFileName(type, id);
}

}  // namespace ts
