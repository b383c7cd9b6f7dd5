// Appends W values to a 0-ended W string.
#include "string/strfam.h"

VL_TRACE_MODULE("vlwcscat");

int32_t VLWcscat(VLLocale *locale, VLWChar *dst, const VLWChar *src, int32_t srcLen, uint32_t options) {
  VL_FLOW("VLWcscat");
  using namespace vl::str;
  VLLocale *l = vl::orDefault(locale);
  if (options & ~(VL_OPT_CHARLEN | VL_OPT_NULLTERM)) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(int32_t{-1});
  }
  vl::setRc(l, VL_RC_OK);
  VL_RET(cat(WForm{}, WForm{}, dst, src, srcLen, options));
}
