// Length of the leading run of characters not in set.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrcsp");

int32_t VLStrcspn(VLLocale *locale, const char *str, int32_t len, const char *set, int32_t setLen, uint32_t options) {
  VL_FLOW("VLStrcspn");
  using namespace vl::str;
  VLLocale *l = use(locale);
  if (!l) VL_RET(int32_t{0});
  if (options & ~VL_OPT_CHARLEN) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(int32_t{-1});
  }
  vl::setRc(l, VL_RC_OK);
  Bytes f = bytesOf(l);
  VL_RET(spanOf<false>(f, ub(str), len, f, ub(set), setLen, options != 0));
}
