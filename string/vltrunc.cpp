// Cuts a string to a length on a character boundary, optionally without trailing blanks.
#include "string/trunc.h"

VL_TRACE_MODULE("vltrunc");

int32_t VLTruncateString(VLLocale *locale, char *str, int32_t length, uint32_t options) {
  VL_FLOW("VLTruncateString");
  using namespace vl::str;
  VLLocale *l = use(locale);
  if (!l) VL_RET(int32_t{0});
  vl::setRc(l, VL_RC_OK);
  VL_RET(truncateEntry(l, bytesOf(l), str, length, options, vl_trc));
}
