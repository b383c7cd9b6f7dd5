// A byte string to W values, one for each character.
#include "codepage/convert.h"

VL_TRACE_MODULE("vlmb2wc");

int32_t VLMbToWide(VLLocale *locale, VLWChar *out, int32_t outCount, const char *in, int32_t inLength,
                   uint32_t options) {
  VL_FLOW("VLMbToWide");
  VL_RET(vl::cnv::mbToWide(locale, out, outCount, in, 0, inLength, options, false));
}
