// A byte string to UTF-16.
#include "codepage/convert.h"

VL_TRACE_MODULE("vls2u");

int32_t VLStringToUnicode(VLUChar *out, int32_t outCount, VLLocale *locale, const char *in, int32_t inLength,
                          uint32_t options) {
  VL_FLOW("VLStringToUnicode");
  int32_t n = vl::cnv::stringToUnicode(out, outCount, locale, in, 0, inLength, options, false);
  if (n < 0) VL_ERR("VLStringToUnicode: rejected options 0x%x or arguments", options);
  VL_RET(n);
}
