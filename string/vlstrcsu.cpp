// Length of the leading run of UTF-16 units not in set.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrcsu");

int32_t VLStrcspnU(VLLocale *locale, const VLUChar *str, int32_t len, const VLUChar *set, int32_t setLen) {
  VL_FLOW("VLStrcspnU");
  using namespace vl::str;
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
  VL_RET(spanOf<false>(UForm{}, str, len, UForm{}, set, setLen, false));
}
