// Half-width form of a full-width W value, 0 when it has none.
#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlcpf2h");

VLWChar VLCpFullToHalfW(const VLCodePage *cp, VLWChar value) {
  VL_FLOW("VLCpFullToHalfW");
  if (!vl::cp::usable(cp)) VL_RET(VLWChar{0});
  VL_RET(vl::cp::fullToHalf(cp, value));
}
