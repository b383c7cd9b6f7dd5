// The vector loops of simd.h and their dispatch.
#include "codepage/simd.h"

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

#endif

}  // namespace

std::atomic<int> levelNow{g_detected};

void capLevel(int cap) { levelNow.store(cap < 0 || cap > g_detected ? g_detected : cap, std::memory_order_relaxed); }

namespace {

template <class T, class U>
using Run = size_t (*)(const T *, U *, size_t, unsigned);

// The loops by level.
#ifdef VL_SIMD_X86
constexpr Run<uint8_t, VLUChar> kWiden[] = {widenScalar, widenSse2, widenAvx2};
constexpr Run<VLUChar, uint8_t> kNarrow[] = {narrowScalar, narrowSse2, narrowAvx2};
constexpr Run<uint8_t, uint8_t> kCopy[] = {copyScalar, copySse2, copyAvx2};
#else
constexpr Run<uint8_t, VLUChar> kWiden[] = {widenScalar, widenScalar, widenScalar};
constexpr Run<VLUChar, uint8_t> kNarrow[] = {narrowScalar, narrowScalar, narrowScalar};
constexpr Run<uint8_t, uint8_t> kCopy[] = {copyScalar, copyScalar, copyScalar};
#endif

}  // namespace

size_t widen(const uint8_t *s, VLUChar *d, size_t n, unsigned lim) { return kWiden[level()](s, d, n, lim); }
size_t narrow(const VLUChar *s, uint8_t *d, size_t n, unsigned lim) { return kNarrow[level()](s, d, n, lim); }
size_t copy(const uint8_t *s, uint8_t *d, size_t n, unsigned lim) { return kCopy[level()](s, d, n, lim); }

}  // namespace vl::simd
