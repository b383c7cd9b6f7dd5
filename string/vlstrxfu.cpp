// Sort key of a UTF-16 string.
#include "string/collfam.h"

VL_TRACE_MODULE("vlstrxfu");

int32_t VLStrxfrmU(VLLocale *locale, char *dst, int32_t dstLen, const VLUChar *src, int32_t srcLen, uint32_t options) {
  VL_FLOW("VLStrxfrmU");
  using namespace vl::coll;
  VLLocale *l = use(locale);
  if (!l) VL_RET(int32_t{-1});
  VL_RET(xfrm(l, UForm{}, ub(dst), dstLen, src, srcLen, options));
}
