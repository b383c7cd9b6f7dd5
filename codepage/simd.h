// Runs of plain characters (values that are the same on both sides of a conversion)
// copied many at a time: bytes widened to UTF-16 units, units narrowed to bytes, bytes
// copied. Each call copies the leading run of plain values, at most n, writes nothing
// past it, and returns its length; the caller converts the character that ended it.
//
// SSE2 is the x86-64 baseline; AVX2 is taken when the processor has it; elsewhere a
// scalar loop. All three give the same output.
#pragma once
#include <atomic>
#include <cstddef>
#include <cstdint>

#include "veltrin.h"

#if defined(__x86_64__) && defined(__SSE2__)
#include <emmintrin.h>
#endif

namespace vl::simd {

enum Level : int { kScalar = 0, kSse2 = 1, kAvx2 = 2 };

// The level in use: the best the processor has, unless capped by capLevel.
extern std::atomic<int> levelNow;
inline int level() { return levelNow.load(std::memory_order_relaxed); }
// Caps the level for tests that hold the vector paths against the scalar one; a negative
// value restores the detected level. Not for use while conversions run on other threads.
void capLevel(int cap);

// lim is 0x80 (ASCII runs) or 0x100 (every value below 0x100 is plain).
size_t widen(const uint8_t *s, VLUChar *d, size_t n, unsigned lim);
size_t narrow(const VLUChar *s, uint8_t *d, size_t n, unsigned lim);
size_t copy(const uint8_t *s, uint8_t *d, size_t n, unsigned lim);

// The same, with the first block tested in line: runs in prose are mostly shorter than a
// block, and the call is paid only by runs that go on.
inline size_t widenRun(const uint8_t *s, VLUChar *d, size_t n, unsigned lim) {
#if defined(__x86_64__) && defined(__SSE2__)
  if (n >= 16 && lim < 0x100 && level() != kScalar) {
    const __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i *>(s)), z = _mm_setzero_si128();
    unsigned m = static_cast<unsigned>(_mm_movemask_epi8(x));
    if (m) {
      unsigned k = static_cast<unsigned>(__builtin_ctz(m));
      if (k >= 8) _mm_storeu_si128(reinterpret_cast<__m128i *>(d), _mm_unpacklo_epi8(x, z));
      for (unsigned j = k & 8; j < k; ++j) d[j] = s[j];
      return k;
    }
    _mm_storeu_si128(reinterpret_cast<__m128i *>(d), _mm_unpacklo_epi8(x, z));
    _mm_storeu_si128(reinterpret_cast<__m128i *>(d + 8), _mm_unpackhi_epi8(x, z));
    return 16 + widen(s + 16, d + 16, n - 16, lim);
  }
#endif
  return widen(s, d, n, lim);
}

inline size_t narrowRun(const VLUChar *s, uint8_t *d, size_t n, unsigned lim) {
#if defined(__x86_64__) && defined(__SSE2__)
  if (n >= 16 && level() != kScalar) {
    const __m128i z = _mm_setzero_si128();
    const __m128i high = _mm_set1_epi16(static_cast<short>(lim < 0x100 ? 0xFF80 : 0xFF00));
    __m128i a = _mm_loadu_si128(reinterpret_cast<const __m128i *>(s));
    __m128i b = _mm_loadu_si128(reinterpret_cast<const __m128i *>(s + 8));
    __m128i ok = _mm_packs_epi16(_mm_cmpeq_epi16(_mm_and_si128(a, high), z), _mm_cmpeq_epi16(_mm_and_si128(b, high), z));
    unsigned bad = ~static_cast<unsigned>(_mm_movemask_epi8(ok)) & 0xFFFF;
    if (bad) {
      unsigned k = static_cast<unsigned>(__builtin_ctz(bad));
      for (unsigned j = 0; j < k; ++j) d[j] = static_cast<uint8_t>(s[j]);
      return k;
    }
    _mm_storeu_si128(reinterpret_cast<__m128i *>(d), _mm_packus_epi16(a, b));
    return 16 + narrow(s + 16, d + 16, n - 16, lim);
  }
#endif
  return narrow(s, d, n, lim);
}

// ---- Blocks of mixed text --------------------------------------------------------------
// For the conversion loop: whole characters, a block at a time, while at least a block's
// worth of the n characters allowed remains; each stops early at a block it does not take
// and leaves that to the caller's loop. They may write up to a block past their output
// (never past what the n characters will write anyway) and return what they consumed.
struct Moved {
  size_t in, out;
};

// UTF-8 of one to three bytes (a lead byte at or above 0xE0 takes three, as in the
// arithmetic decoder) to UTF-16, ASCII as itself. Stops at a block whose continuation
// bytes are not exactly where its leads put them. s must hold 4n bytes.
Moved utf8ToUtf16(const uint8_t *s, VLUChar *d, size_t n);
// UTF-16 units below 0x800 to UTF-8; stops at a block holding a larger one. d must hold
// 3n bytes.
Moved utf16ToUtf8(const VLUChar *s, uint8_t *d, size_t n);

// The span [lo, hi) of the bytes whose unit in a table of 256 native-order units is not
// the byte itself (lo >= hi when there is none). Cheap enough to take on every call.
void unlikeSpan(const uint8_t *table, unsigned &lo, unsigned &hi);

// Bytes through a table of 256 native-order units, a block at a time; returns how many
// (a multiple of the block, or 0 where the level has no table shuffle).
size_t mapBytes(const uint8_t *s, VLUChar *d, size_t n, const uint8_t *table);

// The bytes of a lead-byte length table that lead characters of more than one byte, as
// a few ranges; pages whose leads need more ranges than that have no masks.
struct LeadRanges {
  static constexpr unsigned kMax = 8;
  uint8_t lo[kMax] = {}, span[kMax] = {};
  alignas(32) uint8_t loV[kMax][32] = {}, spanV[kMax][32] = {};  // each repeated, for the vector tests
  unsigned count = 0, twos = 0, threes = 0;  // ranges of two-byte leads first, then three-byte ones
  bool build(const uint8_t *lens);
};
// Of 64 bytes, those that lead two-byte, three-byte and longer characters (bit i for s[i]).
struct LeadMasks {
  uint64_t two, three, longer;
};
LeadMasks leadMasks(const uint8_t *s, const LeadRanges &r, const uint8_t *lens);

// Widens 16 bytes and returns the mask of those in [lo, lo + span), which the caller
// patches from its table; every other byte is its own value.
inline unsigned widenBlock(const uint8_t *s, VLUChar *d, uint8_t lo, uint8_t span) {
#if defined(__x86_64__) && defined(__SSE2__)
  if (level() != kScalar) {
    const __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i *>(s)), z = _mm_setzero_si128();
    const __m128i t = _mm_sub_epi8(x, _mm_set1_epi8(static_cast<char>(lo)));
    const __m128i in = _mm_cmpeq_epi8(_mm_min_epu8(t, _mm_set1_epi8(static_cast<char>(span - 1))), t);
    _mm_storeu_si128(reinterpret_cast<__m128i *>(d), _mm_unpacklo_epi8(x, z));
    _mm_storeu_si128(reinterpret_cast<__m128i *>(d + 8), _mm_unpackhi_epi8(x, z));
    return static_cast<unsigned>(_mm_movemask_epi8(in));
  }
#endif
  unsigned m = 0;
  for (unsigned j = 0; j < 16; ++j) {
    d[j] = s[j];
    if (static_cast<uint8_t>(s[j] - lo) < span) m |= 1u << j;
  }
  return m;
}

// Narrows 16 units (saturating) and returns the mask of those at or above lim, which the
// caller patches through its encoder.
inline unsigned narrowBlock(const VLUChar *s, uint8_t *d, unsigned lim) {
#if defined(__x86_64__) && defined(__SSE2__)
  if (level() != kScalar) {
    const __m128i z = _mm_setzero_si128(), high = _mm_set1_epi16(static_cast<short>(~(lim - 1)));
    __m128i a = _mm_loadu_si128(reinterpret_cast<const __m128i *>(s));
    __m128i b = _mm_loadu_si128(reinterpret_cast<const __m128i *>(s + 8));
    __m128i ok = _mm_packs_epi16(_mm_cmpeq_epi16(_mm_and_si128(a, high), z), _mm_cmpeq_epi16(_mm_and_si128(b, high), z));
    _mm_storeu_si128(reinterpret_cast<__m128i *>(d), _mm_packus_epi16(a, b));
    return ~static_cast<unsigned>(_mm_movemask_epi8(ok)) & 0xFFFF;
  }
#endif
  unsigned m = 0;
  for (unsigned j = 0; j < 16; ++j) {
    d[j] = static_cast<uint8_t>(s[j] >= 0x8000 ? 0 : s[j] > 0xFF ? 0xFF : s[j]);  // as the signed pack
    if (s[j] >= lim) m |= 1u << j;
  }
  return m;
}

}  // namespace vl::simd
