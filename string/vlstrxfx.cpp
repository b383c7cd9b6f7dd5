// Sort key of a shift-sensitive string.
#include "string/collfam.h"

VL_TRACE_MODULE("vlstrxfx");

int32_t VLStrxfrmEx(VLLocale *locale, char *dst, int32_t dstLen, const char *src, VLShiftState srcState,
                    int32_t srcLen, uint32_t options) {
  VL_FLOW("VLStrxfrmEx");
  using namespace vl::coll;
  VLLocale *l = use(locale);
  if (!l) VL_RET(int32_t{-1});
  if (!isShifted(l)) VL_RET(VLStrxfrm(locale, dst, dstLen, src, srcLen, options));
  VL_RET(xfrm(l, shiftedOf(l, srcState), ub(dst), dstLen, ub(src), srcLen, options));
}
