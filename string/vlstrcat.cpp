// Appends whole characters to a 0-ended string.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrcat");

int32_t VLStrcat(VLLocale *locale, char *dst, const char *src, int32_t srcLen, uint32_t options) {
  VL_FLOW("VLStrcat");
  using namespace vl::str;
  VLLocale *l = use(locale);
  if (options & ~(VL_OPT_CHARLEN | VL_OPT_NULLTERM)) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(int32_t{-1});
  }
  if (!l) VL_RET(int32_t{0});
  vl::setRc(l, VL_RC_OK);
  VL_RET(cat(bytesOf(l), bytesOf(l), ub(dst), ub(src), srcLen, options));
}
