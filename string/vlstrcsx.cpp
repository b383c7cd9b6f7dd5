// Length of the leading run of characters not in set, in a shift-sensitive page: each
// string keeps its own state, changed by the shift bytes it holds.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrcsx");

int32_t VLStrcspnEx(VLLocale *locale, const char *str, VLShiftState strState, int32_t len, const char *set,
           VLShiftState setState, int32_t setLen, uint32_t options) {
  VL_FLOW("VLStrcspnEx");
  using namespace vl::str;
  VLLocale *l = use(locale);
  if (!l) VL_RET(int32_t{0});
  if (!isShifted(l)) VL_RET(VLStrcspn(l, str, len, set, setLen, options));
  VL_RET(spanEntry<false>(l, shiftedOf(l, strState), str, len, shiftedOf(l, setState), set, setLen, options));
}
