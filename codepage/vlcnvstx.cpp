// A byte string of one locale's code page to another's, from given shift states.
#include "codepage/convert.h"

VL_TRACE_MODULE("vlcnvstx");

int32_t VLConvertStringEx(VLLocale *target, char *out, VLShiftState targetState, int32_t outSize,
                          VLLocale *source, const char *in, VLShiftState sourceState, int32_t inLength,
                          uint32_t options) {
  VL_FLOW("VLConvertStringEx");
  int32_t n = vl::cnv::convertString(target, out, targetState, outSize, source, in, sourceState, inLength,
                                     options, true);
  if (n < 0) VL_ERR("VLConvertStringEx: rejected options 0x%x or arguments", options);
  VL_RET(n);
}
