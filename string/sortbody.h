// Layout of a loaded sort body (native byte order once loaded) and its lookups. The load
// check has proven every offset, count and table index in range, so these trust it.
#pragma once
#include <cstdint>

#include "frame/frame.h"

namespace vl::sort {

constexpr uint32_t kDefSec = 0, kDefTer = 1, kExpCount = 2, kCombCount = 4, kBlocks = 6;
constexpr uint32_t kWeightOff = 1030, kExpOff = 1032, kCombOff = 1034, kHeader = 1036;
constexpr uint32_t kWeightSize = 6, kExpSize = 14, kCombSize = 10;

constexpr uint8_t kBlockIgnore = 0x01, kBlockPrimary = 0x02, kBlockFourth = 0x04;
constexpr uint16_t kFourth = 0x8000, kExpands = 0x4000, kClassMask = 0x3c00;
constexpr uint8_t kFwdPrimary = 0x8, kFwdSecondary = 0x4, kFwdTertiary = 0x2, kFwdFourth = 0x1;

// One collation element: four weights and the class of forward levels.
struct Element {
  uint16_t primary = 0;
  uint8_t secondary = 0, tertiary = 0;
  uint16_t fourth = 0;
};
struct Weights {
  Element e[2];
  uint8_t cls = 0;
};

inline const uint8_t *body(const VLObjEntry *s) { return static_cast<const uint8_t *>(s->section[0]); }
inline bool hasCombinations(const VLObjEntry *s) { return rd16(body(s) + kCombCount) != 0; }

// Fills w from a weight word, secondary, tertiary and flags (weight table or combination).
inline void fromEntry(uint16_t word, uint8_t sec, uint8_t ter, uint16_t flags, Weights *w) {
  w->e[0] = Element{};
  if (flags & kFourth)
    w->e[0].fourth = word;
  else
    w->e[0] = Element{word, sec, ter, 0};
  w->cls = static_cast<uint8_t>((flags & kClassMask) >> 10);
}

// The entry of a table in ascending order (proven at load) whose key is k: the unit, or
// the two units of a combination as one 32-bit value.
inline const uint8_t *find(const uint8_t *t, uint32_t n, uint32_t size, uint32_t k) {
  uint32_t lo = 0, hi = n;
  while (lo < hi) {
    const uint32_t mid = (lo + hi) / 2;
    const uint8_t *e = t + size * mid;
    const uint32_t v = size == kCombSize ? static_cast<uint32_t>(rd16(e)) << 16 | rd16(e + 2) : rd16(e);
    if (v == k) return e;
    if (v < k) lo = mid + 1; else hi = mid;
  }
  return nullptr;
}

// 0 = no weights, 1 = one element, 2 = two elements.
inline int weightsOf(const VLObjEntry *s, uint16_t unit, Weights *w) {
  const uint8_t *b = body(s);
  const uint8_t *blk = b + kBlocks + 4u * (unit >> 8);
  const uint8_t flags = blk[0];
  const uint16_t at = static_cast<uint16_t>(rd16(blk + 2) + (unit & 0xFF));
  *w = Weights{};
  if (flags & kBlockIgnore) return 0;
  if (flags & kBlockPrimary) {
    w->e[0].primary = at;
    w->cls = blk[1] & 0xF;
    return 1;
  }
  if (flags & kBlockFourth) {
    w->e[0].fourth = at;
    w->cls = blk[1] & 0xF;
    return 1;
  }
  const uint8_t *e = b + rd16(b + kWeightOff) + kWeightSize * at;
  const uint16_t ef = rd16(e + 4);
  if (ef & kExpands) {
    const uint8_t *x = find(b + rd16(b + kExpOff), rd16(b + kExpCount), kExpSize, unit);
    if (x) {
      w->e[0] = Element{rd16(x + 2), x[4], x[5], 0};
      w->e[1] = Element{rd16(x + 6), x[8], x[9], 0};
      w->cls = static_cast<uint8_t>((ef & kClassMask) >> 10);
      return 2;
    }
    return 0;
  }
  fromEntry(rd16(e), e[2], e[3], ef, w);
  return 1;
}

// True when some combination starts with u.
inline bool startsCombination(const VLObjEntry *s, uint16_t u) {
  const uint8_t *b = body(s);
  const uint8_t *t = b + rd16(b + kCombOff);
  const uint32_t n = rd16(b + kCombCount);
  uint32_t lo = 0, hi = n;
  while (lo < hi) {
    const uint32_t mid = (lo + hi) / 2;
    if (rd16(t + kCombSize * mid) < u) lo = mid + 1; else hi = mid;
  }
  return lo < n && rd16(t + kCombSize * lo) == u;
}

// 1 when the pair forms one element.
inline int combinationOf(const VLObjEntry *s, uint16_t u1, uint16_t u2, Weights *w) {
  const uint8_t *b = body(s);
  const uint8_t *c = find(b + rd16(b + kCombOff), rd16(b + kCombCount), kCombSize,
                         static_cast<uint32_t>(u1) << 16 | u2);
  if (c) {
    *w = Weights{};
    fromEntry(rd16(c + 4), c[6], c[7], rd16(c + 8), w);
    return 1;
  }
  return 0;
}

}  // namespace vl::sort
