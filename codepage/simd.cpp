// The vector loops of simd.h and their dispatch.
#include "codepage/simd.h"

#include <algorithm>
#include <atomic>
#include <cstring>

#if defined(__x86_64__) && defined(__SSE2__)
#include <immintrin.h>
#define VL_SIMD_X86 1
#endif

namespace vl::simd {

namespace {

int detect() {
#ifdef VL_SIMD_X86
  __builtin_cpu_init();
  return __builtin_cpu_supports("avx2") ? kAvx2 : kSse2;
#else
  return kScalar;
#endif
}

const int g_detected = detect();

// ---- Scalar: the reference every vector path must match ----------------------------

size_t widenScalar(const uint8_t *s, VLUChar *d, size_t n, unsigned lim) {
  size_t i = 0;
  for (; i < n && s[i] < lim; ++i) d[i] = s[i];
  return i;
}
size_t narrowScalar(const VLUChar *s, uint8_t *d, size_t n, unsigned lim) {
  size_t i = 0;
  for (; i < n && s[i] < lim; ++i) d[i] = static_cast<uint8_t>(s[i]);
  return i;
}
size_t copyScalar(const uint8_t *s, uint8_t *d, size_t n, unsigned lim) {
  if (lim >= 0x100) {
    std::memcpy(d, s, n);
    return n;
  }
  size_t i = 0;
  for (; i < n && s[i] < lim; ++i) d[i] = s[i];
  return i;
}

// Mixed blocks are left to the character loop.
Moved utf8None(const uint8_t *, VLUChar *, size_t) { return {0, 0}; }
Moved utf16None(const VLUChar *, uint8_t *, size_t) { return {0, 0}; }
size_t mapNone(const uint8_t *, VLUChar *, size_t, const uint8_t *) { return 0; }

#ifdef VL_SIMD_X86

// ---- SSE2: 16 values a step; a block with a non-plain value ends the run inside it ---

size_t widenSse2(const uint8_t *s, VLUChar *d, size_t n, unsigned lim) {
  const __m128i z = _mm_setzero_si128();
  size_t i = 0;
  for (; i + 16 <= n; i += 16) {
    __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i *>(s + i));
    unsigned m = lim < 0x100 ? static_cast<unsigned>(_mm_movemask_epi8(x)) : 0;
    if (m == 0) {
      _mm_storeu_si128(reinterpret_cast<__m128i *>(d + i), _mm_unpacklo_epi8(x, z));
      _mm_storeu_si128(reinterpret_cast<__m128i *>(d + i + 8), _mm_unpackhi_epi8(x, z));
      continue;
    }
    unsigned k = static_cast<unsigned>(__builtin_ctz(m));
    if (k >= 8) _mm_storeu_si128(reinterpret_cast<__m128i *>(d + i), _mm_unpacklo_epi8(x, z));
    for (unsigned j = k & 8; j < k; ++j) d[i + j] = s[i + j];
    return i + k;
  }
  return i + widenScalar(s + i, d + i, n - i, lim);
}

size_t narrowSse2(const VLUChar *s, uint8_t *d, size_t n, unsigned lim) {
  const __m128i z = _mm_setzero_si128();
  const __m128i high = _mm_set1_epi16(static_cast<short>(lim < 0x100 ? 0xFF80 : 0xFF00));
  size_t i = 0;
  for (; i + 16 <= n; i += 16) {
    __m128i a = _mm_loadu_si128(reinterpret_cast<const __m128i *>(s + i));
    __m128i b = _mm_loadu_si128(reinterpret_cast<const __m128i *>(s + i + 8));
    __m128i t = _mm_and_si128(_mm_or_si128(a, b), high);
    if (_mm_movemask_epi8(_mm_cmpeq_epi16(t, z)) != 0xFFFF) break;
    _mm_storeu_si128(reinterpret_cast<__m128i *>(d + i), _mm_packus_epi16(a, b));
  }
  return i + narrowScalar(s + i, d + i, n - i, lim);
}

size_t copySse2(const uint8_t *s, uint8_t *d, size_t n, unsigned lim) {
  if (lim >= 0x100) return copyScalar(s, d, n, lim);
  size_t i = 0;
  for (; i + 16 <= n; i += 16) {
    __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i *>(s + i));
    unsigned m = static_cast<unsigned>(_mm_movemask_epi8(x));
    if (m) {
      unsigned k = static_cast<unsigned>(__builtin_ctz(m));
      std::memcpy(d + i, s + i, k);
      return i + k;
    }
    _mm_storeu_si128(reinterpret_cast<__m128i *>(d + i), x);
  }
  return i + copyScalar(s + i, d + i, n - i, lim);
}

// ---- AVX2: 32 values a step; the block that ends the run is left to SSE2 ------------

[[gnu::target("avx2")]] size_t widenAvx2(const uint8_t *s, VLUChar *d, size_t n, unsigned lim) {
  size_t i = 0;
  for (; i + 32 <= n; i += 32) {
    __m256i x = _mm256_loadu_si256(reinterpret_cast<const __m256i *>(s + i));
    if (lim < 0x100 && _mm256_movemask_epi8(x)) break;
    _mm256_storeu_si256(reinterpret_cast<__m256i *>(d + i), _mm256_cvtepu8_epi16(_mm256_castsi256_si128(x)));
    _mm256_storeu_si256(reinterpret_cast<__m256i *>(d + i + 16), _mm256_cvtepu8_epi16(_mm256_extracti128_si256(x, 1)));
  }
  return i + widenSse2(s + i, d + i, n - i, lim);
}

[[gnu::target("avx2")]] size_t narrowAvx2(const VLUChar *s, uint8_t *d, size_t n, unsigned lim) {
  const __m256i high = _mm256_set1_epi16(static_cast<short>(lim < 0x100 ? 0xFF80 : 0xFF00));
  size_t i = 0;
  for (; i + 32 <= n; i += 32) {
    __m256i a = _mm256_loadu_si256(reinterpret_cast<const __m256i *>(s + i));
    __m256i b = _mm256_loadu_si256(reinterpret_cast<const __m256i *>(s + i + 16));
    if (!_mm256_testz_si256(_mm256_or_si256(a, b), high)) break;
    // packus works per 128-bit lane; the permute puts the quarters back in order.
    __m256i p = _mm256_permute4x64_epi64(_mm256_packus_epi16(a, b), 0xD8);
    _mm256_storeu_si256(reinterpret_cast<__m256i *>(d + i), p);
  }
  return i + narrowSse2(s + i, d + i, n - i, lim);
}

[[gnu::target("avx2")]] size_t copyAvx2(const uint8_t *s, uint8_t *d, size_t n, unsigned lim) {
  if (lim >= 0x100) return copyScalar(s, d, n, lim);
  size_t i = 0;
  for (; i + 32 <= n; i += 32) {
    __m256i x = _mm256_loadu_si256(reinterpret_cast<const __m256i *>(s + i));
    if (_mm256_movemask_epi8(x)) break;
    _mm256_storeu_si256(reinterpret_cast<__m256i *>(d + i), x);
  }
  return i + copySse2(s + i, d + i, n - i, lim);
}

// ---- Blocks of mixed text ----------------------------------------------------------------

// Byte shuffles by an 8-bit mask: the units of the set bits packed to the front, and each
// unit's low byte followed by its high byte only where its bit is set.
struct Shuffles {
  alignas(16) uint8_t units[256][16];
  alignas(16) uint8_t pairs[256][16];
};
constexpr Shuffles makeShuffles() {
  Shuffles t{};
  for (unsigned m = 0; m < 256; ++m) {
    unsigned u = 0, p = 0;
    for (unsigned j = 0; j < 8; ++j) {
      if (m >> j & 1) {
        t.units[m][u++] = static_cast<uint8_t>(2 * j);
        t.units[m][u++] = static_cast<uint8_t>(2 * j + 1);
      }
      t.pairs[m][p++] = static_cast<uint8_t>(2 * j);
      if (m >> j & 1) t.pairs[m][p++] = static_cast<uint8_t>(2 * j + 1);
    }
    for (; u < 16; ++u) t.units[m][u] = 0x80;
    for (; p < 16; ++p) t.pairs[m][p] = 0x80;
  }
  return t;
}
constexpr Shuffles kShuffles = makeShuffles();

// Four units of one to three bytes, each in a 32-bit lane: the shuffle that packs their
// bytes, by their lengths less one in two bits apiece, and the bytes it gives.
struct Groups {
  alignas(16) uint8_t shuffle[256][16];
  uint8_t length[256];
  uint8_t spread[16];  // four mask bits moved to the even bits of a byte
};
constexpr Groups makeGroups() {
  Groups t{};
  for (unsigned m = 0; m < 256; ++m) {
    unsigned p = 0;
    for (unsigned j = 0; j < 4; ++j)
      for (unsigned k = 0; k <= std::min((m >> 2 * j) & 3, 2u); ++k)
        t.shuffle[m][p++] = static_cast<uint8_t>(4 * j + k);
    t.length[m] = static_cast<uint8_t>(p);
    for (; p < 16; ++p) t.shuffle[m][p] = 0x80;
  }
  for (unsigned b = 0; b < 16; ++b)
    t.spread[b] = static_cast<uint8_t>((b & 1) | (b & 2) << 1 | (b & 4) << 2 | (b & 8) << 3);
  return t;
}
constexpr Groups kGroups = makeGroups();

// 16 bytes put in the order a shuffle row gives, stored unaligned.
[[gnu::target("avx2"), gnu::always_inline]] inline void storeShuffled(void *d, __m128i v, const uint8_t *row) {
  __m128i x = _mm_shuffle_epi8(v, _mm_load_si128(reinterpret_cast<const __m128i *>(row)));
  _mm_storeu_si128(reinterpret_cast<__m128i *>(d), x);
}

// SSE2 has no byte shuffle: it takes the ASCII blocks and leaves the rest.
Moved utf8ToUtf16Sse2(const uint8_t *s, VLUChar *d, size_t n) {
  const __m128i z = _mm_setzero_si128();
  size_t in = 0;
  for (; in + 16 <= n; in += 16) {
    __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i *>(s + in));
    if (_mm_movemask_epi8(x)) break;
    _mm_storeu_si128(reinterpret_cast<__m128i *>(d + in), _mm_unpacklo_epi8(x, z));
    _mm_storeu_si128(reinterpret_cast<__m128i *>(d + in + 8), _mm_unpackhi_epi8(x, z));
  }
  return {in, in};
}

Moved utf16ToUtf8Sse2(const VLUChar *s, uint8_t *d, size_t n) {
  const __m128i high = _mm_set1_epi16(static_cast<short>(0xFF80));
  size_t in = 0;
  for (; in + 16 <= n; in += 16) {
    const auto *p = reinterpret_cast<const __m128i *>(s + in);
    __m128i a = _mm_loadu_si128(p), b = _mm_loadu_si128(p + 1);
    if (_mm_movemask_epi8(_mm_cmpeq_epi16(_mm_and_si128(_mm_or_si128(a, b), high), _mm_setzero_si128())) != 0xFFFF)
      break;
    _mm_storeu_si128(reinterpret_cast<__m128i *>(d + in), _mm_packus_epi16(a, b));
  }
  return {in, in};
}

// 16 bytes a step: lead and continuation masks say where each character starts; a block
// whose continuation bytes are exactly those its leads call for frames the same as the
// byte-by-byte decoder, so its values are computed for every position at once and the
// continuation positions squeezed out. A character whose lead is in the block takes its
// last bytes from the next one, which then expects them: the step is always 16 bytes, so
// no step waits for the masks of the one before.
[[gnu::target("avx2")]] Moved utf8ToUtf16Avx2(const uint8_t *s, VLUChar *d, size_t n) {
  const __m256i low6 = _mm256_set1_epi16(0x3F), low5 = _mm256_set1_epi16(0x1F);
  const __m256i ascii = _mm256_set1_epi16(0x80), two = _mm256_set1_epi16(0xDF);
  size_t in = 0, out = 0;
  unsigned carry = 0;  // the first bytes of this block that a character of the last one took
  // Up to 16 characters a step, and 18 bytes read: s holds 4n bytes.
  while (out + 16 <= n) {
    const uint8_t *p = s + in;
    __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i *>(p));
    unsigned high = static_cast<unsigned>(_mm_movemask_epi8(x));
    __m256i b0 = _mm256_cvtepu8_epi16(x);
    if (!high) {
      _mm256_storeu_si256(reinterpret_cast<__m256i *>(d + out), b0);
      in += 16;
      out += 16;
      continue;
    }
    // Bits 6 and 5 of each byte, moved up to the sign: with bit 7, 11x is a lead, 111 of three.
    unsigned lead = high & static_cast<unsigned>(_mm_movemask_epi8(_mm_slli_epi16(x, 1)));
    unsigned three = lead & static_cast<unsigned>(_mm_movemask_epi8(_mm_slli_epi16(x, 2)));
    unsigned cont = high & ~lead;
    const unsigned expect = (lead << 1) | (three << 2) | carry;
    if ((expect ^ cont) & 0xFFFF) break;
    unsigned keep = ~cont & 0xFFFF;
    __m256i b1 = _mm256_cvtepu8_epi16(_mm_loadu_si128(reinterpret_cast<const __m128i *>(p + 1)));
    __m256i v = _mm256_or_si256(_mm256_slli_epi16(_mm256_and_si256(b0, low5), 6), _mm256_and_si256(b1, low6));
    if (three) {  // Western text seldom has any
      __m256i b2 = _mm256_cvtepu8_epi16(_mm_loadu_si128(reinterpret_cast<const __m128i *>(p + 2)));
      __m256i mid = _mm256_slli_epi16(_mm256_and_si256(b1, low6), 6);
      __m256i v3 = _mm256_or_si256(_mm256_or_si256(_mm256_slli_epi16(b0, 12), mid), _mm256_and_si256(b2, low6));
      v = _mm256_blendv_epi8(v, v3, _mm256_cmpgt_epi16(b0, two));
    }
    v = _mm256_blendv_epi8(v, b0, _mm256_cmpgt_epi16(ascii, b0));
    unsigned k0 = keep & 0xFF, k1 = keep >> 8;
    storeShuffled(d + out, _mm256_castsi256_si128(v), kShuffles.units[k0]);
    out += static_cast<unsigned>(__builtin_popcount(k0));
    storeShuffled(d + out, _mm256_extracti128_si256(v, 1), kShuffles.units[k1]);
    out += static_cast<unsigned>(__builtin_popcount(k1));
    in += 16;
    carry = expect >> 16;
  }
  // Where the steps stopped, after the bytes the last character took from the next block.
  in += (carry & 1) + (carry >> 1 & 1);
  return {in, out};
}

// Bytes through a table of 256 units, 32 a step. The table is split into low and high
// bytes, 16 rows of 16; a byte's low nibble picks in every row at once, and only its own
// row (the high nibble) lets the pick through: the others get bit 7 set, which zeroes it.
template <bool Wide>
[[gnu::target("avx2")]] size_t mapRows(const uint8_t *s, VLUChar *d, size_t n, const __m256i *lo, const __m256i *hi) {
  const __m256i bias = _mm256_set1_epi8(0x70), row = _mm256_set1_epi8(0x10);
  size_t i = 0;
  for (; i + 32 <= n; i += 32) {
    __m256i x = _mm256_loadu_si256(reinterpret_cast<const __m256i *>(s + i));
    __m256i rl = _mm256_setzero_si256(), rh = _mm256_setzero_si256();
#pragma GCC unroll 16
    for (unsigned k = 0; k < 16; ++k) {
      // Row k's bytes are now below 0x10; the bias leaves them clear of bit 7 and sets it
      // on every other (those below wrapped round to the top).
      __m256i u = _mm256_adds_epu8(x, bias);
      rl = _mm256_or_si256(rl, _mm256_shuffle_epi8(lo[k], u));
      if constexpr (Wide) rh = _mm256_or_si256(rh, _mm256_shuffle_epi8(hi[k], u));
      x = _mm256_sub_epi8(x, row);
    }
    // Unpacking works within 128-bit lanes: order the quarters so the units come out in turn.
    rl = _mm256_permute4x64_epi64(rl, 0xD8);
    rh = _mm256_permute4x64_epi64(rh, 0xD8);
    _mm256_storeu_si256(reinterpret_cast<__m256i *>(d + i), _mm256_unpacklo_epi8(rl, rh));
    _mm256_storeu_si256(reinterpret_cast<__m256i *>(d + i + 16), _mm256_unpackhi_epi8(rl, rh));
  }
  return i;
}

[[gnu::target("avx2")]] size_t mapBytesAvx2(const uint8_t *s, VLUChar *d, size_t n, const uint8_t *table) {
  __m256i lo[16], hi[16];
  const __m128i low8 = _mm_set1_epi16(0xFF);
  __m128i anyHigh = _mm_setzero_si128();
  for (unsigned k = 0; k < 16; ++k) {
    __m128i a = _mm_loadu_si128(reinterpret_cast<const __m128i *>(table + 32 * k));
    __m128i b = _mm_loadu_si128(reinterpret_cast<const __m128i *>(table + 32 * k + 16));
    __m128i h = _mm_packus_epi16(_mm_srli_epi16(a, 8), _mm_srli_epi16(b, 8));
    lo[k] = _mm256_broadcastsi128_si256(_mm_packus_epi16(_mm_and_si128(a, low8), _mm_and_si128(b, low8)));
    hi[k] = _mm256_broadcastsi128_si256(h);
    anyHigh = _mm_or_si128(anyHigh, h);
  }
  // Pages whose units all lie below 0x100 (EBCDIC Latin-1) skip the high half.
  if (_mm_testz_si128(anyHigh, anyHigh)) return mapRows<false>(s, d, n, lo, hi);
  return mapRows<true>(s, d, n, lo, hi);
}

// Units at or above bound, by bit (a 16-unit block gives bits 0-7 and 16-23). Unsigned: a
// unit is at least the bound when it is the larger of the two.
[[gnu::target("avx2"), gnu::always_inline]] inline unsigned atLeast(__m256i u, short bound) {
  __m256i ge = _mm256_cmpeq_epi16(_mm256_max_epu16(u, _mm256_set1_epi16(bound)), u);
  return static_cast<unsigned>(_mm256_movemask_epi8(_mm256_packs_epi16(ge, _mm256_setzero_si256())));
}

// 16 units of which some take three bytes: each unit's bytes built in a 32-bit lane, then
// packed four units at a time. Writes up to 12 bytes past what it returns.
[[gnu::target("avx2"), gnu::always_inline]] inline unsigned utf16ToUtf8Wide(__m256i u, uint8_t *d) {
  unsigned two = atLeast(u, 0x80), three = atLeast(u, 0x800);
  two = (two & 0xFF) | (two >> 8 & 0xFF00);
  three = (three & 0xFF) | (three >> 8 & 0xFF00);
  const __m256i low6 = _mm256_set1_epi32(0x3F), tail = _mm256_set1_epi32(0x80);
  unsigned out = 0;
  for (unsigned h = 0; h < 2; ++h) {
    __m256i v = _mm256_cvtepu16_epi32(h ? _mm256_extracti128_si256(u, 1) : _mm256_castsi256_si128(u));
    __m256i t0 = _mm256_or_si256(_mm256_and_si256(v, low6), tail);
    __m256i t1 = _mm256_or_si256(_mm256_and_si256(_mm256_srli_epi32(v, 6), low6), tail);
    __m256i pair =
        _mm256_or_si256(_mm256_or_si256(_mm256_srli_epi32(v, 6), _mm256_set1_epi32(0xC0)), _mm256_slli_epi32(t0, 8));
    __m256i triple = _mm256_or_si256(_mm256_or_si256(_mm256_srli_epi32(v, 12), _mm256_set1_epi32(0xE0)),
                                     _mm256_or_si256(_mm256_slli_epi32(t1, 8), _mm256_slli_epi32(t0, 16)));
    __m256i b = _mm256_blendv_epi8(v, pair, _mm256_cmpgt_epi32(v, _mm256_set1_epi32(0x7F)));
    b = _mm256_blendv_epi8(b, triple, _mm256_cmpgt_epi32(v, _mm256_set1_epi32(0x7FF)));
    for (unsigned q = 0; q < 2; ++q) {
      unsigned at = 8 * h + 4 * q;
      unsigned m = kGroups.spread[two >> at & 15] + kGroups.spread[three >> at & 15];
      storeShuffled(d + out, q ? _mm256_extracti128_si256(b, 1) : _mm256_castsi256_si128(b), kGroups.shuffle[m]);
      out += kGroups.length[m];
    }
  }
  return out;
}

// 16 units a step: units below 0x800 as their one or two bytes side by side in their
// lanes, then the unused second bytes squeezed out; blocks with larger units go through
// 32-bit lanes. A step writes up to 12 bytes past its output, so it runs only while 16
// more units, which will cover them, remain allowed.
[[gnu::target("avx2")]] Moved utf16ToUtf8Avx2(const VLUChar *s, uint8_t *d, size_t n) {
  const __m256i ascii = _mm256_set1_epi16(static_cast<short>(0xFF80));
  const __m256i wide = _mm256_set1_epi16(static_cast<short>(0xF800));
  const __m256i x7f = _mm256_set1_epi16(0x7F), low6 = _mm256_set1_epi16(0x3F);
  const __m256i leadBits = _mm256_set1_epi16(0xC0), tailBits = _mm256_set1_epi16(static_cast<short>(0x8000));
  size_t in = 0, out = 0;
  for (; in + 32 <= n; in += 16) {
    __m256i u = _mm256_loadu_si256(reinterpret_cast<const __m256i *>(s + in));
    if (_mm256_testz_si256(u, ascii)) {
      __m128i p = _mm_packus_epi16(_mm256_castsi256_si128(u), _mm256_extracti128_si256(u, 1));
      _mm_storeu_si128(reinterpret_cast<__m128i *>(d + out), p);
      out += 16;
      continue;
    }
    if (!_mm256_testz_si256(u, wide)) {
      out += utf16ToUtf8Wide(u, d + out);
      continue;
    }
    __m256i isTwo = _mm256_cmpgt_epi16(u, x7f);
    __m256i pair = _mm256_or_si256(_mm256_or_si256(_mm256_srli_epi16(u, 6), leadBits),
                                   _mm256_or_si256(_mm256_slli_epi16(_mm256_and_si256(u, low6), 8), tailBits));
    __m256i w = _mm256_blendv_epi8(u, pair, isTwo);
    unsigned m = static_cast<unsigned>(_mm256_movemask_epi8(_mm256_packs_epi16(isTwo, _mm256_setzero_si256())));
    unsigned m0 = m & 0xFF, m1 = (m >> 16) & 0xFF;
    storeShuffled(d + out, _mm256_castsi256_si128(w), kShuffles.pairs[m0]);
    out += 8 + static_cast<unsigned>(__builtin_popcount(m0));
    storeShuffled(d + out, _mm256_extracti128_si256(w, 1), kShuffles.pairs[m1]);
    out += 8 + static_cast<unsigned>(__builtin_popcount(m1));
  }
  return {in, out};
}

#endif

}  // namespace

std::atomic<int> levelNow{g_detected};

#ifdef VL_SIMD_X86
[[gnu::target("avx2")]] static void leadMasksAvx2(const uint8_t *s, const LeadRanges &r, LeadMasks &m) {
  for (unsigned k = 0; k < 64; k += 32) {
    const __m256i x = _mm256_loadu_si256(reinterpret_cast<const __m256i *>(s + k)), z = _mm256_setzero_si256();
    __m256i two = z, three = z, longer = z;
    for (unsigned i = 0; i < r.count; ++i) {
      const __m256i t = _mm256_sub_epi8(x, _mm256_load_si256(reinterpret_cast<const __m256i *>(r.loV[i])));
      const __m256i in =
          _mm256_cmpeq_epi8(_mm256_min_epu8(t, _mm256_load_si256(reinterpret_cast<const __m256i *>(r.spanV[i]))), t);
      __m256i &to = i < r.twos ? two : i < r.twos + r.threes ? three : longer;
      to = _mm256_or_si256(to, in);
    }
    m.two |= uint64_t{static_cast<uint32_t>(_mm256_movemask_epi8(two))} << k;
    m.three |= uint64_t{static_cast<uint32_t>(_mm256_movemask_epi8(three))} << k;
    m.longer |= uint64_t{static_cast<uint32_t>(_mm256_movemask_epi8(longer))} << k;
  }
}
#endif

void capLevel(int cap) { levelNow.store(cap < 0 || cap > g_detected ? g_detected : cap, std::memory_order_relaxed); }

namespace {

template <class T, class U>
using Run = size_t (*)(const T *, U *, size_t, unsigned);

// The loops by level.
#ifdef VL_SIMD_X86
constexpr Run<uint8_t, VLUChar> kWiden[] = {widenScalar, widenSse2, widenAvx2};
constexpr Run<VLUChar, uint8_t> kNarrow[] = {narrowScalar, narrowSse2, narrowAvx2};
constexpr Run<uint8_t, uint8_t> kCopy[] = {copyScalar, copySse2, copyAvx2};
constexpr Moved (*kUtf8In[])(const uint8_t *, VLUChar *, size_t) = {utf8None, utf8ToUtf16Sse2, utf8ToUtf16Avx2};
constexpr Moved (*kUtf8Out[])(const VLUChar *, uint8_t *, size_t) = {utf16None, utf16ToUtf8Sse2, utf16ToUtf8Avx2};
constexpr size_t (*kMapBytes[])(const uint8_t *, VLUChar *, size_t, const uint8_t *) = {mapNone, mapNone, mapBytesAvx2};
#else
constexpr Run<uint8_t, VLUChar> kWiden[] = {widenScalar, widenScalar, widenScalar};
constexpr Run<VLUChar, uint8_t> kNarrow[] = {narrowScalar, narrowScalar, narrowScalar};
constexpr Run<uint8_t, uint8_t> kCopy[] = {copyScalar, copyScalar, copyScalar};
constexpr Moved (*kUtf8In[])(const uint8_t *, VLUChar *, size_t) = {utf8None, utf8None, utf8None};
constexpr Moved (*kUtf8Out[])(const VLUChar *, uint8_t *, size_t) = {utf16None, utf16None, utf16None};
constexpr size_t (*kMapBytes[])(const uint8_t *, VLUChar *, size_t, const uint8_t *) = {mapNone, mapNone, mapNone};
#endif

}  // namespace

size_t widen(const uint8_t *s, VLUChar *d, size_t n, unsigned lim) { return kWiden[level()](s, d, n, lim); }
size_t narrow(const VLUChar *s, uint8_t *d, size_t n, unsigned lim) { return kNarrow[level()](s, d, n, lim); }
size_t copy(const uint8_t *s, uint8_t *d, size_t n, unsigned lim) { return kCopy[level()](s, d, n, lim); }
Moved utf8ToUtf16(const uint8_t *s, VLUChar *d, size_t n) { return kUtf8In[level()](s, d, n); }
Moved utf16ToUtf8(const VLUChar *s, uint8_t *d, size_t n) { return kUtf8Out[level()](s, d, n); }
void unlikeSpan(const uint8_t *table, unsigned &lo, unsigned &hi) {
  lo = 0x100;
  hi = 0;
#ifdef VL_SIMD_X86
  __m128i at = _mm_setr_epi16(0, 1, 2, 3, 4, 5, 6, 7);
  for (unsigned k = 0; k < 32; ++k, at = _mm_add_epi16(at, _mm_set1_epi16(8))) {
    __m128i t = _mm_loadu_si128(reinterpret_cast<const __m128i *>(table + 16 * k));
    unsigned m = static_cast<unsigned>(_mm_movemask_epi8(_mm_cmpeq_epi16(t, at))) ^ 0xFFFF;
    if (!m) continue;
    lo = std::min(lo, 8 * k + static_cast<unsigned>(__builtin_ctz(m)) / 2);
    hi = 8 * k + (31 - static_cast<unsigned>(__builtin_clz(m))) / 2 + 1;
  }
#else
  for (unsigned b = 0; b < 0x100; ++b) {
    uint16_t u;
    std::memcpy(&u, table + 2 * b, 2);
    if (u != b) lo = std::min(lo, b), hi = b + 1;
  }
#endif
}

bool LeadRanges::build(const uint8_t *lens) {
  count = twos = threes = 0;
  for (unsigned want : {2u, 3u, 0u}) {  // 0: every other length
    for (unsigned b = 0; b < 0x100;) {
      unsigned e = b + 1;
      while (e < 0x100 && lens[e] == lens[b]) ++e;
      if (lens[b] != 1 && (want ? lens[b] == want : lens[b] != 2 && lens[b] != 3)) {
        if (count == kMax) return false;
        lo[count] = static_cast<uint8_t>(b);
        span[count] = static_cast<uint8_t>(e - b - 1);  // the last byte's distance from lo
        std::memset(loV[count], lo[count], 32);
        std::memset(spanV[count], span[count], 32);
        ++count;
      }
      b = e;
    }
    if (want == 2) twos = count;
    if (want == 3) threes = count - twos;
  }
  return true;
}

LeadMasks leadMasks(const uint8_t *s, const LeadRanges &r, const uint8_t *lens) {
  LeadMasks m{0, 0, 0};
#ifdef VL_SIMD_X86
  if (level() == kAvx2) {
    leadMasksAvx2(s, r, m);
    return m;
  }
  if (level() == kSse2) {
    for (unsigned k = 0; k < 64; k += 16) {
      const __m128i x = _mm_loadu_si128(reinterpret_cast<const __m128i *>(s + k)), z = _mm_setzero_si128();
      auto in = [&](unsigned i) {
        const __m128i t = _mm_sub_epi8(x, _mm_load_si128(reinterpret_cast<const __m128i *>(r.loV[i])));
        return _mm_cmpeq_epi8(_mm_min_epu8(t, _mm_load_si128(reinterpret_cast<const __m128i *>(r.spanV[i]))), t);
      };
      __m128i two = z, three = z, longer = z;
      unsigned i = 0;
      for (; i < r.twos; ++i) two = _mm_or_si128(two, in(i));
      for (; i < r.twos + r.threes; ++i) three = _mm_or_si128(three, in(i));
      for (; i < r.count; ++i) longer = _mm_or_si128(longer, in(i));
      m.two |= uint64_t{static_cast<uint16_t>(_mm_movemask_epi8(two))} << k;
      m.three |= uint64_t{static_cast<uint16_t>(_mm_movemask_epi8(three))} << k;
      m.longer |= uint64_t{static_cast<uint16_t>(_mm_movemask_epi8(longer))} << k;
    }
    return m;
  }
#else
  (void)r;
#endif
  // The scalar level frames no blocks; this stands for processors without a vector unit.
  for (unsigned i = 0; i < 64; ++i) {
    const unsigned n = lens[s[i]];
    m.two |= uint64_t{n == 2} << i;
    m.three |= uint64_t{n == 3} << i;
    m.longer |= uint64_t{n != 1 && n != 2 && n != 3} << i;
  }
  return m;
}

size_t mapBytes(const uint8_t *s, VLUChar *d, size_t n, const uint8_t *table) {
  return kMapBytes[level()](s, d, n, table);
}

}  // namespace vl::simd
