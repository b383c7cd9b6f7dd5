// UTF-16 to a byte string from a given shift state, shift bytes inserted.
#include "codepage/convert.h"

VL_TRACE_MODULE("vlu2sx");

int32_t VLUnicodeToStringEx(VLLocale *locale, char *out, VLShiftState state, int32_t outSize, const VLUChar *in,
                            int32_t inLength, uint32_t options) {
  VL_FLOW("VLUnicodeToStringEx");
  int32_t n = vl::cnv::unicodeToString(locale, out, state, outSize, in, inLength, options, true);
  if (n < 0) VL_ERR("VLUnicodeToStringEx: rejected options 0x%x or arguments", options);
  VL_RET(n);
}
