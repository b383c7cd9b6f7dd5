// Case conversion of one character; a character whose type misses the mask is copied.
#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlcpcase");

int VLCpMbCaseConv(const VLCodePage *cp, const unsigned char *src, unsigned char *out, uint32_t mask) {
  VL_FLOW("VLCpMbCaseConv");
  if (!vl::cp::usable(cp) || !src || !out) VL_RET(0);
  VL_RET(vl::cp::caseConv(cp, src, vl::cp::lenOf(cp, src[0]), out, mask));
}
