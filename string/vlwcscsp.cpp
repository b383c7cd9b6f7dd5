// Length of the leading run of W values not in set.
#include "string/strfam.h"

VL_TRACE_MODULE("vlwcscsp");

int32_t VLWcscspn(VLLocale *locale, const VLWChar *str, int32_t len, const VLWChar *set, int32_t setLen) {
  VL_FLOW("VLWcscspn");
  using namespace vl::str;
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
  VL_RET(spanOf<false>(WForm{}, str, len, WForm{}, set, setLen, false));
}
