// Converts a NUL-terminated text between two code pages through UTF-16.
#include "locale/locale.h"

int32_t VLLocaleCnvText(const VLCodePage *from, const VLCodePage *to, const char *text, char *out) {
  namespace cp = vl::cp;
  if (!from || !to || !text || !out) return 0;
  const auto *s = reinterpret_cast<const unsigned char *>(text);
  auto *o = reinterpret_cast<unsigned char *>(out);
  bool srcShift = cp::isShift(from), dstShift = cp::isShift(to);
  bool srcDbcs = false, dstDbcs = false;
  size_t i = 0, w = 0;
  unsigned char buf[4];
  while (s[i]) {
    if (srcShift && (s[i] == cp::shiftOut(from) || s[i] == cp::shiftIn(from))) {
      srcDbcs = s[i] == cp::shiftOut(from);
      ++i;
      continue;
    }
    size_t n = srcShift ? (srcDbcs ? cp::maxLen(from) : 1) : cp::charLen(from, s[i]);
    // A character cut by the terminator ends the text.
    for (size_t k = 1; k < n; ++k)
      if (!s[i + k]) n = 0;
    if (!n) break;
    VLUChar u = n == 1 ? cp::sbcsUni(from, s[i]) : VLCpMbToUnicode(from, s + i);
    i += n;
    int k = VLCpUnicodeToChar(to, u, buf);
    if (dstShift) {
      if (k > 1 && !dstDbcs) {
        o[w++] = cp::shiftOut(to);
        dstDbcs = true;
      } else if (k == 1 && dstDbcs) {
        o[w++] = cp::shiftIn(to);
        dstDbcs = false;
      }
    }
    for (int j = 0; j < k; ++j) o[w++] = buf[j];
  }
  if (dstDbcs) o[w++] = cp::shiftIn(to);
  o[w++] = 0;
  return static_cast<int32_t>(w);
}
