// Whole characters in a number of bytes; a character cut by the end is not counted.
#include <cstring>

#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlcpb2c");

int32_t VLCpStrByteToCharLen(const VLCodePage *cp, const unsigned char *s, VLShiftState state, int32_t bytes) {
  VL_FLOW("VLCpStrByteToCharLen");
  using namespace vl::cp;
  if (!usable(cp) || !s || bytes == 0) VL_RET(int32_t{0});
  size_t len = bytes < 0 ? std::strlen(reinterpret_cast<const char *>(s)) : static_cast<size_t>(bytes);
  size_t pos = 0;
  int32_t count = 0;
  if (!isUtf8(cp) && isShift(cp)) {
    const uint8_t so = shiftOut(cp), si = shiftIn(cp);
    const unsigned wide = maxLen(cp);
    unsigned step = state ? wide : 1u;
    while (pos < len) {
      if (s[pos] == so || s[pos] == si) {
        step = s[pos] == si ? 1u : wide;
        ++pos;
        continue;
      }
      if (step > len - pos) break;
      pos += step;
      ++count;
    }
  } else if (isUtf8(cp) || maxLen(cp) > 1) {
    while (pos < len) {
      unsigned n = lenOf(cp, s[pos]);
      if (n > len - pos) break;
      pos += n;
      ++count;
    }
  } else {
    count = static_cast<int32_t>(len);
  }
  VL_RET(count);
}
