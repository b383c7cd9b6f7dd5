// Full-width form of a half-width W value, 0 when it has none.
#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlcph2f");

VLWChar VLCpMbHalfToFullW(const VLCodePage *cp, VLWChar value) {
  VL_FLOW("VLCpMbHalfToFullW");
  if (!vl::cp::usable(cp)) VL_RET(VLWChar{0});
  VL_RET(vl::cp::halfToFull(cp, value));
}
