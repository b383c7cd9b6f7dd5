// Linguistic comparison of two shift-sensitive strings.
#include "string/collfam.h"

VL_TRACE_MODULE("vlstrcox");

int VLStrcollEx(VLLocale *locale, const char *str1, VLShiftState state1, int32_t len1, const char *str2,
                VLShiftState state2, int32_t len2, uint32_t options) {
  VL_FLOW("VLStrcollEx");
  using namespace vl::coll;
  VLLocale *l = use(locale);
  if (!l) VL_RET(0);
  if (!isShifted(l)) VL_RET(VLStrcoll(locale, str1, len1, str2, len2, options));
  VL_RET(coll(l, shiftedOf(l, state1), ub(str1), len1, shiftedOf(l, state2), ub(str2), len2, options));
}
