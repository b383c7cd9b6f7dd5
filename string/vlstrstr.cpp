// First occurrence of a substring.
#include "string/strsfam.h"

VL_TRACE_MODULE("vlstrstr");

char *VLStrstr(VLLocale *locale, const char *str, int32_t len, const char *sub, int32_t subLen, uint32_t options) {
  VL_FLOW("VLStrstr");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l) VL_RET(static_cast<char *>(nullptr));
  VL_RET(cb(vl::strs::find(l, bytesOf(l), ub(str), len, bytesOf(l), ub(sub), subLen, options)));
}
