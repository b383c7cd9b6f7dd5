// W values to a byte string.
#include "codepage/convert.h"

VL_TRACE_MODULE("vlwc2mb");

int32_t VLWideToMb(VLLocale *locale, char *out, int32_t outSize, const VLWChar *in, int32_t inCount,
                   uint32_t options) {
  VL_FLOW("VLWideToMb");
  int32_t n = vl::cnv::wideToMb(locale, out, 0, outSize, in, inCount, options, false);
  if (n < 0) VL_ERR("VLWideToMb: rejected options 0x%x or arguments", options);
  VL_RET(n);
}
