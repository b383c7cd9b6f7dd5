// Case conversion of one character in the double-byte state of a shift-sensitive page.
#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlcpcass");

int VLCpMbCaseConvS(const VLCodePage *cp, const unsigned char *src, unsigned char *out, uint32_t mask) {
  VL_FLOW("VLCpMbCaseConvS");
  if (!vl::cp::usable(cp) || !src || !out) VL_RET(0);
  VL_RET(vl::cp::caseConv(cp, src, vl::cp::maxLen(cp), out, mask));
}
