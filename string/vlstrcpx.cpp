// Copies whole characters in a shift-sensitive page, putting the shift byte the two
// states call for at the seam and never ending on a dangling one.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrcpx");

int32_t VLStrcpyEx(VLLocale *locale, char *dst, VLShiftState dstState, int32_t dstLen, const char *src,
                   VLShiftState srcState, int32_t srcLen, uint32_t options) {
  VL_FLOW("VLStrcpyEx");
  using namespace vl::str;
  if (options & ~VL_OPT_CHARLEN) {
    vl::setRc(locale, VL_RC_BADARG);
    VL_RET(int32_t{-1});
  }
  VLLocale *l = use(locale);
  if (!l) VL_RET(int32_t{0});
  if (!isShifted(l)) VL_RET(VLStrcpy(l, dst, dstLen, src, srcLen, options));
  vl::setRc(l, VL_RC_OK);
  VL_RET(copy(shiftedOf(l, srcState), ub(dst), dstState ? 1u : 0u, dstLen, ub(src), srcLen, options != 0));
}
