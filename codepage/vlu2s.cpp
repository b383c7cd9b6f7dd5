// UTF-16 to a byte string.
#include "codepage/convert.h"

VL_TRACE_MODULE("vlu2s");

int32_t VLUnicodeToString(VLLocale *locale, char *out, int32_t outSize, const VLUChar *in, int32_t inLength,
                          uint32_t options) {
  VL_FLOW("VLUnicodeToString");
  int32_t n = vl::cnv::unicodeToString(locale, out, 0, outSize, in, inLength, options, false);
  if (n < 0) VL_ERR("VLUnicodeToString: rejected options 0x%x or arguments", options);
  VL_RET(n);
}
