// Bytes taken by a number of characters. The caller guarantees the characters exist, so
// no terminator is looked for.
#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlcpc2b");

int32_t VLCpStrCharToByteLen(const VLCodePage *cp, const unsigned char *s, VLShiftState state, int32_t chars) {
  VL_FLOW("VLCpStrCharToByteLen");
  using namespace vl::cp;
  if (!usable(cp) || !s || chars <= 0) VL_RET(int32_t{0});
  size_t pos = 0;
  if (!isUtf8(cp) && isShift(cp)) {
    const uint8_t so = shiftOut(cp), si = shiftIn(cp);
    const unsigned wide = maxLen(cp);
    bool dbl = state != 0;
    auto shiftByte = [&] {
      if (s[pos] == so) {
        ++pos;
        dbl = true;
      } else if (s[pos] == si) {
        ++pos;
        dbl = false;
      }
    };
    for (int32_t k = 0; k < chars; ++k) {
      shiftByte();
      pos += dbl ? wide : 1u;
      shiftByte();
    }
  } else {
    for (int32_t k = 0; k < chars; ++k) pos += lenOf(cp, s[pos]);
  }
  VL_RET(static_cast<int32_t>(pos));
}
