// Reads code page sections the way the library's primitives walk them, straight from the
// big-endian bytes the generator writes: the generator checks every object it builds with
// it, and the tests use it on synthetic objects.
#pragma once
#include <cstdint>
#include <string>

#include "cpbuild.h"

namespace mkdefs {

class CpReader {
 public:
  // Sections of generation 2, or of generation 1 when v1 is set.
  explicit CpReader(const CpSections &cp, bool v1 = false);

  uint8_t maxLen() const { return body(5); }
  uint8_t charLen(uint8_t lead) const { return body(lenTable() + lead); }
  uint16_t flags() const;
  uint16_t offset(size_t at) const;  // a header field given by its generation-2 position

  uint16_t singleToUnicode(uint8_t b) const;
  uint32_t singleType(uint8_t b) const;
  // The trie walk of a character of more than one byte; U+FFFD on any bounds miss.
  uint16_t toUnicode(const std::string &bytes) const;
  // W value of a unit, or the substitution byte.
  uint32_t fromUnicode(uint16_t unit) const;
  // Type word and case delta from the type trie.
  struct Type {
    uint32_t type;
    int32_t delta;
  };
  Type type(const std::string &bytes) const;
  uint32_t fullWidthOfByte(uint8_t b) const;
  uint32_t halfToFull(uint32_t w) const;  // 0 when none

 private:
  uint8_t body(size_t at) const;
  uint16_t body16(size_t at) const;
  uint32_t body32(size_t at) const;
  size_t lenTable() const { return v1_ ? 8 : 10; }
  size_t shiftDown() const { return v1_ ? 2 : 0; }

  const CpSections &cp_;
  bool v1_;
  size_t v1ValueOff_ = 0;
};

}  // namespace mkdefs
