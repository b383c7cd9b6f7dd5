#include "iconvcp.h"

#include <iconv.h>

#include <cerrno>
#include <cstring>
#include <map>
#include <set>
#include <algorithm>

namespace mkdefs {

const std::vector<CodePageDef> &codeCodePageDefs() {
  static const std::vector<CodePageDef> kPages = {
      {367, "US-ASCII", "ANSI_X3.4-1968", false, false,
       {"ASCII", "ANSI_X3.4-1968", "ISO646-US", "CP367", "IBM367", "IBM-367", "367", "US"}},
      {819, "Latin1", "ISO-8859-1", false, false,
       {"ISO-8859-1", "ISO8859-1", "ISO_8859-1", "ISO88591", "8859-1", "CP819", "IBM819", "IBM-819", "819", "L1",
        "LATIN-1"}},
      {912, "ISO-8859-2", "ISO-8859-2", false, false,
       {"ISO8859-2", "ISO_8859-2", "ISO88592", "8859-2", "CP912", "IBM912", "IBM-912", "912", "L2", "LATIN2",
        "LATIN-2"}},
      {915, "ISO-8859-5", "ISO-8859-5", false, false,
       {"ISO8859-5", "ISO_8859-5", "ISO88595", "8859-5", "CP915", "IBM915", "IBM-915", "915", "CYRILLIC"}},
      {1089, "ISO-8859-6", "ISO-8859-6", false, false,
       {"ISO8859-6", "ISO_8859-6", "ISO88596", "8859-6", "CP1089", "IBM1089", "IBM-1089", "1089", "ARABIC"}},
      {813, "ISO-8859-7", "ISO-8859-7", false, false,
       {"ISO8859-7", "ISO_8859-7", "ISO88597", "8859-7", "CP813", "IBM813", "IBM-813", "813", "GREEK"}},
      {916, "ISO-8859-8", "ISO-8859-8", false, false,
       {"ISO8859-8", "ISO_8859-8", "ISO88598", "8859-8", "CP916", "IBM916", "IBM-916", "916", "HEBREW"}},
      {920, "ISO-8859-9", "ISO-8859-9", false, false,
       {"ISO8859-9", "ISO_8859-9", "ISO88599", "8859-9", "CP920", "IBM920", "IBM-920", "920", "L5", "LATIN5",
        "LATIN-5"}},
      {923, "ISO-8859-15", "ISO-8859-15", false, false,
       {"ISO8859-15", "ISO_8859-15", "ISO885915", "8859-15", "CP923", "IBM923", "IBM-923", "923", "L9", "LATIN9",
        "LATIN-9"}},
      {874, "MS874", "CP874", false, false, {"CP874", "WINDOWS-874", "874"}},
      {1250, "MS1250", "CP1250", false, false, {"CP1250", "WINDOWS-1250", "IBM-1250", "1250"}},
      {1251, "MS1251", "CP1251", false, false, {"CP1251", "WINDOWS-1251", "IBM-1251", "1251"}},
      {1252, "MS1252", "CP1252", false, false, {"CP1252", "WINDOWS-1252", "IBM-1252", "1252"}},
      {1253, "MS1253", "CP1253", false, false, {"CP1253", "WINDOWS-1253", "IBM-1253", "1253"}},
      {1254, "MS1254", "CP1254", false, false, {"CP1254", "WINDOWS-1254", "IBM-1254", "1254"}},
      {1255, "MS1255", "CP1255", false, false, {"CP1255", "WINDOWS-1255", "IBM-1255", "1255"}},
      {1256, "MS1256", "CP1256", false, false, {"CP1256", "WINDOWS-1256", "IBM-1256", "1256"}},
      {1257, "MS1257", "CP1257", false, false, {"CP1257", "WINDOWS-1257", "IBM-1257", "1257"}},
      {921, "ISO-8859-13", "ISO-8859-13", false, false,
       {"ISO8859-13", "ISO_8859-13", "ISO885913", "8859-13", "CP921", "IBM921", "IBM-921", "921", "L7", "LATIN7",
        "LATIN-7"}},
      {437, "IBM437", "IBM437", false, false, {"CP437", "IBM-437", "437"}},
      {850, "IBM850", "IBM850", false, false, {"CP850", "IBM-850", "850"}},
      {878, "KOI8-R", "KOI8-R", false, false, {"KOI8R", "CP878", "IBM878", "IBM-878", "878"}},
      {1168, "KOI8-U", "KOI8-U", false, false, {"KOI8U", "CP1168", "IBM1168", "IBM-1168", "1168"}},
      {37, "IBM037", "IBM037", true, false, {"CP037", "CP37", "IBM37", "IBM-037", "IBM-37", "EBCDIC-CP-US", "037", "37"}},
      {273, "IBM273", "IBM273", true, false, {"CP273", "IBM-273", "273"}},
      {500, "IBM500", "IBM500", true, false, {"CP500", "IBM-500", "EBCDIC-CP-BE", "EBCDIC-CP-CH", "500"}},
      {1047, "IBM1047", "IBM1047", true, false, {"CP1047", "IBM-1047", "1047"}},
      {932, "MS932", "WINDOWS-31J", false, false,
       {"SJIS", "SHIFT_JIS", "SHIFT-JIS", "CP932", "WINDOWS-31J", "MS_KANJI", "932"}},
      {954, "JapanEUC", "EUC-JP", false, false, {"EUC-JP", "EUCJP", "UJIS", "IBM-954", "954"}},
      {936, "MS936", "CP936", false, false, {"CP936", "GBK", "WINDOWS-936", "936"}},
      {949, "MS949", "CP949", false, false, {"CP949", "UHC", "WINDOWS-949", "949"}},
      {950, "MS950", "CP950", false, false, {"CP950", "BIG5", "BIG-5", "WINDOWS-950", "950"}},
      {970, "EUC-KR", "EUC-KR", false, false, {"EUCKR", "IBM-970", "970"}},
      {964, "EUC-TW", "EUC-TW", false, false, {"EUCTW", "IBM-964", "964"}},
      {57352, "UTF-8", "UTF-8", false, false, {"UTF8", "CP65001", "65001", "IBM-1208", "1208"}},
      {930, "IBM930", "IBM930", true, true, {"CP930", "IBM-930", "930"}},
      {939, "IBM939", "IBM939", true, true, {"CP939", "IBM-939", "939"}},
      {933, "IBM933", "IBM933", true, true, {"CP933", "IBM-933", "933"}},
      {935, "IBM935", "IBM935", true, true, {"CP935", "IBM-935", "935"}},
      {937, "IBM937", "IBM937", true, true, {"CP937", "IBM-937", "937"}},
  };
  return kPages;
}

namespace {

constexpr uint16_t kUtf8 = 57352;

class Iconv {
 public:
  Iconv(const std::string &to, const std::string &from) : cd_(iconv_open(to.c_str(), from.c_str())) {}
  ~Iconv() {
    if (ok()) iconv_close(cd_);
  }
  Iconv(const Iconv &) = delete;
  Iconv &operator=(const Iconv &) = delete;
  bool ok() const { return cd_ != reinterpret_cast<iconv_t>(-1); }

  enum Status { kDone, kIncomplete, kInvalid };
  // Converts in from the initial state, flushing any pending shift or character.
  Status run(const std::string &in, std::string *out) {
    iconv(cd_, nullptr, nullptr, nullptr, nullptr);
    char buf[64];
    char *op = buf;
    size_t ol = sizeof buf;
    char *ip = const_cast<char *>(in.data());
    size_t il = in.size();
    if (iconv(cd_, &ip, &il, &op, &ol) == static_cast<size_t>(-1)) return errno == EINVAL ? kIncomplete : kInvalid;
    if (iconv(cd_, nullptr, nullptr, &op, &ol) == static_cast<size_t>(-1)) return kInvalid;
    out->assign(buf, static_cast<size_t>(op - buf));
    return kDone;
  }

 private:
  iconv_t cd_;
};

std::vector<uint32_t> ucs4(const std::string &s) {
  std::vector<uint32_t> v;
  for (size_t i = 0; i + 4 <= s.size(); i += 4) {
    uint32_t u;
    std::memcpy(&u, s.data() + i, 4);
    v.push_back(u);
  }
  return v;
}

struct Walker {
  Iconv &dec;
  std::string shiftPrefix;  // Shift-Out in front of double-byte sequences
  size_t maxDepth;
  Extracted &x;
  std::map<std::string, uint16_t> found;

  // Lead bytes first: a prefix that iconv calls incomplete is extended by every byte.
  void walk(const std::string &prefix) {
    for (int b = 0; b < 256; ++b) {
      const std::string s = prefix + static_cast<char>(b);
      std::string out;
      switch (dec.run(shiftPrefix + s, &out)) {
        case Iconv::kIncomplete:
          if (s.size() < maxDepth) walk(s);
          break;
        case Iconv::kInvalid:
          break;
        case Iconv::kDone: {
          const std::vector<uint32_t> u = ucs4(out);
          if (u.empty()) break;  // a shift byte or similar: no character
          if (u.size() > 1) {
            ++x.severalUnits;
          } else if (u[0] > 0xFFFF) {
            ++x.outsideBmp;
          } else if (u[0] < 0xD800 || u[0] > 0xDFFF) {
            found[s] = static_cast<uint16_t>(u[0]);
          }
          break;
        }
      }
    }
  }
};

}  // namespace

bool extractCodePage(const CodePageDef &def, Extracted *out, std::string *err) {
  Extracted x;
  CpSource &src = x.src;
  src.id = def.id;
  src.name = def.name;
  src.ascii = !def.ebcdic;
  src.shift = def.shift;
  if (def.ebcdic) {
    // EBCDIC: SUB is 0x3F, line feed 0x25, and NL (0x15) ends lines on the host side.
    src.subst = 0x3F;
    src.lf = 0x25;
    src.cr = 0x0D;
    src.ls = src.ps = 0x15;
  }
  Iconv dec("UCS-4LE", def.iconvName), enc(def.iconvName, "UCS-4LE");
  if (!dec.ok() || !enc.ok()) {
    *err = def.name + ": iconv does not know " + def.iconvName;
    return false;
  }
  const bool utf8 = def.id == kUtf8;

  std::map<std::string, uint16_t> singles, multis;
  if (def.shift) {
    Walker sb{dec, "", 1, x, {}};
    sb.walk("");
    singles = sb.found;
    Walker db{dec, std::string(1, static_cast<char>(src.so)), 2, x, {}};
    db.walk("");
    multis = db.found;
    for (const auto &[s, u] : multis)
      if (s.size() != 2) {
        *err = def.name + ": a double-byte run holds a character of " + std::to_string(s.size()) + " bytes";
        return false;
      }
    src.maxLen = 2;
    src.lenByLead.fill(1);
  } else {
    Walker w{dec, "", utf8 ? 3u : 4u, x, {}};
    w.walk("");
    // Length by lead byte: the length most of its sequences have.
    std::array<std::map<size_t, size_t>, 256> lengths;
    for (const auto &[s, u] : w.found) ++lengths[static_cast<uint8_t>(s[0])][s.size()];
    src.maxLen = 1;
    for (int b = 0; b < 256; ++b) {
      size_t len = 1, most = 0;
      for (const auto &[l, n] : lengths[b])
        if (n > most) {
          most = n;
          len = l;
        }
      src.lenByLead[b] = static_cast<uint8_t>(len);
    }
    if (utf8)
      for (int b = 0; b < 256; ++b) src.lenByLead[b] = b < 0xC0 ? 1 : b < 0xE0 ? 2 : 3;
    for (const auto &[s, u] : w.found) {
      if (s.size() != src.lenByLead[static_cast<uint8_t>(s[0])]) {
        ++x.lengthConflicts;
        continue;
      }
      (s.size() == 1 ? singles : multis)[s] = u;
      src.maxLen = std::max<uint8_t>(src.maxLen, static_cast<uint8_t>(s.size()));
    }
  }
  src.toUni = singles;
  src.toUni.insert(multis.begin(), multis.end());

  for (uint32_t u = 0; u < 0x10000; ++u) {
    if (u >= 0xD800 && u <= 0xDFFF) continue;
    std::string in(4, '\0'), bytes;
    std::memcpy(in.data(), &u, 4);
    if (enc.run(in, &bytes) != Iconv::kDone || bytes.empty()) continue;
    const uint16_t unit = static_cast<uint16_t>(u);
    if (def.shift) {
      const bool dbcs = bytes.size() == 4 && static_cast<uint8_t>(bytes[0]) == src.so &&
                        static_cast<uint8_t>(bytes[3]) == src.si;
      const bool sbcs = bytes.size() == 1 && static_cast<uint8_t>(bytes[0]) != src.so &&
                        static_cast<uint8_t>(bytes[0]) != src.si;
      if (dbcs) {
        src.fromUni[unit] = bytes.substr(1, 2);
      } else if (sbcs) {
        src.fromUni[unit] = bytes;
      } else {
        ++x.severalChars;
      }
    } else if (bytes.size() == src.lenByLead[static_cast<uint8_t>(bytes[0])]) {
      src.fromUni[unit] = bytes;
    } else {
      ++x.severalChars;
    }
  }

  // The line-end bytes chosen for the family must be what iconv says they are.
  auto expect = [&](uint8_t b, uint16_t u, const char *what) {
    auto it = src.toUni.find(std::string(1, static_cast<char>(b)));
    if (it == src.toUni.end() || it->second != u)
      x.notes.push_back(std::string(what) + " byte does not decode to the expected control character");
  };
  expect(src.lf, 0x0A, "line feed");
  expect(src.cr, 0x0D, "carriage return");
  if (def.ebcdic) expect(src.ls, 0x85, "new line");
  expect(src.subst, 0x1A, "substitution");
  *out = std::move(x);
  return true;
}

bool buildFitted(Extracted *x, const UnicodeProps &ucd, CpSections *out, std::string *err) {
  for (;;) {
    if (buildCodePage(x->src, ucd, out, err)) return true;
    if (err->find("65535") == std::string::npos) return false;
    std::map<std::string, size_t> groups;
    for (const auto &[s, u] : x->src.toUni)
      if (s.size() >= 3) ++groups[s.substr(0, s.size() - 2)];
    if (groups.empty()) return false;
    auto smallest = std::min_element(groups.begin(), groups.end(),
                                     [](const auto &a, const auto &b) { return a.second < b.second; });
    const std::string prefix = smallest->first;
    std::erase_if(x->src.toUni, [&](const auto &kv) { return kv.first.size() >= 3 && kv.first.rfind(prefix, 0) == 0; });
    x->droppedGroups.push_back(prefix);
    x->droppedChars += smallest->second;
  }
}

}  // namespace mkdefs
