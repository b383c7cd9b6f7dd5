// Compares two strings of the locale's code page.
#include "string/compare.h"

VL_TRACE_MODULE("vlstrcmp");

int32_t VLStrcmp(VLLocale *locale, const char *str1, int32_t len1, const char *str2, int32_t len2,
                 uint32_t options) {
  VL_FLOW("VLStrcmp");
  using namespace vl::str;
  VLLocale *l = cmpLocale(locale, (options & kCmpRejected) != 0);
  if (!l) VL_RET(int32_t{0});
  auto map = [l](char *out, int32_t cap, const char *in, int32_t n, uint32_t, uint32_t sel) {
    return VLMapString(l, out, cap, in, n, sel);
  };
  const Bytes f = bytesOf(l);
  VL_RET(compareBytes(l, f, ub(str1), len1, f, ub(str2), len2, options, vl_trc, map));
}
