// Sort key of a plain string.
#include "string/collfam.h"

VL_TRACE_MODULE("vlstrxfr");

int32_t VLStrxfrm(VLLocale *locale, char *dst, int32_t dstLen, const char *src, int32_t srcLen, uint32_t options) {
  VL_FLOW("VLStrxfrm");
  using namespace vl::coll;
  VLLocale *l = use(locale);
  if (!l) VL_RET(int32_t{-1});
  VL_RET(xfrm(l, bytesOf(l), ub(dst), dstLen, ub(src), srcLen, options));
}
