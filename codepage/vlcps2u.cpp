// A byte string to UTF-16 units (no terminator written).
#include <cstring>

#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlcps2u");

namespace {

using namespace vl::cp;

// Shift bytes switch the state and are skipped; in the double-byte state every character
// has the maximum length. A character cut by the end of the input is left unconverted.
int32_t shifted(const VLCodePage *c, const uint8_t *s, size_t rem, VLUChar *out) {
  const uint8_t so = shiftOut(c), si = shiftIn(c);
  const unsigned wide = maxLen(c);
  unsigned step = 1;
  int32_t n = 0;
  while (rem >= 1 && *s) {
    if (*s == si || *s == so) {
      step = *s == si ? 1u : wide;
      ++s;
      --rem;
      continue;
    }
    if (step > rem) break;
    out[n++] = step == 1 ? sbcsUni(c, *s) : trieToUni(c, s, step);
    s += step;
    rem -= step;
  }
  return n;
}

int32_t utf8(const uint8_t *s, size_t rem, VLUChar *out) {
  int32_t n = 0;
  while (rem >= 1 && *s) {
    unsigned len = utf8Len(*s);
    if (len > rem) break;
    out[n++] = utf8ToUni(s);
    s += len;
    rem -= len;
  }
  return n;
}

int32_t plain(const VLCodePage *c, const uint8_t *s, size_t rem, VLUChar *out) {
  if (maxLen(c) == 1) {  // every character is one byte: the table alone
    const uint8_t *uni = body(c) + kSbcsUni;
    size_t i = 0;
    for (; i < rem && s[i]; ++i) out[i] = vl::rd16(uni + 2u * s[i]);
    return static_cast<int32_t>(i);
  }
  int32_t n = 0;
  while (rem >= 1 && *s) {
    unsigned len = charLen(c, *s);
    if (len > rem) break;
    out[n++] = len == 1 ? sbcsUni(c, *s) : trieToUni(c, s, len);
    s += len;
    rem -= len;
  }
  return n;
}

}  // namespace

int32_t VLCpStrToUnicode(const VLCodePage *cp, const unsigned char *s, int32_t length, VLUChar *out) {
  VL_FLOW("VLCpStrToUnicode");
  if (!usable(cp) || !s || !out) VL_RET(int32_t{-1});
  size_t rem = static_cast<size_t>(length);
  if (length < 0) {
    rem = std::strlen(reinterpret_cast<const char *>(s));
    if (rem < 1) VL_RET(int32_t{-1});
  }
  if (isUtf8(cp)) VL_RET(utf8(s, rem, out));
  if (isShift(cp)) VL_RET(shifted(cp, s, rem, out));
  VL_RET(plain(cp, s, rem, out));
}
