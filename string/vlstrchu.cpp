// Finds a unit among UTF-16 units; the last occurrence is sought before the terminator.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrchu");

VLUChar *VLStrchrU(VLLocale *locale, const VLUChar *str, int32_t len, VLUChar chr, uint32_t options) {
  VL_FLOW("VLStrchrU");
  using namespace vl::str;
  VLLocale *l = vl::orDefault(locale);
  options &= ~VL_OPT_CHARLEN;  // a unit is a character
  if (options != 0 && options != kLast) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(static_cast<VLUChar *>(nullptr));
  }
  vl::setRc(l, VL_RC_OK);
  if (!str || len == 0) VL_RET(static_cast<VLUChar *>(nullptr));
  const bool last = options == kLast;
  uint32_t n = resolveLen(str, len, last ? 0 : 1);
  VL_RET(mut(find(UForm{}, str, n, &chr, 1, last, nullptr)));
}
