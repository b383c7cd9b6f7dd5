// Finds a character in a shift-sensitive page and reports the state at the match; a
// shift byte in front of chr gives chr's state.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrchx");

char *VLStrchrEx(VLLocale *locale, const char *str, VLShiftState strState, int32_t len, const char *chr,
                 VLShiftState chrState, VLShiftState *foundState, uint32_t options) {
  VL_FLOW("VLStrchrEx");
  using namespace vl::str;
  VLLocale *l = use(locale);
  if (!l) VL_RET(static_cast<char *>(nullptr));
  if (!isShifted(l)) VL_RET(VLStrchr(l, str, len, chr, options));
  Shifted f = shiftedOf(l, strState);
  if ((options & VL_OPT_CHARLEN) && len > 0 && str) len = static_cast<int32_t>(unitsOf(f, ub(str), static_cast<uint32_t>(len)));
  options &= ~VL_OPT_CHARLEN;
  if (options != 0 && options != kLast) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(static_cast<char *>(nullptr));
  }
  vl::setRc(l, VL_RC_OK);
  if (!str || !chr || len == 0) VL_RET(static_cast<char *>(nullptr));
  Shifted cf = shiftedOf(l, chrState);
  const unsigned char *c = ub(chr);
  if (cf.isShift(*c)) cf.shift(*c++);
  uint32_t n = resolveLen(ub(str), len, 1);
  VL_RET(cb(find(f, ub(str), n, c, cf.len(c), options == kLast, foundState)));
}
