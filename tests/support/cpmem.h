// Small code page objects written by hand for tests: every table given explicitly, laid
// out as the files hold them (big-endian), then loaded through the library's own check.
#pragma once
#include <array>
#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "veltrin.h"

namespace cpmem {

using Bytes = std::vector<uint8_t>;

void add16(Bytes &b, uint16_t v);  // big-endian appenders
void add32(Bytes &b, uint32_t v);

struct Node {  // conversion trie node
  uint8_t leaf, mask, lo, hi;
  uint16_t base;
};
struct TypeNode {
  uint8_t leaf, mask;
  uint16_t base;
};
struct Index {  // Unicode-to-code-page entry; offsets are byte offsets into low/high
  uint8_t kind, mask, lo, hi;
  uint16_t low, high;
};

struct Page {
  uint8_t subst = '?', lf = 0x0A, cr = 0x0D, ls = 0x0A, ps = 0x0A, maxLen = 1, so = 0, si = 0;
  uint16_t flags = 0;
  std::array<uint8_t, 256> len;
  std::array<uint16_t, 256> uni;   // default: ASCII, U+FFFD above
  std::array<uint32_t, 256> type;  // default: 0x400
  std::array<Index, 256> index;    // default: every row empty
  Bytes low, high;                 // file order
  std::vector<uint32_t> full;      // empty or 256 values
  std::vector<std::pair<uint32_t, uint32_t>> pairs;
  std::vector<TypeNode> typeNodes;
  std::vector<VLCtypeRecord> records;
  std::vector<Node> nodes;
  std::vector<uint16_t> values;

  Page();
  // Body, conversion trie block, low table, high table, as the files hold them.
  std::vector<Bytes> sections() const;
};

// The same object in the first-generation layout (its trie nodes must not use bounds).
std::vector<Bytes> toGen1(const std::vector<Bytes> &v2);

// An object held in memory and put through the load-time check, as the loader does.
struct Loaded {
  VLObjEntry entry{};
  std::vector<Bytes> data;
  uint32_t rc;
  Loaded(const std::vector<Bytes> &sections, uint16_t id);
  Loaded(const Loaded &) = delete;
  const VLCodePage *cp() const { return &entry; }
};

// Definition files: an object container and a control file of code page rows.
Bytes container(const std::vector<Bytes> &sections, uint32_t generation);
Bytes control(std::vector<std::pair<uint16_t, std::string>> codePages);
void writeFile(const std::string &path, const Bytes &data);

}  // namespace cpmem
