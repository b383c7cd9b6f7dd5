// Length of the leading run of characters in set.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrspn");

int32_t VLStrspn(VLLocale *locale, const char *str, int32_t len, const char *set, int32_t setLen, uint32_t options) {
  VL_FLOW("VLStrspn");
  using namespace vl::str;
  VLLocale *l = use(locale);
  if (!l) VL_RET(int32_t{0});
  if (options & ~VL_OPT_CHARLEN) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(int32_t{-1});
  }
  vl::setRc(l, VL_RC_OK);
  Bytes f = bytesOf(l);
  VL_RET(spanOf<true>(f, ub(str), len, f, ub(set), setLen, options != 0));
}
