// Linguistic comparison of two plain strings.
#include "string/collfam.h"

VL_TRACE_MODULE("vlstrcol");

int VLStrcoll(VLLocale *locale, const char *str1, int32_t len1, const char *str2, int32_t len2, uint32_t options) {
  VL_FLOW("VLStrcoll");
  using namespace vl::coll;
  VLLocale *l = use(locale);
  if (!l) VL_RET(0);
  VL_RET(coll(l, bytesOf(l), ub(str1), len1, bytesOf(l), ub(str2), len2, options));
}
