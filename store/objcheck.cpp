// Load-time check of an object read from disk, and its conversion to native byte
// order. Everything later code indexes is proven in range here, once, so that the
// character primitives can trust the tables.
#include <algorithm>

#include "codepage/cpprim.h"
#include "store/store.h"
#include "string/sortbody.h"

namespace {

constexpr uint32_t kBad = VL_RC_BADMAGIC;

void swap16(uint8_t *p) { vl::wr16(p, vl::be16(p)); }
void swap32(uint8_t *p) { vl::wr32(p, vl::be32(p)); }
void swap16Run(uint8_t *p, size_t count) {
  for (size_t i = 0; i < count; ++i) swap16(p + 2 * i);
}

// A NUL-terminated UTF-16 text at an even offset inside the body (already native).
bool textOk(const uint8_t *b, uint32_t size, uint16_t off) {
  if (off % 2 || off >= size) return false;
  for (uint32_t i = off; i + 1 < size; i += 2)
    if (vl::rd16(b + i) == 0) return true;
  return false;
}

// Languages and territories are 16-bit words and UTF-16 texts throughout.
uint32_t checkTextBody(VLObjEntry *e, uint32_t headerWords, uint32_t firstText, uint32_t lastText) {
  auto *b = static_cast<uint8_t *>(e->section[0]);
  uint32_t size = e->sectionSize[0];
  if (!b || size < headerWords * 2) return kBad;
  swap16Run(b, size / 2);
  for (uint32_t w = firstText; w <= lastText; ++w)
    if (!textOk(b, size, vl::rd16(b + 2 * w))) return kBad;
  return 0;
}

uint32_t checkLanguage(VLObjEntry *e) {
  uint32_t rc = checkTextBody(e, 49, 5, 48);
  if (rc) return rc;
  auto *b = static_cast<uint8_t *>(e->section[0]);
  uint32_t size = e->sectionSize[0];
  // Special-case tables: counts at words 3 and 4, offsets at words 49 and 50.
  for (int t = 0; t < 2; ++t) {
    uint32_t count = vl::rd16(b + 6 + 2 * t);
    if (!count) continue;
    if (size < 102) return kBad;
    uint32_t off = vl::rd16(b + 98 + 2 * t);
    if (off % 2 || off + count * 8 > size) return kBad;
  }
  return 0;
}

// Largest value of (b & mask) for b in [lo, hi]; -1 when the range is empty.
int maxMasked(unsigned lo, unsigned hi, unsigned mask) {
  int best = -1;
  for (unsigned b = lo; b <= hi && b < 256; ++b) best = std::max(best, static_cast<int>(b & mask));
  return best;
}

// Walks a trie level by level from the root. Each node is examined once per level, and a
// node still inner at the fourth level is refused, so cycles cannot hide.
template <class NodeAt>
uint32_t trieCheck(uint32_t nodes, uint32_t leaves, NodeAt nodeAt) {
  if (nodes == 0) return kBad;
  vl::Block<uint8_t> seen(nodes);
  vl::Block<uint8_t> next(nodes);
  if (!seen || !next) return VL_RC_NOMEM;
  std::memset(seen.get(), 0, nodes);
  seen.get()[0] = 1;
  for (int depth = 0; depth < 4; ++depth) {
    std::memset(next.get(), 0, nodes);
    bool any = false;
    for (uint32_t n = 0; n < nodes; ++n) {
      if (!seen.get()[n]) continue;
      auto node = nodeAt(n);
      int top = maxMasked(node.lo, node.hi, node.mask);
      if (top < 0) continue;
      uint32_t last = node.base + static_cast<uint32_t>(top);
      if (node.leaf) {
        if (last >= leaves) return kBad;
        continue;
      }
      if (depth == 3 || last >= nodes) return kBad;
      for (unsigned b = node.lo; b <= node.hi && b < 256; ++b) next.get()[node.base + (b & node.mask)] = 1;
      any = true;
    }
    if (!any) return 0;
    std::memcpy(seen.get(), next.get(), nodes);
  }
  return 0;
}

struct NodeView {
  bool leaf;
  unsigned mask, lo, hi;
  uint32_t base;
};

// Marks which 2-byte slots of a table were converted, so shared runs swap once.
struct SwapMap {
  vl::Block<uint8_t> done;
  explicit SwapMap(uint32_t size) : done(size ? size : 1) {
    if (done) std::memset(done.get(), 0, size ? size : 1);
  }
  void run(uint8_t *t, uint32_t from, uint32_t count) {
    for (uint32_t i = 0; i < count; ++i) {
      uint32_t at = from + 2 * i;
      if (!done.get()[at]) {
        done.get()[at] = 1;
        swap16(t + at);
      }
    }
  }
};

// A value of a table that turns into code page bytes takes no more than the maximum length.
bool fits(VLWChar v, unsigned maxLen) {
  uint8_t bytes[4];
  return static_cast<unsigned>(vl::cp::wToMb(bytes, v)) <= maxLen;
}

uint32_t checkCodePage(VLObjEntry *e) {
  namespace cp = vl::cp;
  auto *b = static_cast<uint8_t *>(e->section[0]);
  uint32_t size = e->sectionSize[0];
  if (!b || size < cp::kHeader) return kBad;
  // Fixed header.
  swap16(b + cp::kPairCount);
  swap16Run(b + cp::kSbcsUni, 256);
  for (int i = 0; i < 256; ++i) swap32(b + cp::kSbcsType + 4 * i);
  for (int i = 0; i < 256; ++i) swap16Run(b + cp::kIndex + cp::kIndexSize * i + 4, 2);
  swap16Run(b + cp::kFlags, 6);
  uint8_t maxLen = b[cp::kMaxLen];
  bool shift = (vl::rd16(b + cp::kFlags) & cp::kFlagShift) != 0;
  bool utf8 = e->id == VL_CP_UTF8;
  if (maxLen < 1 || maxLen > 4) return kBad;
  for (int i = 0; i < 256; ++i) {
    uint8_t l = b[cp::kLenTable + i];
    if (l < 1 || l > 4 || (!shift && l > maxLen)) return kBad;
  }
  if (shift && (maxLen < 2 || b[cp::kShiftOut] == b[cp::kShiftIn])) return kBad;
  // Writers size their buffers from the maximum length: UTF-8 is computed up to 3 bytes.
  if (utf8 && maxLen < 3) return kBad;

  // Variable tables: each runs to the next table's start or the end of the body.
  const uint32_t at[4] = {cp::kFullOff, cp::kPairOff, cp::kTypeTrieOff, cp::kTypeRecOff};
  uint32_t start[4], end[4];
  for (int i = 0; i < 4; ++i) {
    start[i] = vl::rd16(b + at[i]);
    if (start[i] && (start[i] < cp::kHeader || start[i] >= size || start[i] % 4)) return kBad;
  }
  for (int i = 0; i < 4; ++i) {
    end[i] = size;
    for (int j = 0; j < 4; ++j)
      if (start[j] > start[i] && start[j] < end[i]) end[i] = start[j];
  }
  if (start[0]) {
    if (end[0] - start[0] < 1024) return kBad;
    for (int i = 0; i < 256; ++i) {
      swap32(b + start[0] + 4 * i);
      if (!fits(vl::rd32(b + start[0] + 4 * i), maxLen)) return kBad;
    }
  }
  uint32_t pairs = vl::rd16(b + cp::kPairCount);
  if (pairs) {
    if (!start[1] || (end[1] - start[1]) / 8 < pairs) return kBad;
    for (uint32_t i = 0; i < pairs * 2; ++i) {
      swap32(b + start[1] + 4 * i);
      if (!fits(vl::rd32(b + start[1] + 4 * i), maxLen)) return kBad;
    }
  }
  bool needTrie = maxLen > 1 && !utf8;
  if (start[2] || start[3]) {
    if (!start[2] || !start[3]) return kBad;
    uint32_t nodes = (end[2] - start[2]) / cp::kTypeNodeSize;
    uint32_t records = (end[3] - start[3]) / cp::kRecordSize;
    // One-byte characters are read directly from records 1 to 256.
    if ((vl::rd16(b + cp::kFlags) & cp::kFlagOneByteTypes) && records < 257) return kBad;
    for (uint32_t i = 0; i < nodes; ++i) swap16(b + start[2] + 4 * i + 2);
    for (uint32_t i = 0; i < records * 2; ++i) swap32(b + start[3] + 4 * i);
    const uint8_t *tn = b + start[2];
    uint32_t rc = trieCheck(nodes, records, [tn](uint32_t n) {
      const uint8_t *p = tn + 4 * n;
      return NodeView{p[0] != 0, p[1], 0, 255, vl::rd16(p + 2)};
    });
    if (rc) return rc;
  } else if (needTrie) {
    return kBad;
  }

  // Conversion trie: nodes, then the UTF-16 values.
  auto *t = static_cast<uint8_t *>(e->section[1]);
  if (t) {
    uint32_t tsize = e->sectionSize[1];
    uint32_t valueOff = vl::rd16(b + cp::kValueOff);
    if (valueOff % 2 || valueOff > tsize) return kBad;
    uint32_t nodes = valueOff / cp::kNodeSize;
    uint32_t values = (tsize - valueOff) / 2;
    for (uint32_t i = 0; i < nodes; ++i) swap16(t + cp::kNodeSize * i + 4);
    swap16Run(t + valueOff, values);
    uint32_t rc = trieCheck(nodes, values, [t](uint32_t n) {
      const uint8_t *p = t + cp::kNodeSize * n;
      return NodeView{p[0] != 0, p[1], p[2], p[3], vl::rd16(p + 4)};
    });
    if (rc) return rc;
  } else if (needTrie) {
    return kBad;
  }

  // Unicode-to-code-page index entries and the two tables they address.
  auto *low = static_cast<uint8_t *>(e->section[2]);
  auto *high = static_cast<uint8_t *>(e->section[3]);
  SwapMap lowMap(e->sectionSize[2]), highMap(e->sectionSize[3]);
  if (!lowMap.done || !highMap.done) return VL_RC_NOMEM;
  for (int i = 0; i < 256; ++i) {
    const uint8_t *x = b + cp::kIndex + cp::kIndexSize * i;
    uint8_t kind = x[0];
    int top = maxMasked(x[2], x[3], x[1]);
    if (top < 0 || kind > 4) continue;  // empty range, or a kind that yields 0
    uint32_t n = static_cast<uint32_t>(top) + 1;
    uint32_t lo = vl::rd16(x + 4), hi = vl::rd16(x + 6);
    uint32_t lowWidth = (kind == 0 || kind == 4) ? 1 : 2;
    uint32_t highWidth = kind == 3 ? 2 : (kind == 2 || kind == 4) ? 1 : 0;
    if (!low || lo + n * lowWidth > e->sectionSize[2]) return kBad;
    if (highWidth && (!high || hi + n * highWidth > e->sectionSize[3])) return kBad;
    if (lowWidth == 2) lowMap.run(low, lo, n);
    if (highWidth == 2) highMap.run(high, hi, n);
    for (unsigned l = x[2]; l <= x[3] && l < 256; ++l)
      if (!fits(vl::cp::indexValue(e, x, static_cast<VLUChar>(i << 8 | l)), maxLen)) return kBad;
  }
  return 0;
}

// Sort bodies: each table runs to the next one's start or the end of the body; every
// block that indexes the weight table must find all 256 of its entries there.
uint32_t checkSort(VLObjEntry *e) {
  namespace so = vl::sort;
  auto *b = static_cast<uint8_t *>(e->section[0]);
  uint32_t size = e->sectionSize[0];
  if (!b || size < so::kHeader) return kBad;
  swap16(b + so::kExpCount);
  swap16(b + so::kCombCount);
  for (int i = 0; i < 256; ++i) swap16(b + so::kBlocks + 4 * i + 2);
  swap16Run(b + so::kWeightOff, 3);
  const uint32_t start[3] = {vl::rd16(b + so::kWeightOff), vl::rd16(b + so::kExpOff), vl::rd16(b + so::kCombOff)};
  uint32_t end[3];
  for (int i = 0; i < 3; ++i) {
    if (start[i] && (start[i] < so::kHeader || start[i] > size)) return kBad;
    end[i] = size;
    for (int j = 0; j < 3; ++j)
      if (start[j] > start[i] && start[j] < end[i]) end[i] = start[j];
  }
  const uint32_t weights = start[0] ? (end[0] - start[0]) / so::kWeightSize : 0;
  const uint32_t exps = vl::rd16(b + so::kExpCount), combs = vl::rd16(b + so::kCombCount);
  if (exps && (!start[1] || (end[1] - start[1]) / so::kExpSize < exps)) return kBad;
  if (combs && (!start[2] || (end[2] - start[2]) / so::kCombSize < combs)) return kBad;
  for (int i = 0; i < 256; ++i) {
    const uint8_t *x = b + so::kBlocks + 4 * i;
    const uint32_t top = vl::rd16(x + 2) + 255u;
    if (x[0] & so::kBlockIgnore) continue;
    if ((x[0] & (so::kBlockPrimary | so::kBlockFourth)) ? top > 0xFFFF : top >= weights) return kBad;
  }
  for (uint32_t i = 0; i < weights; ++i) {
    uint8_t *w = b + start[0] + so::kWeightSize * i;
    swap16(w);
    swap16(w + 4);
  }
  for (uint32_t i = 0; i < exps; ++i) {
    uint8_t *x = b + start[1] + so::kExpSize * i;
    swap16(x);
    swap16(x + 2);
    swap16(x + 6);
  }
  for (uint32_t i = 0; i < combs; ++i) {
    uint8_t *c = b + start[2] + so::kCombSize * i;
    swap16Run(c, 3);
    swap16(c + 8);
  }
  // Lookups halve these tables, so each must be in strictly ascending order.
  for (uint32_t i = 1; i < exps; ++i)
    if (vl::rd16(b + start[1] + so::kExpSize * (i - 1)) >= vl::rd16(b + start[1] + so::kExpSize * i)) return kBad;
  auto pair = [&](uint32_t i) {
    const uint8_t *c = b + start[2] + so::kCombSize * i;
    return static_cast<uint32_t>(vl::rd16(c)) << 16 | vl::rd16(c + 2);
  };
  for (uint32_t i = 1; i < combs; ++i)
    if (pair(i - 1) >= pair(i)) return kBad;
  return 0;
}

}  // namespace

uint32_t vl::store::checkObject(VLObjEntry *e) {
  switch (e->type) {
    case VL_OBJ_LANGUAGE:
      return checkLanguage(e);
    case VL_OBJ_TERRITORY:
      return checkTextBody(e, 22, 11, 21);
    case VL_OBJ_CODEPAGE:
      return checkCodePage(e);
    case VL_OBJ_SORT:
      return checkSort(e);
    default:
      return e->section[0] ? 0 : kBad;
  }
}
