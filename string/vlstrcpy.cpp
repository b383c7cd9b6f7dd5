// Copies whole characters.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrcpy");

int32_t VLStrcpy(VLLocale *locale, char *dst, int32_t dstLen, const char *src, int32_t srcLen, uint32_t options) {
  VL_FLOW("VLStrcpy");
  using namespace vl::str;
  if (options & ~VL_OPT_CHARLEN) {
    vl::setRc(locale, VL_RC_BADARG);
    VL_RET(int32_t{-1});
  }
  VLLocale *l = use(locale);
  if (!l) VL_RET(int32_t{0});
  vl::setRc(l, VL_RC_OK);
  VL_RET(copy(bytesOf(l), ub(dst), 0, dstLen, ub(src), srcLen, options != 0));
}
