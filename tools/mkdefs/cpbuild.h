// Builds the sections of a code page object from its mappings.
#pragma once
#include <array>
#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "container.h"
#include "ucd.h"

namespace mkdefs {

struct CpSource {
  uint16_t id = 0;
  std::string name;
  bool ascii = true;      // ASCII family; false for EBCDIC
  bool shift = false;     // Shift-Out / Shift-In code page
  uint8_t so = 0x0E, si = 0x0F;
  uint8_t subst = 0x1A, lf = 0x0A, cr = 0x0D, ls = 0x0A, ps = 0x0A;
  uint8_t maxLen = 1;     // in a shift code page: the length of a double-byte character
  std::array<uint8_t, 256> lenByLead{};  // 1..4; all 1 in a shift code page
  // Every byte sequence that decodes (single bytes included; double-byte characters of a
  // shift code page without their shift bytes) and its UTF-16 unit.
  std::map<std::string, uint16_t> toUni;
  // The bytes each UTF-16 unit encodes to (round trip and one-way alike).
  std::map<uint16_t, std::string> fromUni;
};

// Sections 0 to 3 as the files hold them (big-endian): body, conversion trie block,
// Unicode-to-code-page low table, high table. Identical trie leaves and runs of type
// records are shared so that each section stays within 65,535 bytes.
struct CpSections {
  std::vector<Bytes> sections;
  std::string note;  // what was left out to make the object fit, if anything
};

bool buildCodePage(const CpSource &src, const UnicodeProps &ucd, CpSections *out, std::string *err);

// The same object in the first-generation layout (for tests of the upgrade on load).
bool toGeneration1(const CpSections &v2, CpSections *out, std::string *err);

}  // namespace mkdefs
