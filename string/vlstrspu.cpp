// Length of the leading run of UTF-16 units in set.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrspu");

int32_t VLStrspnU(VLLocale *locale, const VLUChar *str, int32_t len, const VLUChar *set, int32_t setLen) {
  VL_FLOW("VLStrspnU");
  using namespace vl::str;
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
  VL_RET(spanOf<true>(UForm{}, str, len, UForm{}, set, setLen, false));
}
