// Appends in a shift-sensitive page: a double-byte run closed at the end of dst is
// reopened, the states are joined with one shift byte, and the result is closed again
// when a terminator is written.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrcax");

int32_t VLStrcatEx(VLLocale *locale, char *dst, VLShiftState dstState, const char *src, VLShiftState srcState,
                   int32_t srcLen, uint32_t options) {
  VL_FLOW("VLStrcatEx");
  using namespace vl::str;
  VLLocale *l = use(locale);
  if (options & ~(VL_OPT_CHARLEN | VL_OPT_NULLTERM)) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(int32_t{-1});
  }
  if (!l) VL_RET(int32_t{0});
  if (!isShifted(l)) VL_RET(VLStrcat(l, dst, src, srcLen, options));
  vl::setRc(l, VL_RC_OK);
  VL_RET(cat(shiftedOf(l, srcState), shiftedOf(l, dstState), ub(dst), ub(src), srcLen, options));
}
