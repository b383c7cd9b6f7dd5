// The unit mappings: range tests, Latin-1 by arithmetic before any table, then at most one
// table read. The ranges do not overlap, so their order only matters for speed.
#pragma once
#include <cstdint>

#include "veltrin.h"

namespace vl::umap {

inline bool in(uint32_t u, uint32_t lo, uint32_t hi) { return u - lo <= hi - lo; }

#define VL_UMAP_TABLE(T, Name)                                               \
  if (in(u, VL_UNICODE_##T##_FIRST, VL_UNICODE_##T##_LAST)) return Name[u - VL_UNICODE_##T##_BASE]

inline VLUChar toLower(VLUChar u) {
  if (u < 0x100) return in(u, 0x41, 0x5A) || (in(u, 0xC0, 0xDE) && u != 0xD7) ? static_cast<VLUChar>(u + 0x20) : u;
  VL_UMAP_TABLE(LOWER1, VL_UNICODE_Lower1);
  VL_UMAP_TABLE(LOWER2, VL_UNICODE_Lower2);
  VL_UMAP_TABLE(LOWER3, VL_UNICODE_Lower3);
  VL_UMAP_TABLE(LOWER4, VL_UNICODE_Lower4);
  VL_UMAP_TABLE(LOWER5, VL_UNICODE_Lower5);
  VL_UMAP_TABLE(LOWER6, VL_UNICODE_Lower6);
  if (in(u, 0x531, 0x556) || in(u, 0x10A0, 0x10C5)) return static_cast<VLUChar>(u + 0x30);
  if (in(u, 0x2160, 0x216F)) return static_cast<VLUChar>(u + 0x10);
  if (in(u, 0x24B6, 0x24CF)) return static_cast<VLUChar>(u + 0x1A);
  if (in(u, 0xFF21, 0xFF3A)) return static_cast<VLUChar>(u + 0x20);
  return u;
}

// No Georgian range in this direction: the lower-case letters stay as they are.
inline VLUChar toUpper(VLUChar u) {
  if (u < 0x100) {
    if (in(u, 0x61, 0x7A) || (in(u, 0xE0, 0xFE) && u != 0xF7)) return static_cast<VLUChar>(u - 0x20);
    return u == 0xFF ? 0x178 : u;
  }
  VL_UMAP_TABLE(UPPER1, VL_UNICODE_Upper1);
  VL_UMAP_TABLE(UPPER2, VL_UNICODE_Upper2);
  VL_UMAP_TABLE(UPPER3, VL_UNICODE_Upper3);
  VL_UMAP_TABLE(UPPER4, VL_UNICODE_Upper4);
  VL_UMAP_TABLE(UPPER5, VL_UNICODE_Upper5);
  VL_UMAP_TABLE(UPPER6, VL_UNICODE_Upper6);
  if (in(u, 0x561, 0x586)) return static_cast<VLUChar>(u - 0x30);
  if (in(u, 0x2170, 0x217F)) return static_cast<VLUChar>(u - 0x10);
  if (in(u, 0x24D0, 0x24E9)) return static_cast<VLUChar>(u - 0x1A);
  if (in(u, 0xFF41, 0xFF5A)) return static_cast<VLUChar>(u - 0x20);
  return u;
}

inline VLUChar toFull(VLUChar u) {
  if (in(u, 0x21, 0x7E)) return static_cast<VLUChar>(u + 0xFEE0);
  VL_UMAP_TABLE(H2F1, VL_UNICODE_H2F1);
  VL_UMAP_TABLE(H2F2, VL_UNICODE_H2F2);
  if (u == 0x20) return 0x3000;
  if (u == 0x20A9) return 0xFFE6;
  return u;
}

inline VLUChar toHalf(VLUChar u) {
  if (in(u, 0xFF01, 0xFF5E)) return static_cast<VLUChar>(u - 0xFEE0);
  if (in(u, 0x2190, 0x2193)) return static_cast<VLUChar>(u - 0x2190 + 0xFFE9);
  VL_UMAP_TABLE(F2H1, VL_UNICODE_F2H1);
  VL_UMAP_TABLE(F2H2, VL_UNICODE_F2H2);
  VL_UMAP_TABLE(F2H3, VL_UNICODE_F2H3);
  VL_UMAP_TABLE(F2H4, VL_UNICODE_F2H4);
  return u;
}

#undef VL_UMAP_TABLE

// The ASCII digit that decimal digit u stands for, 0 when u is none.
inline VLUChar asciiDigit(VLUChar u) {
  uint32_t lo = 0, hi = sizeof VLDigits / sizeof VLDigits[0];
  while (lo < hi) {
    uint32_t mid = (lo + hi) / 2;
    if (VLDigits[mid][0] < u)
      lo = mid + 1;
    else
      hi = mid;
  }
  return lo < sizeof VLDigits / sizeof VLDigits[0] && VLDigits[lo][0] == u ? VLDigits[lo][1] : 0;
}

}  // namespace vl::umap
