// Length of the leading run of characters in set.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrspn");

int32_t VLStrspn(VLLocale *locale, const char *str, int32_t len, const char *set, int32_t setLen, uint32_t options) {
  VL_FLOW("VLStrspn");
  using namespace vl::str;
  VLLocale *l = use(locale);
  if (!l) VL_RET(int32_t{0});
  Bytes f = bytesOf(l);
  VL_RET(spanEntry<true>(l, f, str, len, f, set, setLen, options));
}
