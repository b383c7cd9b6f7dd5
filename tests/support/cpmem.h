// Small code page objects written by hand for tests: every table given explicitly, laid
// out as the files hold them (big-endian), then put through the library's load check.
#pragma once
#include <array>
#include <cstdint>
#include <utility>
#include <vector>

#include "veltrin.h"

namespace cpmem {

using Bytes = std::vector<uint8_t>;
void add16(Bytes &b, uint16_t v);  // big-endian

struct Node { uint8_t leaf, mask, lo, hi; uint16_t base; };    // conversion trie node
struct TypeNode { uint8_t leaf, mask; uint16_t base; };
struct Index { uint8_t kind, mask, lo, hi; uint16_t low, high; };  // byte offsets into low, high

struct Page {
  uint8_t subst = '?', maxLen = 1, so = 0, si = 0;
  uint16_t flags = 0;
  std::array<uint8_t, 256> len;
  std::array<uint16_t, 256> uni;  // default: ASCII, U+FFFD above
  std::array<Index, 256> index;   // default: every row empty
  Bytes low, high;
  std::vector<uint32_t> full;     // empty or 256 values
  std::vector<std::pair<uint32_t, uint32_t>> pairs;
  std::vector<TypeNode> typeNodes;
  std::vector<VLCtypeRecord> records;
  std::vector<Node> nodes;
  std::vector<uint16_t> values;
  Page();
  std::vector<Bytes> sections() const;  // body, trie block, low table, high table
};

// An object held in memory and checked (and turned to native order) as the loader does.
struct Loaded {
  VLObjEntry entry{};
  std::vector<Bytes> data;
  uint32_t rc;
  Loaded(const std::vector<Bytes> &sections, uint16_t id);
  Loaded(const Loaded &) = delete;
  const VLCodePage *cp() const { return &entry; }
};

}  // namespace cpmem
