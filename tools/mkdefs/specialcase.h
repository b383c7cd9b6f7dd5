// Language special casing from SpecialCasing.txt, laid out as the two tables of a
// language body: 44 (upper case) and 45 (lower case), entries of four UTF-16 units.
#pragma once
#include <cstdint>
#include <string>
#include <vector>

#include "ucd.h"

namespace mkdefs {

struct CaseRule {
  char32_t code = 0;
  std::u32string lower, upper;
  std::string language;  // empty for every language
  std::string context;   // empty when unconditional
};

struct SpecialCasing {
  std::vector<CaseRule> rules;       // in file order
  std::vector<char32_t> softDotted;  // from PropList.txt
};

// Reads SpecialCasing.txt and the Soft_Dotted property of PropList.txt from dir.
bool readSpecialCasing(const std::string &dir, SpecialCasing *out, std::string *err);

struct SpecialEntry {
  uint16_t key1, key2, res1, res2;  // key2/res2 are 0 for one unit
  bool operator==(const SpecialEntry &) const = default;
};

struct SpecialTables {
  std::vector<SpecialEntry> upper, lower;  // tables 44 and 45
  std::vector<std::string> unfit;          // rules the tables cannot carry, one line each
};

// The tables of the language with the given code ("de", "tr"): the language's own rules
// first (a lookup takes the first match), then the unconditional ones whose key the
// language did not claim. Results equal to the key or to the simple mapping are left out.
SpecialTables specialTablesFor(const SpecialCasing &sc, const std::string &language, const UnicodeProps &ucd);

}  // namespace mkdefs
