// A character packed into a W value, its length taken from its lead byte.
#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlmbtow");

VLWChar VLMbToW(const VLCodePage *cp, const unsigned char *p) {
  VL_FLOW("VLMbToW");
  if (!vl::cp::usable(cp) || !p) VL_RET(VLWChar{0});
  VL_RET(vl::cp::readW(p, vl::cp::lenOf(cp, p[0])));
}
