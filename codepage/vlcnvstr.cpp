// A byte string of one locale's code page to another's.
#include "codepage/convert.h"

VL_TRACE_MODULE("vlcnvstr");

int32_t VLConvertString(VLLocale *target, char *out, int32_t outSize, VLLocale *source, const char *in,
                        int32_t inLength, uint32_t options) {
  VL_FLOW("VLConvertString");
  int32_t n = vl::cnv::convertString(target, out, 0, outSize, source, in, 0, inLength, options, false);
  if (n < 0) VL_ERR("VLConvertString: rejected options 0x%x or arguments", options);
  VL_RET(n);
}
