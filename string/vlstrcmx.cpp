// Compares two strings of a shift-sensitive page, each from its own state.
#include "string/compare.h"

VL_TRACE_MODULE("vlstrcmx");

int32_t VLStrcmpEx(VLLocale *locale, const char *str1, VLShiftState state1, int32_t len1, const char *str2,
                   VLShiftState state2, int32_t len2, uint32_t options) {
  VL_FLOW("VLStrcmpEx");
  using namespace vl::str;
  VLLocale *l = use(locale);
  if (!l) VL_RET(int32_t{0});
  if (!isShifted(l)) VL_RET(VLStrcmp(l, str1, len1, str2, len2, options));
  VL_TRACE(TRC1_DETAIL, "Options = %08x", options);
  if (!cmpLocale(l, (options & kCmpRejected) != 0)) VL_RET(int32_t{0});
  auto map = [l](char *out, int32_t cap, const char *in, int32_t n, uint32_t state, uint32_t sel) {
    return VLMapStringEx(l, out, cap, in, state, n, sel);
  };
  VL_RET(compareBytes(l, shiftedOf(l, state1), ub(str1), len1, shiftedOf(l, state2), ub(str2), len2, options,
                      vl_trc, map));
}
