// The Unicode Character Database as the generator needs it: type words and simple case.
#pragma once
#include <cstdint>
#include <string>
#include <vector>

namespace mkdefs {

struct UnicodeProps {
  // Indexed by BMP code point. typeWord holds the three classifications
  // (bits 0-9, 10-21, 22-31); unassigned code points get 0x400.
  std::vector<uint32_t> typeWord;
  std::vector<uint16_t> upper;   // simple upper-case mapping, or the code point itself
  std::vector<uint16_t> lower;   // simple lower-case mapping, or the code point itself
  std::vector<uint16_t> wide;    // full-width counterpart, or 0
  std::vector<uint16_t> narrow;  // half-width counterpart, or 0
  std::vector<uint8_t> digit;    // value 0-9 of a character with the digit type bit, or 0xFF
};

// Reads UnicodeData.txt and the companion files from dir (default /usr/share/unicode).
bool loadUnicode(const std::string &dir, UnicodeProps *out, std::string *err);

}  // namespace mkdefs
