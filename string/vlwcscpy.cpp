// Copies W values.
#include "string/strfam.h"

VL_TRACE_MODULE("vlwcscpy");

int32_t VLWcscpy(VLLocale *locale, VLWChar *dst, int32_t dstLen, const VLWChar *src, int32_t srcLen) {
  VL_FLOW("VLWcscpy");
  using namespace vl::str;
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
  VL_RET(copy(WForm{}, dst, 0, dstLen, src, srcLen, false));
}
