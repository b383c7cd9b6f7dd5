// First occurrence of a substring in a shift-sensitive string.
#include "string/strsfam.h"

VL_TRACE_MODULE("vlstrstx");

char *VLStrstrEx(VLLocale *locale, const char *str, VLShiftState strState, int32_t len, const char *sub,
                 VLShiftState subState, int32_t subLen, uint32_t options) {
  VL_FLOW("VLStrstrEx");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l) VL_RET(static_cast<char *>(nullptr));
  if (!isShifted(l)) VL_RET(VLStrstr(locale, str, len, sub, subLen, options));
  VL_RET(cb(vl::strs::find(l, shiftedOf(l, strState), ub(str), len, shiftedOf(l, subState), ub(sub), subLen,
                           options)));
}
