// First occurrence of a substring of W values.
#include "string/strsfam.h"

VL_TRACE_MODULE("vlwcsstr");

VLWChar *VLWcsstr(VLLocale *locale, const VLWChar *str, int32_t len, const VLWChar *sub, int32_t subLen,
                  uint32_t options) {
  VL_FLOW("VLWcsstr");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l) VL_RET(static_cast<VLWChar *>(nullptr));
  VL_RET(mut(vl::strs::find(l, WForm{}, str, len, WForm{}, sub, subLen, options & ~VL_OPT_CHARLEN)));
}
