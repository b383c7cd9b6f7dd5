// First occurrence of a substring of UTF-16 units.
#include "string/strsfam.h"

VL_TRACE_MODULE("vlstrstu");

VLUChar *VLStrstrU(VLLocale *locale, const VLUChar *str, int32_t len, const VLUChar *sub, int32_t subLen,
                   uint32_t options) {
  VL_FLOW("VLStrstrU");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l) VL_RET(static_cast<VLUChar *>(nullptr));
  VL_RET(mut(vl::strs::find(l, UForm{}, str, len, UForm{}, sub, subLen, options & ~VL_OPT_CHARLEN)));
}
