// Cuts a byte length back to a character boundary, shift bytes included.
#include "string/compare.h"

int32_t AdjustLength(VLLocale *locale, const char *str, VLShiftState state, int32_t len) {
  using namespace vl::str;
  VLLocale *l = use(locale);
  if (!l || !str || len <= 0) return len;
  vl::setRc(l, VL_RC_OK);
  if (isShifted(l)) return static_cast<int32_t>(byteLength(shiftedOf(l, state), ub(str), len, false));
  return static_cast<int32_t>(byteLength(bytesOf(l), ub(str), len, false));
}
