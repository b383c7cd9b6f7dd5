// One multi-byte character to UTF-16.
#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlcpm2u");

VLUChar VLCpMbToUnicode(const VLCodePage *cp, const unsigned char *p) {
  VL_FLOW("VLCpMbToUnicode");
  if (!vl::cp::usable(cp) || !p) VL_RET(vl::cp::kReplacement);
  VL_RET(vl::cp::mbToUni(cp, p, vl::cp::multiLen(cp, p[0])));
}
