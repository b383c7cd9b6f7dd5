// A character of a shift-sensitive page packed into a W value: in the double-byte state
// every character has the maximum length, in the single-byte state one byte.
#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlmbtows");

VLWChar VLMbToWS(const VLCodePage *cp, const unsigned char *p, int shifted) {
  VL_FLOW("VLMbToWS");
  if (!vl::cp::usable(cp) || !p) VL_RET(VLWChar{0});
  VL_RET(vl::cp::readW(p, shifted ? vl::cp::maxLen(cp) : 1u));
}
