// The code pages the definitions carry, and their mappings as the C library's iconv has
// them. The tests use the same extraction as their oracle.
#pragma once
#include <cstdint>
#include <string>
#include <vector>

#include "cpbuild.h"

namespace mkdefs {

struct CodePageDef {
  uint16_t id;                       // registered code page number
  std::string name;                  // object name, as the native locale table writes it
  std::string iconvName;             // the C library's name for it
  bool ebcdic;                       // EBCDIC family (else ASCII family)
  bool shift;                        // Shift-Out / Shift-In double-byte runs
  std::vector<std::string> aliases;  // other names, for alias.txt
};

const std::vector<CodePageDef> &codeCodePageDefs();

struct Extracted {
  CpSource src;
  // What iconv offers that a code page object cannot hold, by kind.
  size_t outsideBmp = 0;        // byte sequences decoding beyond U+FFFF
  size_t severalUnits = 0;      // byte sequences decoding to more than one character
  size_t lengthConflicts = 0;   // sequences whose length disagrees with their lead byte
  size_t severalChars = 0;      // units encoding to more than one character
  // Groups of long sequences (by their bytes before the last two) left out so that the
  // conversion trie fits; their units still encode as iconv has them.
  std::vector<std::string> droppedGroups;
  size_t droppedChars = 0;
  std::vector<std::string> notes;
};

bool extractCodePage(const CodePageDef &def, Extracted *out, std::string *err);

// Builds the object; when a section overflows, leaves out the least populated group of
// sequences of three or more bytes, again and again, until it fits.
bool buildFitted(Extracted *x, const UnicodeProps &ucd, CpSections *out, std::string *err);

}  // namespace mkdefs
