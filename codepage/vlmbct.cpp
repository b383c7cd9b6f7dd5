// Type record of a multi-byte character.
#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlmbct");

const VLCtypeRecord *VLGetMbCtype(const VLCodePage *cp, const unsigned char *p) {
  VL_FLOW("VLGetMbCtype");
  if (!vl::cp::usable(cp) || !p) VL_RET(&vl::cp::kUnassigned);
  VL_RET(vl::cp::ctypeOf(cp, p, vl::cp::multiLen(cp, p[0])));
}
