// Finds a character; a match needs the same length and bytes.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrchr");

char *VLStrchr(VLLocale *locale, const char *str, int32_t len, const char *chr, uint32_t options) {
  VL_FLOW("VLStrchr");
  using namespace vl::str;
  VLLocale *l = use(locale);
  if (!l) VL_RET(static_cast<char *>(nullptr));
  Bytes f = bytesOf(l);
  if ((options & VL_OPT_CHARLEN) && len > 0 && str) len = static_cast<int32_t>(unitsOf(f, ub(str), static_cast<uint32_t>(len)));
  options &= ~VL_OPT_CHARLEN;
  if (options != 0 && options != kLast) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(static_cast<char *>(nullptr));
  }
  vl::setRc(l, VL_RC_OK);
  if (!str || !chr || len == 0) VL_RET(static_cast<char *>(nullptr));
  uint32_t n = resolveLen(ub(str), len, 1);  // the terminator can be found
  VL_RET(cb(find(f, ub(str), n, ub(chr), f.len(ub(chr)), options == kLast, nullptr)));
}
