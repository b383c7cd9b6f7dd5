// Copies UTF-16 units.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrcpu");

int32_t VLStrcpyU(VLLocale *locale, VLUChar *dst, int32_t dstLen, const VLUChar *src, int32_t srcLen) {
  VL_FLOW("VLStrcpyU");
  using namespace vl::str;
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
  VL_RET(copy(UForm{}, dst, 0, dstLen, src, srcLen, false));
}
