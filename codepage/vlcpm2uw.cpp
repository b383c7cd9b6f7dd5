// One character given as a W value to UTF-16.
#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlcpm2uw");

VLUChar VLCpMbToUnicodeW(const VLCodePage *cp, VLWChar value) {
  VL_FLOW("VLCpMbToUnicodeW");
  if (!vl::cp::usable(cp)) VL_RET(vl::cp::kReplacement);
  VL_RET(vl::cp::wToUni(cp, value));
}
