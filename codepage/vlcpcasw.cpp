// Case conversion of a W value.
#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlcpcasw");

VLWChar VLCpMbCaseConvW(const VLCodePage *cp, VLWChar value, uint32_t mask) {
  VL_FLOW("VLCpMbCaseConvW");
  if (!vl::cp::usable(cp)) VL_RET(value);
  VL_RET(vl::cp::caseConvW(cp, value, mask));
}
