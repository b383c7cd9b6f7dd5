// A byte string to UTF-16 from a given shift state.
#include "codepage/convert.h"

VL_TRACE_MODULE("vls2ux");

int32_t VLStringToUnicodeEx(VLUChar *out, int32_t outCount, VLLocale *locale, const char *in, VLShiftState state,
                            int32_t inLength, uint32_t options) {
  VL_FLOW("VLStringToUnicodeEx");
  int32_t n = vl::cnv::stringToUnicode(out, outCount, locale, in, state, inLength, options, true);
  if (n < 0) VL_ERR("VLStringToUnicodeEx: rejected options 0x%x or arguments", options);
  VL_RET(n);
}
