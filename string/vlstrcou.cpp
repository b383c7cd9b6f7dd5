// Linguistic comparison of two UTF-16 strings.
#include "string/collfam.h"

VL_TRACE_MODULE("vlstrcou");

int VLStrcollU(VLLocale *locale, const VLUChar *str1, int32_t len1, const VLUChar *str2, int32_t len2, uint32_t options) {
  VL_FLOW("VLStrcollU");
  using namespace vl::coll;
  VLLocale *l = use(locale);
  if (!l) VL_RET(0);
  VL_RET(coll(l, UForm{}, str1, len1, UForm{}, str2, len2, options));
}
