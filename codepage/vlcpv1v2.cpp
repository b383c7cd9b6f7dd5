// Rewrites a first-generation code page (file byte order, before the load-time check)
// into the current layout: two shift bytes more in the header, a fifth offset, and trie
// nodes with byte bounds. The input is untrusted; the check that follows proves the
// result, so this only has to stay inside the given sizes.
#include <algorithm>

#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlcpv1v2");

namespace {

namespace cp = vl::cp;

constexpr uint32_t kV1Flags = 4362, kV1Offsets = 4364, kV1NodeSize = 4;
constexpr uint32_t kGrowth = cp::kHeader - cp::kV1Header;
constexpr uint32_t kMaxSection = 0xFFFF;

void putBe16(uint8_t *p, uint16_t v) { vl::wr16(p, __builtin_bswap16(v)); }

// Highest node index reachable from the root among the nodes that lie inside the block;
// the first-generation value array starts right behind it. -1 when allocation fails.
int32_t highestNode(const uint8_t *t, uint32_t nodes) {
  vl::Block<uint8_t> seen(nodes);
  vl::Block<uint16_t> stack(nodes * sizeof(uint16_t));
  if (!seen || !stack) return -1;
  std::memset(seen.get(), 0, nodes);
  uint32_t top = 0, highest = 0;
  seen.get()[0] = 1;
  stack.get()[top++] = 0;
  while (top) {
    const uint8_t *node = t + kV1NodeSize * stack.get()[--top];
    if (node[0]) continue;
    uint32_t base = vl::be16(node + 2);
    unsigned mask = node[1];
    // Every value of (byte AND mask) is a sub-mask of mask.
    for (unsigned sub = mask;; sub = (sub - 1) & mask) {
      uint32_t child = base + sub;
      if (child < nodes && !seen.get()[child]) {
        seen.get()[child] = 1;
        stack.get()[top++] = static_cast<uint16_t>(child);
        if (child > highest) highest = child;
      }
      if (sub == 0) break;
    }
  }
  return static_cast<int32_t>(highest);
}

// Builds the widened trie block; returns false only when memory ran out. The block may
// outgrow a file section (it never goes back to disk); a value offset that no longer fits
// its 16-bit field leaves no trie, which the check refuses as malformed.
bool widenTrie(const uint8_t *t, uint32_t size, uint8_t **out, uint32_t *outSize, uint16_t *valueOff) {
  int32_t high = highestNode(t, size / kV1NodeSize);
  if (high < 0) return false;
  uint32_t nodes = static_cast<uint32_t>(high) + 1;
  uint32_t oldValues = nodes * kV1NodeSize, newValues = nodes * cp::kNodeSize;
  uint32_t total = newValues + (size - oldValues);
  if (newValues > kMaxSection) {
    *out = nullptr;
    *outSize = 0;
    return true;
  }
  vl::Block<uint8_t> block(total);
  if (!block) return false;
  uint8_t *n = block.get();
  for (uint32_t i = 0; i < nodes; ++i) {
    const uint8_t *o = t + kV1NodeSize * i;
    uint8_t *w = n + cp::kNodeSize * i;
    w[0] = o[0];
    w[1] = o[1];
    w[2] = 0x00;
    w[3] = 0xFF;
    w[4] = o[2];
    w[5] = o[3];
  }
  std::memcpy(n + newValues, t + oldValues, size - oldValues);
  *out = block.take();
  *outSize = total;
  *valueOff = static_cast<uint16_t>(newValues);
  return true;
}

}  // namespace

void *VLCpV1toV2(const void *body, uint32_t bodySize, const void *trie, uint32_t trieSize, void **newTrie,
                 VLCodePage *record) {
  VL_FLOW("VLCpV1toV2");
  if (newTrie) *newTrie = nullptr;
  if (!body || !newTrie || !record || bodySize < cp::kV1Header) {
    VL_ERR("Code page body of %d bytes cannot be converted", static_cast<int>(bodySize));
    VL_RET(static_cast<void *>(nullptr));
  }
  const auto *v1 = static_cast<const uint8_t *>(body);
  const bool single = v1[cp::kMaxLen] <= 1;
  const uint32_t size = single ? cp::kHeader : bodySize + kGrowth;
  vl::Block<uint8_t> out(size);
  if (!out) {
    VL_ERR("Unable to allocate %d bytes for code page body", static_cast<int>(size));
    VL_RET(static_cast<void *>(nullptr));
  }
  uint8_t *b = out.get();
  std::memcpy(b, v1, cp::kShiftOut);
  // The first generation has no shift bytes: a shift-sensitive page takes the usual ones.
  bool shifted = (vl::be16(v1 + kV1Flags) & cp::kFlagShift) != 0;
  b[cp::kShiftOut] = shifted ? 0x0E : 0;
  b[cp::kShiftIn] = shifted ? 0x0F : 0;
  std::memcpy(b + cp::kLenTable, v1 + cp::kShiftOut, kV1Flags - cp::kShiftOut);
  std::memcpy(b + cp::kFlags, v1 + kV1Flags, 2);
  std::memset(b + cp::kFullOff, 0, cp::kHeader - cp::kFullOff);
  if (single) {
    // No variable tables at all: a pair count without its table would mislead.
    putBe16(b + cp::kPairCount, 0);
  } else {
    for (uint32_t i = 0; i < 4; ++i) {
      uint32_t o = vl::be16(v1 + kV1Offsets + 2 * i);
      // An offset that cannot be rebased lies past any body and stays visibly bad.
      if (o) putBe16(b + cp::kFullOff + 2 * i, static_cast<uint16_t>(std::min(o + kGrowth, kMaxSection)));
    }
    std::memcpy(b + cp::kHeader, v1 + cp::kV1Header, bodySize - cp::kV1Header);
  }

  uint8_t *t = nullptr;
  uint32_t tSize = 0;
  uint16_t valueOff = 0;
  if (!single && trie && trieSize >= kV1NodeSize) {
    if (!widenTrie(static_cast<const uint8_t *>(trie), trieSize, &t, &tSize, &valueOff)) {
      VL_ERR("Unable to rebuild the conversion trie of %d bytes", static_cast<int>(trieSize));
      VL_RET(static_cast<void *>(nullptr));
    }
    putBe16(b + cp::kValueOff, valueOff);
  }
  *newTrie = t;
  record->sectionSize[0] = size;
  record->sectionSize[1] = tSize;
  VL_DETAIL("Converted code page body: %d bytes, trie %d bytes", static_cast<int>(size), static_cast<int>(tSize));
  VL_RET(static_cast<void *>(out.take()));
}
