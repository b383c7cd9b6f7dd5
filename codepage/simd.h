// Runs of plain characters (values that are the same on both sides of a conversion)
// copied many at a time: bytes widened to UTF-16 units, units narrowed to bytes, bytes
// copied. Each call copies the leading run of plain values, at most n, writes nothing
// past it, and returns its length; the caller converts the character that ended it.
//
// SSE2 is the x86-64 baseline; AVX2 is taken when the processor has it; elsewhere a
// scalar loop. All three give the same output.
#pragma once
#include <cstddef>
#include <cstdint>

#include "veltrin.h"

namespace vl::simd {

enum Level : int { kScalar = 0, kSse2 = 1, kAvx2 = 2 };

// The level in use: the best the processor has, unless capped by capLevel.
int level();
// Caps the level for tests that hold the vector paths against the scalar one; a negative
// value restores the detected level. Not for use while conversions run on other threads.
void capLevel(int cap);

// lim is 0x80 (ASCII runs) or 0x100 (every value below 0x100 is plain).
size_t widen(const uint8_t *s, VLUChar *d, size_t n, unsigned lim);
size_t narrow(const VLUChar *s, uint8_t *d, size_t n, unsigned lim);
size_t copy(const uint8_t *s, uint8_t *d, size_t n, unsigned lim);

}  // namespace vl::simd
