// Inline forms of the code page character primitives. The exported functions are thin
// wrappers around these; conversion and string loops call them directly.
//
// The load-time check has proven every trie index, value index, record index and index
// entry offset in range for bytes within a node's bounds, and left all tables in native
// byte order. What it cannot bound is the walk itself: a walk takes one byte per level
// and never more than the character has, and gives up if no leaf was reached by then.
#pragma once
#include <cstdint>
#include <cstring>

#include "codepage/cpbody.h"

// The per-character forms stay inline in every loop that uses them.
#define VL_HOT inline __attribute__((always_inline))

namespace vl::cp {

constexpr VLUChar kReplacement = 0xFFFD;
// Type record of a character the tables do not classify.
inline constexpr VLCtypeRecord kUnassigned{0x400, 0};

inline bool usable(const VLCodePage *c) { return c && c->section[0]; }

// ---- Lengths and W values ------------------------------------------------------------

// UTF-8 by arithmetic: a stray continuation byte stands alone as one (undecodable) byte.
VL_HOT unsigned utf8Len(uint8_t lead) { return lead < 0xC0 ? 1u : lead > 0xDF ? 3u : 2u; }

// Length of the character starting with lead.
VL_HOT unsigned lenOf(const VLCodePage *c, uint8_t lead) {
  return isUtf8(c) ? utf8Len(lead) : charLen(c, lead);
}

// Bytes of a character of more than one byte: in a shift-sensitive page those are the
// characters of the double-byte state, whose length the lead-byte table does not give.
VL_HOT unsigned multiLen(const VLCodePage *c, uint8_t lead) {
  if (isUtf8(c)) return utf8Len(lead);
  return isShift(c) ? maxLen(c) : charLen(c, lead);
}

VL_HOT VLWChar readW(const uint8_t *p, unsigned n) {
  VLWChar v = p[0];
  for (unsigned i = 1; i < n; ++i) v = (v << 8) | p[i];
  return v;
}

// Zero bytes inside a value are dropped on purpose: no character is formed with them.
VL_HOT int wToMb(uint8_t *out, VLWChar v) {
  int n = 0;
  if (v > 0xFFFFFF) out[n++] = static_cast<uint8_t>(v >> 24);
  if ((v >> 16) & 0xFF) out[n++] = static_cast<uint8_t>(v >> 16);
  if ((v >> 8) & 0xFF) out[n++] = static_cast<uint8_t>(v >> 8);
  out[n++] = static_cast<uint8_t>(v);
  return n;
}

// A W value unpacked into a zero-filled buffer, so arithmetic may look past its end.
struct WBytes {
  uint8_t b[4] = {0, 0, 0, 0};
  unsigned n;
  explicit WBytes(VLWChar v) : n(static_cast<unsigned>(wToMb(b, v))) {}
};

// ---- Code page to UTF-16 ---------------------------------------------------------------

VL_HOT VLUChar utf8ToUni(const uint8_t *p) {
  uint8_t b0 = p[0];
  if (b0 < 0x80) return b0;
  if (b0 < 0xC0) return kReplacement;
  if (b0 > 0xDF) return static_cast<VLUChar>(((b0 & 0x0F) << 12) | ((p[1] & 0x3F) << 6) | (p[2] & 0x3F));
  return static_cast<VLUChar>(((b0 & 0x1F) << 6) | (p[1] & 0x3F));
}

// Walks the conversion trie over at most n bytes.
VL_HOT VLUChar trieToUni(const VLCodePage *c, const uint8_t *p, unsigned n) {
  const uint8_t *t = trie(c);
  if (!t) return kReplacement;
  const uint8_t *node = t;
  for (unsigned i = 0; i < n; ++i) {
    unsigned b = p[i];
    if (b < node[2] || b > node[3]) return kReplacement;
    unsigned at = rd16(node + 4) + (b & node[1]);
    if (node[0]) return rd16(t + off(c, kValueOff) + 2u * at);
    node = t + kNodeSize * at;
  }
  return kReplacement;
}

VL_HOT VLUChar mbToUni(const VLCodePage *c, const uint8_t *p, unsigned n) {
  return isUtf8(c) ? utf8ToUni(p) : trieToUni(c, p, n);
}

VL_HOT VLUChar wToUni(const VLCodePage *c, VLWChar v) {
  WBytes w(v);
  return mbToUni(c, w.b, w.n);
}

// ---- UTF-16 to code page ---------------------------------------------------------------

VL_HOT int uniToUtf8(VLUChar u, uint8_t *out) {
  if (u < 0x80) {
    out[0] = static_cast<uint8_t>(u);
    return 1;
  }
  if (u <= 0x7FF) {
    out[0] = static_cast<uint8_t>(0xC0 | (u >> 6));
    out[1] = static_cast<uint8_t>(0x80 | (u & 0x3F));
    return 2;
  }
  out[0] = static_cast<uint8_t>(0xE0 | (u >> 12));
  out[1] = static_cast<uint8_t>(0x80 | ((u >> 6) & 0x3F));
  out[2] = static_cast<uint8_t>(0x80 | (u & 0x3F));
  return 3;
}

VL_HOT VLWChar uniToUtf8W(VLUChar u) {
  if (u < 0x80) return u;
  if (u <= 0x7FF) return 0xC080u | ((u & 0x7C0u) << 2) | (u & 0x3Fu);
  return 0xE08080u | ((u & 0xF000u) << 4) | ((u & 0xFC0u) << 2) | (u & 0x3Fu);
}

// The index entry of the unit's high byte, or null when its low byte is out of bounds.
VL_HOT const uint8_t *indexEntry(const VLCodePage *c, VLUChar u) {
  const uint8_t *x = body(c) + kIndex + kIndexSize * (u >> 8);
  unsigned l = u & 0xFF;
  return (l < x[2] || l > x[3]) ? nullptr : x;
}

VL_HOT VLWChar indexValue(const VLCodePage *c, const uint8_t *x, VLUChar u) {
  unsigned i = (u & 0xFF) & x[1];
  auto lo = [&] { return lowTable(c) + rd16(x + 4); };
  auto hi = [&] { return highTable(c) + rd16(x + 6); };
  switch (x[0]) {
    case 0:
      return lo()[i];
    case 1:
      return rd16(lo() + 2 * i);
    case 2:
      return rd16(lo() + 2 * i) + (static_cast<VLWChar>(hi()[i]) << 16);
    case 3:
      return rd16(lo() + 2 * i) | (static_cast<VLWChar>(rd16(hi() + 2 * i)) << 16);
    case 4:
      return lo()[i] + (static_cast<VLWChar>(hi()[i]) << 8);
    default:
      return 0;
  }
}

VL_HOT int uniToMb(const VLCodePage *c, VLUChar u, uint8_t *out) {
  if (isUtf8(c)) return uniToUtf8(u, out);
  const uint8_t *x = indexEntry(c, u);
  if (!x) {
    out[0] = subst(c);
    return 1;
  }
  if (x[0] == 0) {
    out[0] = lowTable(c)[rd16(x + 4) + ((u & 0xFF) & x[1])];
    return 1;
  }
  return wToMb(out, indexValue(c, x, u));
}

VL_HOT VLWChar uniToW(const VLCodePage *c, VLUChar u) {
  if (isUtf8(c)) return uniToUtf8W(u);
  const uint8_t *x = indexEntry(c, u);
  return x ? indexValue(c, x, u) : subst(c);
}

// ---- Types, case and width -------------------------------------------------------------

// Walks the type trie over at most n bytes; the trie has no bounds, every byte leads on.
VL_HOT const VLCtypeRecord *ctypeOf(const VLCodePage *c, const uint8_t *p, unsigned n) {
  unsigned nodes = off(c, kTypeTrieOff), records = off(c, kTypeRecOff);
  if (!nodes || !records) return &kUnassigned;
  const uint8_t *b = body(c);
  if (n == 1) {
    if (!(flags(c) & kFlagOneByteTypes)) return &kUnassigned;
    return reinterpret_cast<const VLCtypeRecord *>(b + records + kRecordSize * (1u + p[0]));
  }
  const uint8_t *node = b + nodes;
  for (unsigned i = 0; i < n; ++i) {
    unsigned at = rd16(node + 2) + (p[i] & node[1]);
    if (node[0]) return reinterpret_cast<const VLCtypeRecord *>(b + records + kRecordSize * at);
    node = b + nodes + kTypeNodeSize * at;
  }
  return &kUnassigned;
}

VL_HOT const VLCtypeRecord *ctypeOfW(const VLCodePage *c, VLWChar v) {
  WBytes w(v);
  return ctypeOf(c, w.b, w.n);
}

// Converts the n-byte character at src when its type matches mask, else copies it.
VL_HOT int caseConv(const VLCodePage *c, const uint8_t *src, unsigned n, uint8_t *out, uint32_t mask) {
  const VLCtypeRecord *r = ctypeOf(c, src, n);
  if (r->type & mask) return wToMb(out, readW(src, n) + static_cast<VLWChar>(r->caseDelta));
  std::memcpy(out, src, n);
  return static_cast<int>(n);
}

VL_HOT VLWChar caseConvW(const VLCodePage *c, VLWChar v, uint32_t mask) {
  const VLCtypeRecord *r = ctypeOfW(c, v);
  return (r->type & mask) ? v + static_cast<VLWChar>(r->caseDelta) : v;
}

inline uint32_t pairCount(const VLCodePage *c) { return rd16(body(c) + kPairCount); }
// Pair k: half-width value, then full-width value.
inline const uint8_t *pairAt(const VLCodePage *c, uint32_t k) { return body(c) + off(c, kPairOff) + 8u * k; }

inline VLWChar halfToFull(const VLCodePage *c, VLWChar v) {
  uint32_t count = pairCount(c);
  if (!count) return 0;
  uint32_t lo = 0, hi = count - 1;
  while (lo < hi) {
    uint32_t mid = (lo + hi) / 2;
    if (v <= rd32(pairAt(c, mid)))
      hi = mid;
    else
      lo = mid + 1;
  }
  return rd32(pairAt(c, hi)) == v ? rd32(pairAt(c, hi) + 4) : 0;
}

inline VLWChar fullToHalf(const VLCodePage *c, VLWChar v) {
  if (!v) return 0;
  if (unsigned full = off(c, kFullOff)) {
    const uint8_t *t = body(c) + full;
    for (unsigned i = 0; i < 256; ++i)
      if (rd32(t + 4 * i) == v) return i;
  }
  uint32_t count = pairCount(c);
  for (uint32_t k = 0; k < count; ++k)
    if (rd32(pairAt(c, k) + 4) == v) return rd32(pairAt(c, k));
  return 0;
}

}  // namespace vl::cp
