// Length of the leading run of characters in set, in a shift-sensitive page: each
// string keeps its own state, changed by the shift bytes it holds.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrspx");

int32_t VLStrspnEx(VLLocale *locale, const char *str, VLShiftState strState, int32_t len, const char *set,
           VLShiftState setState, int32_t setLen, uint32_t options) {
  VL_FLOW("VLStrspnEx");
  using namespace vl::str;
  VLLocale *l = use(locale);
  if (!l) VL_RET(int32_t{0});
  if (!isShifted(l)) VL_RET(VLStrspn(l, str, len, set, setLen, options));
  VL_RET(spanEntry<true>(l, shiftedOf(l, strState), str, len, shiftedOf(l, setState), set, setLen, options));
}
