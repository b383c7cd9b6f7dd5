// Truncation in a shift-sensitive page: the cut closes a double-byte run it ends in.
#include "string/trunc.h"

VL_TRACE_MODULE("vltrunx");

int32_t VLTruncateStringEx(VLLocale *locale, char *str, VLShiftState state, int32_t length, uint32_t options) {
  VL_FLOW("VLTruncateStringEx");
  using namespace vl::str;
  VLLocale *l = use(locale);
  if (!l) VL_RET(int32_t{0});
  if (!isShifted(l)) VL_RET(VLTruncateString(l, str, length, options));
  vl::setRc(l, VL_RC_OK);
  VL_RET(truncateEntry(l, shiftedOf(l, state), str, length, options, vl_trc));
}
