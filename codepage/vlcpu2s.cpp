// UTF-16 units to a byte string. A shift-sensitive page gets Shift-Out/Shift-In around
// its double-byte runs and no terminator; any other page gets a terminating 0.
#include "codepage/convert.h"

#if defined(__x86_64__) && defined(__SSE2__)
#include <emmintrin.h>
#endif

VL_TRACE_MODULE("vlcpu2s");

namespace {

using namespace vl::cp;

size_t unitCount(const VLUChar *u) {
  size_t n = 0;
  while (u[n]) ++n;
  return n;
}

// Units before the first 0, at most count, 16 at a time where the processor has vectors:
// unit by unit the test would cost as much as the conversion of a Latin-1 run.
size_t untilZero(const VLUChar *u, size_t count) {
  size_t n = 0;
#if defined(__x86_64__) && defined(__SSE2__)
  const __m128i z = _mm_setzero_si128();
  for (; n + 16 <= count; n += 16) {
    __m128i a = _mm_cmpeq_epi16(_mm_loadu_si128(reinterpret_cast<const __m128i *>(u + n)), z);
    __m128i b = _mm_cmpeq_epi16(_mm_loadu_si128(reinterpret_cast<const __m128i *>(u + n + 8)), z);
    if (_mm_movemask_epi8(_mm_or_si128(a, b))) break;
  }
#endif
  while (n < count && u[n]) ++n;
  return n;
}

// One function per writer, as the family has it: inlined into one body the three loops
// measured a fifth slower.
template <class W>
[[gnu::noinline]] size_t run(W &w, const VLUChar *u, size_t n) {
  vl::cnv::U16Reader r(u, n);
  size_t chars = 0;
  vl::cnv::Value held = 0;
  vl::cnv::pump(r, w, chars, vl::cnv::kNoLimit, held);
  return static_cast<size_t>(w.o - w.start);
}

int32_t shifted(const VLCodePage *c, const VLUChar *u, size_t count, bool wide, uint8_t *out) {
  const uint8_t so = shiftOut(c), si = shiftIn(c);
  size_t pos = 0;
  for (size_t i = 0; i < count; ++i) {
    uint8_t b[4];
    int n = uniToMb(c, u[i], b);
    if (n == 1 && wide) {
      out[pos++] = si;
      wide = false;
    } else if (n > 1 && !wide) {
      out[pos++] = so;
      wide = true;
    }
    for (int k = 0; k < n; ++k) out[pos++] = b[k];
  }
  // Every unit writes at least one byte behind its Shift-Out, so a Shift-Out is never
  // left last to be dropped: ending in the double-byte state always closes with Shift-In.
  // (A trail byte that merely equals the Shift-Out byte is data, not a shift.)
  if (wide) out[pos++] = si;
  return static_cast<int32_t>(pos);
}

}  // namespace

int32_t VLCpUnicodeToStr(const VLCodePage *cp, const VLUChar *u, int32_t length, VLShiftState state,
                         unsigned char *out) {
  VL_FLOW("VLCpUnicodeToStr");
  if (!usable(cp) || !u || !out) VL_RET(int32_t{0});
  size_t count = length < 0 ? unitCount(u) : static_cast<size_t>(length);
  if (!isUtf8(cp) && isShift(cp)) VL_RET(shifted(cp, u, count, state != 0, out));
  // The family's writers: output room is the caller's promise, so it is given as the most
  // the units can take.
  size_t n = untilZero(u, count);
  size_t pos = vl::cnv::withByteWriter(cp, false, out, n * 4, 0, [&](auto &w) { return run(w, u, n); });
  out[pos] = 0;
  VL_RET(static_cast<int32_t>(pos));
}
