// A byte string to W values from a given shift state; shift bytes give no value.
#include "codepage/convert.h"

VL_TRACE_MODULE("vlmb2wcx");

int32_t VLMbToWideEx(VLLocale *locale, VLWChar *out, int32_t outCount, const char *in, VLShiftState state,
                     int32_t inLength, uint32_t options) {
  VL_FLOW("VLMbToWideEx");
  VL_RET(vl::cnv::mbToWide(locale, out, outCount, in, state, inLength, options, true));
}
