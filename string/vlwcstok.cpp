// Splits off the next token of W values; the delimiter after it becomes a 0 unit.
#include "string/strfam.h"

VL_TRACE_MODULE("vlwcstok");

VLWChar *VLWcstok(VLLocale *locale, VLWChar *str, int32_t *len, const VLWChar *delims, int32_t delimLen, VLWChar **next) {
  VL_FLOW("VLWcstok");
  using namespace vl::str;
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
  VL_RET(tokenize(WForm{}, WForm{}, str, len, delims, delimLen, next, false, nullptr, nullptr));
}
