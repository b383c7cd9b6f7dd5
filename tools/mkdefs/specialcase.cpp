// Reads SpecialCasing.txt. A lookup in a language table sees one unit, or a unit and the
// next one, so only these contexts can be carried:
//   none                 the key alone
//   After_Soft_Dotted    a soft-dotted letter and the dot above as a two-unit key
// Results of more than two units and the other contexts go to the report instead.
#include "specialcase.h"

#include <algorithm>
#include <cstdio>
#include <fstream>
#include <set>
#include <sstream>

namespace mkdefs {
namespace {

std::string trim(const std::string &s) {
  size_t a = s.find_first_not_of(" \t"), b = s.find_last_not_of(" \t");
  return a == std::string::npos ? std::string() : s.substr(a, b - a + 1);
}

bool hexList(const std::string &field, std::u32string *out) {
  std::istringstream in(field);
  std::string w;
  out->clear();
  while (in >> w) {
    char *end = nullptr;
    unsigned long v = std::strtoul(w.c_str(), &end, 16);
    if (*end || v > 0x10FFFF) return false;
    out->push_back(static_cast<char32_t>(v));
  }
  return true;
}

std::u16string utf16(const std::u32string &s) {
  std::u16string u;
  for (char32_t c : s) {
    if (c >= 0x10000) {
      u.push_back(static_cast<char16_t>(0xD800 + ((c - 0x10000) >> 10)));
      u.push_back(static_cast<char16_t>(0xDC00 + ((c - 0x10000) & 0x3FF)));
    } else {
      u.push_back(static_cast<char16_t>(c));
    }
  }
  return u;
}

std::string hex(const std::u32string &s) {
  std::string r;
  char b[12];
  for (char32_t c : s) {
    std::snprintf(b, sizeof b, "%sU+%04X", r.empty() ? "" : " ", static_cast<unsigned>(c));
    r += b;
  }
  return r;
}

char32_t simple(const UnicodeProps &ucd, char32_t c, bool up) {
  if (c >= 0x10000) return c;
  const auto &t = up ? ucd.upper : ucd.lower;
  return c < t.size() ? t[c] : c;
}

// Adds key -> result to the table unless it changes nothing or the key is taken.
void add(std::vector<SpecialEntry> *t, std::set<std::u16string> *keys, const std::u32string &key,
         const std::u32string &result, const UnicodeProps &ucd, bool up, const std::string &what,
         std::vector<std::string> *unfit) {
  // A rule claims its key even when the simple mapping already gives its result, so that
  // no general rule takes the key after it.
  std::u16string k = utf16(key), r = utf16(result);
  if (result == key || (key.size() == 1 && result.size() == 1 && result[0] == simple(ucd, key[0], up))) {
    keys->insert(k);
    return;
  }
  if (k.size() > 2 || r.size() > 2 || r.empty()) {
    unfit->push_back(hex(key) + (up ? " upper" : " lower") + what + ": " + std::to_string(r.size()) +
                     " units (" + hex(result) + ")");
    return;
  }
  if (!keys->insert(k).second) return;
  t->push_back(SpecialEntry{k[0], static_cast<uint16_t>(k.size() > 1 ? k[1] : 0), r[0],
                            static_cast<uint16_t>(r.size() > 1 ? r[1] : 0)});
}

}  // namespace

bool readSpecialCasing(const std::string &dir, SpecialCasing *out, std::string *err) {
  const std::string path = dir + "/SpecialCasing.txt";
  std::ifstream in(path);
  if (!in) {
    *err = "cannot open " + path;
    return false;
  }
  SpecialCasing sc;
  std::string line;
  for (size_t no = 1; std::getline(in, line); ++no) {
    line = line.substr(0, line.find('#'));
    if (trim(line).empty()) continue;
    std::vector<std::string> f;
    std::istringstream ls(line);
    for (std::string x; std::getline(ls, x, ';');) f.push_back(trim(x));
    std::u32string code;
    CaseRule r;
    if (f.size() < 4 || !hexList(f[0], &code) || code.size() != 1 || !hexList(f[1], &r.lower) ||
        !hexList(f[3], &r.upper)) {
      *err = path + ":" + std::to_string(no) + ": malformed line";
      return false;
    }
    r.code = code[0];
    if (f.size() > 4) {
      std::istringstream cs(f[4]);
      for (std::string w; cs >> w;) {
        bool lang = w.size() <= 3 && std::all_of(w.begin(), w.end(), [](char c) { return c >= 'a' && c <= 'z'; });
        (lang ? r.language : r.context) = w;
      }
    }
    sc.rules.push_back(std::move(r));
  }

  const std::string props = dir + "/PropList.txt";
  std::ifstream pin(props);
  if (!pin) {
    *err = "cannot open " + props;
    return false;
  }
  while (std::getline(pin, line)) {
    line = line.substr(0, line.find('#'));
    size_t semi = line.find(';');
    if (semi == std::string::npos || trim(line.substr(semi + 1)) != "Soft_Dotted") continue;
    std::string range = trim(line.substr(0, semi));
    size_t dots = range.find("..");
    unsigned long lo = std::strtoul(range.c_str(), nullptr, 16);
    unsigned long hi = dots == std::string::npos ? lo : std::strtoul(range.c_str() + dots + 2, nullptr, 16);
    for (unsigned long c = lo; c <= hi && c <= 0x10FFFF; ++c) sc.softDotted.push_back(static_cast<char32_t>(c));
  }
  *out = std::move(sc);
  return true;
}

SpecialTables specialTablesFor(const SpecialCasing &sc, const std::string &language, const UnicodeProps &ucd) {
  SpecialTables t;
  std::set<std::u16string> upKeys, lowKeys;
  for (bool own : {true, false}) {
    for (const CaseRule &r : sc.rules) {
      if (own ? r.language != language : !r.language.empty()) continue;
      const std::string what = r.context.empty() ? "" : " (" + r.context + ")";
      if (r.context.empty()) {
        add(&t.upper, &upKeys, {r.code}, r.upper, ucd, true, what, &t.unfit);
        add(&t.lower, &lowKeys, {r.code}, r.lower, ucd, false, what, &t.unfit);
      } else if (r.context == "After_Soft_Dotted") {
        // The mark after a soft-dotted letter goes in the directions that drop it.
        for (char32_t c : sc.softDotted) {
          if (c >= 0x10000) continue;  // three-unit keys: the mathematical letters have no case
          if (r.upper.empty()) add(&t.upper, &upKeys, {c, r.code}, {simple(ucd, c, true)}, ucd, true, what, &t.unfit);
          if (r.lower.empty()) add(&t.lower, &lowKeys, {c, r.code}, {simple(ucd, c, false)}, ucd, false, what, &t.unfit);
        }
      } else if (r.context == "Not_Before_Dot") {
        // The single key is looked up before any pair, so the dotted pair keeps the rule.
        add(&t.upper, &upKeys, {r.code}, r.upper, ucd, true, what, &t.unfit);
        add(&t.lower, &lowKeys, {r.code}, r.lower, ucd, false, what, &t.unfit);
      } else {
        t.unfit.push_back(hex({r.code}) + " (" + r.context + "): depends on context the tables cannot see");
      }
    }
  }
  return t;
}

}  // namespace mkdefs
