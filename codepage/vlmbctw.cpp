// Type record of a character given as a W value.
#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlmbctw");

const VLCtypeRecord *VLGetMbCtypeW(const VLCodePage *cp, VLWChar value) {
  VL_FLOW("VLGetMbCtypeW");
  if (!vl::cp::usable(cp)) VL_RET(&vl::cp::kUnassigned);
  VL_RET(vl::cp::ctypeOfW(cp, value));
}
