// Linguistic comparison of two W strings.
#include "string/collfam.h"

VL_TRACE_MODULE("vlwcscol");

int VLWcscoll(VLLocale *locale, const VLWChar *str1, int32_t len1, const VLWChar *str2, int32_t len2, uint32_t options) {
  VL_FLOW("VLWcscoll");
  using namespace vl::coll;
  VLLocale *l = use(locale);
  if (!l) VL_RET(0);
  VL_RET(coll(l, WForm{}, str1, len1, WForm{}, str2, len2, options));
}
