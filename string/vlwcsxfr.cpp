// Sort key of a W string.
#include "string/collfam.h"

VL_TRACE_MODULE("vlwcsxfr");

int32_t VLWcsxfrm(VLLocale *locale, char *dst, int32_t dstLen, const VLWChar *src, int32_t srcLen, uint32_t options) {
  VL_FLOW("VLWcsxfrm");
  using namespace vl::coll;
  VLLocale *l = use(locale);
  if (!l) VL_RET(int32_t{-1});
  VL_RET(xfrm(l, WForm{}, ub(dst), dstLen, src, srcLen, options));
}
