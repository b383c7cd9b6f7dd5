// Type words, simple case and width counterparts of the BMP from the Unicode data files.
//
// How each bit of a type word is derived (gc = General_Category):
//
//   type 1 (bits 0-9)
//     0x001 alphabetic    Alphabetic (derived core property)
//     0x002 upper case    Uppercase (derived: Lu + Other_Uppercase)
//     0x004 lower case    Lowercase (derived: Ll + Other_Lowercase)
//     0x008 digit         gc Nd, plus superscript and subscript digits (digit value with a
//                         <super>/<sub> decomposition) so that digit mapping reaches them
//     0x010 hex digit     Hex_Digit (ASCII and full-width 0-9, A-F, a-f)
//     0x020 punctuation   gc P*, S*, and No that is not a digit
//     0x040 space         White_Space
//     0x080 blank         U+0009 and gc Zs
//     0x100 control       gc Cc, Zl, Zp
//     0x200 ASCII         below U+0080
//   type 2 (bits 10-21): one bit from Bidi_Class
//     L 0x002; R, AL 0x004; EN 0x008; ES 0x010; ET 0x020; AN 0x040; CS 0x080; B 0x100;
//     S 0x200; WS 0x400; ON 0x800; NSM, BN and the explicit embedding, override and
//     isolate classes 0x001 (not applicable)
//   type 3 (bits 22-31)
//     0x001 non-spacing   gc Mn
//     0x002 diacritic     Diacritic
//     0x004 vowel mark    Indic_Syllabic_Category Vowel_Dependent
//     0x008 symbol        gc S*
//     0x010 katakana      Kana in Script_Extensions (Script when not listed there)
//     0x020 hiragana      Hira in Script_Extensions (likewise)
//     0x040 half-width    East_Asian_Width Na or H
//     0x080 full-width    East_Asian_Width F
//     0x100 ideograph     Ideographic
//     0x200 kashida       U+0640 only
//
// Unassigned code points (gc Cn), surrogates (Cs) and private use (Co) all get 0x400:
// type 2 "not applicable" and nothing else.
#include "ucd.h"

#include <array>
#include <fstream>
#include <functional>
#include <map>
#include <sstream>

namespace mkdefs {

namespace {

constexpr uint32_t kBmp = 0x10000;

struct Raw {
  std::vector<std::string> gc = std::vector<std::string>(kBmp, "Cn");
  std::vector<std::string> bidi = std::vector<std::string>(kBmp);
  std::vector<uint8_t> superDigit = std::vector<uint8_t>(kBmp, 0);
  // Binary properties, one bit each.
  enum : uint16_t {
    kAlpha = 1, kUpper = 2, kLower = 4, kHex = 8, kWhite = 16, kDiacritic = 32, kIdeo = 64,
    kVowel = 128, kKana = 256, kHira = 512, kHalf = 1024, kFull = 2048,
  };
  std::vector<uint16_t> bits = std::vector<uint16_t>(kBmp, 0);
};

std::string trim(const std::string &s) {
  size_t a = s.find_first_not_of(" \t\r");
  if (a == std::string::npos) return "";
  size_t b = s.find_last_not_of(" \t\r");
  return s.substr(a, b - a + 1);
}

std::vector<std::string> split(const std::string &s, char sep) {
  std::vector<std::string> out;
  std::string cur;
  for (char c : s) {
    if (c == sep) {
      out.push_back(cur);
      cur.clear();
    } else {
      cur.push_back(c);
    }
  }
  out.push_back(cur);
  return out;
}

// Lines of the form "XXXX[..YYYY] ; value [; more] # comment", clipped to the BMP.
bool readRanges(const std::string &path, const std::function<void(uint32_t, uint32_t, const std::string &)> &fn,
                std::string *err) {
  std::ifstream in(path);
  if (!in) {
    *err = "cannot read " + path;
    return false;
  }
  std::string line;
  while (std::getline(in, line)) {
    line = line.substr(0, line.find('#'));
    size_t semi = line.find(';');
    if (semi == std::string::npos) continue;
    std::string range = trim(line.substr(0, semi));
    std::string value = trim(line.substr(semi + 1));
    if (range.empty()) continue;
    size_t dots = range.find("..");
    uint32_t lo = static_cast<uint32_t>(std::stoul(range.substr(0, dots), nullptr, 16));
    uint32_t hi = dots == std::string::npos ? lo : static_cast<uint32_t>(std::stoul(range.substr(dots + 2), nullptr, 16));
    if (lo >= kBmp) continue;
    if (hi >= kBmp) hi = kBmp - 1;
    fn(lo, hi, value);
  }
  return true;
}

void setBits(Raw &r, uint32_t lo, uint32_t hi, uint16_t bit) {
  for (uint32_t c = lo; c <= hi; ++c) r.bits[c] |= bit;
}

uint32_t bidiBit(const std::string &bc) {
  static const std::map<std::string, uint32_t> kBits = {
      {"L", 0x002},  {"R", 0x004},  {"AL", 0x004}, {"EN", 0x008}, {"ES", 0x010}, {"ET", 0x020},
      {"AN", 0x040}, {"CS", 0x080}, {"B", 0x100},  {"S", 0x200},  {"WS", 0x400}, {"ON", 0x800},
  };
  auto it = kBits.find(bc);
  return it == kBits.end() ? 0x001 : it->second;
}

uint32_t typeWordOf(const Raw &r, uint32_t c) {
  const std::string &gc = r.gc[c];
  if (gc == "Cn" || gc == "Cs" || gc == "Co") return 0x400;
  const uint16_t b = r.bits[c];
  const bool digit = gc == "Nd" || r.superDigit[c];
  uint32_t t1 = 0, t3 = 0;
  if (b & Raw::kAlpha) t1 |= 0x001;
  if (b & Raw::kUpper) t1 |= 0x002;
  if (b & Raw::kLower) t1 |= 0x004;
  if (digit) t1 |= 0x008;
  if (b & Raw::kHex) t1 |= 0x010;
  if (gc[0] == 'P' || gc[0] == 'S' || (gc == "No" && !digit)) t1 |= 0x020;
  if (b & Raw::kWhite) t1 |= 0x040;
  if (c == 0x09 || gc == "Zs") t1 |= 0x080;
  if (gc == "Cc" || gc == "Zl" || gc == "Zp") t1 |= 0x100;
  if (c < 0x80) t1 |= 0x200;
  if (gc == "Mn") t3 |= 0x001;
  if (b & Raw::kDiacritic) t3 |= 0x002;
  if (b & Raw::kVowel) t3 |= 0x004;
  if (gc[0] == 'S') t3 |= 0x008;
  if (b & Raw::kKana) t3 |= 0x010;
  if (b & Raw::kHira) t3 |= 0x020;
  if (b & Raw::kHalf) t3 |= 0x040;
  if (b & Raw::kFull) t3 |= 0x080;
  if (b & Raw::kIdeo) t3 |= 0x100;
  if (c == 0x0640) t3 |= 0x200;
  return t1 | bidiBit(r.bidi[c]) << 10 | t3 << 22;
}

}  // namespace

bool loadUnicode(const std::string &dirIn, UnicodeProps *out, std::string *err) {
  const std::string dir = dirIn.empty() ? "/usr/share/unicode" : dirIn;
  Raw r;
  UnicodeProps p;
  p.upper.resize(kBmp);
  p.lower.resize(kBmp);
  p.wide.assign(kBmp, 0);
  p.narrow.assign(kBmp, 0);
  p.digit.assign(kBmp, 0xFF);
  for (uint32_t c = 0; c < kBmp; ++c) p.upper[c] = p.lower[c] = static_cast<uint16_t>(c);

  {
    const std::string path = dir + "/UnicodeData.txt";
    std::ifstream in(path);
    if (!in) {
      *err = "cannot read " + path;
      return false;
    }
    std::string line;
    uint32_t rangeStart = 0;
    while (std::getline(in, line)) {
      std::vector<std::string> f = split(line, ';');
      if (f.size() < 15) continue;
      uint32_t c = static_cast<uint32_t>(std::stoul(f[0], nullptr, 16));
      if (c >= kBmp) continue;
      // "<..., First>" / "<..., Last>" rows bound a range sharing one description.
      if (f[1].size() > 8 && f[1].compare(f[1].size() - 8, 8, ", First>") == 0) {
        rangeStart = c;
        continue;
      }
      uint32_t lo = (f[1].size() > 7 && f[1].compare(f[1].size() - 7, 7, ", Last>") == 0) ? rangeStart : c;
      for (uint32_t k = lo; k <= c; ++k) {
        r.gc[k] = f[2];
        r.bidi[k] = f[4];
      }
      const std::string &dec = f[5];
      if (!f[7].empty() && (dec.rfind("<super>", 0) == 0 || dec.rfind("<sub>", 0) == 0)) r.superDigit[c] = 1;
      if ((f[2] == "Nd" && !f[6].empty()) || r.superDigit[c])
        p.digit[c] = static_cast<uint8_t>(std::stoul(f[r.superDigit[c] ? 7 : 6]));
      if (!f[12].empty()) p.upper[c] = static_cast<uint16_t>(std::stoul(f[12], nullptr, 16));
      if (!f[13].empty()) p.lower[c] = static_cast<uint16_t>(std::stoul(f[13], nullptr, 16));
      // Width counterparts: "<wide> X" marks c as the full-width form of X, "<narrow> X"
      // as its half-width form. The first pairing of a character wins.
      for (const char *tag : {"<wide> ", "<narrow> "}) {
        const std::string t = tag;
        if (dec.rfind(t, 0) != 0 || dec.find(' ', t.size()) != std::string::npos) continue;
        uint32_t x = static_cast<uint32_t>(std::stoul(dec.substr(t.size()), nullptr, 16));
        if (x >= kBmp) continue;
        uint16_t full = static_cast<uint16_t>(t[1] == 'w' ? c : x);
        uint16_t half = static_cast<uint16_t>(t[1] == 'w' ? x : c);
        if (!p.wide[half] && !p.narrow[full]) {
          p.wide[half] = full;
          p.narrow[full] = half;
        }
      }
    }
  }

  auto binary = [&](const std::string &file, const std::map<std::string, uint16_t> &props) {
    return readRanges(dir + "/" + file, [&](uint32_t lo, uint32_t hi, const std::string &v) {
      auto it = props.find(v);
      if (it != props.end()) setBits(r, lo, hi, it->second);
    }, err);
  };
  if (!binary("DerivedCoreProperties.txt",
              {{"Alphabetic", Raw::kAlpha}, {"Uppercase", Raw::kUpper}, {"Lowercase", Raw::kLower}}) ||
      !binary("PropList.txt", {{"White_Space", Raw::kWhite},
                               {"Hex_Digit", Raw::kHex},
                               {"Diacritic", Raw::kDiacritic},
                               {"Ideographic", Raw::kIdeo}}) ||
      !binary("IndicSyllabicCategory.txt", {{"Vowel_Dependent", Raw::kVowel}}) ||
      !binary("EastAsianWidth.txt", {{"Na", Raw::kHalf}, {"H", Raw::kHalf}, {"F", Raw::kFull}}) ||
      !binary("Scripts.txt", {{"Katakana", Raw::kKana}, {"Hiragana", Raw::kHira}}))
    return false;
  // Script_Extensions replaces Script where it lists a character.
  if (!readRanges(dir + "/ScriptExtensions.txt", [&](uint32_t lo, uint32_t hi, const std::string &v) {
        std::istringstream names(v);
        uint16_t bits = 0;
        for (std::string n; names >> n;) {
          if (n == "Kana") bits |= Raw::kKana;
          if (n == "Hira") bits |= Raw::kHira;
        }
        for (uint32_t c = lo; c <= hi; ++c)
          r.bits[c] = static_cast<uint16_t>((r.bits[c] & ~(Raw::kKana | Raw::kHira)) | bits);
      }, err))
    return false;

  p.typeWord.resize(kBmp);
  for (uint32_t c = 0; c < kBmp; ++c) p.typeWord[c] = typeWordOf(r, c);
  *out = std::move(p);
  return true;
}

}  // namespace mkdefs
