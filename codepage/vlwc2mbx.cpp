// W values to a byte string from a given shift state, shift bytes inserted.
#include "codepage/convert.h"

VL_TRACE_MODULE("vlwc2mbx");

int32_t VLWideToMbEx(VLLocale *locale, char *out, VLShiftState state, int32_t outSize, const VLWChar *in,
                     int32_t inCount, uint32_t options) {
  VL_FLOW("VLWideToMbEx");
  int32_t n = vl::cnv::wideToMb(locale, out, state, outSize, in, inCount, options, true);
  if (n < 0) VL_ERR("VLWideToMbEx: rejected options 0x%x or arguments", options);
  VL_RET(n);
}
