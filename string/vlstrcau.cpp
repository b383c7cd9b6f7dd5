// Appends UTF-16 units to a 0-ended UTF-16 string.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrcau");

int32_t VLStrcatU(VLLocale *locale, VLUChar *dst, const VLUChar *src, int32_t srcLen, uint32_t options) {
  VL_FLOW("VLStrcatU");
  using namespace vl::str;
  VLLocale *l = vl::orDefault(locale);
  if (options & ~(VL_OPT_CHARLEN | VL_OPT_NULLTERM)) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(int32_t{-1});
  }
  vl::setRc(l, VL_RC_OK);
  VL_RET(cat(UForm{}, UForm{}, dst, src, srcLen, options));
}
