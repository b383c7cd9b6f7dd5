// Length of the leading run of W values in set.
#include "string/strfam.h"

VL_TRACE_MODULE("vlwcsspn");

int32_t VLWcsspn(VLLocale *locale, const VLWChar *str, int32_t len, const VLWChar *set, int32_t setLen) {
  VL_FLOW("VLWcsspn");
  using namespace vl::str;
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
  VL_RET(spanOf<true>(WForm{}, str, len, WForm{}, set, setLen, false));
}
