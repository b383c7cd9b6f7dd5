// Moves a pointer by a count of bytes (or characters) to the start of the character
// holding the target byte.
#include "codepage/step.h"

VL_TRACE_MODULE("vlmovptr");

char *VLMoveStringPointer(VLLocale *locale, const char *p, int32_t count, uint32_t options) {
  VL_FLOW("VLMoveStringPointer");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !p) VL_RET(static_cast<char *>(nullptr));
  if (options & ~VL_OPT_CHARLEN) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(static_cast<char *>(nullptr));
  }
  vl::setRc(l, VL_RC_OK);
  Bytes f = bytesOf(l);
  if (f.singleByte()) VL_RET(cb(ub(p) + count));
  if (count <= 0) VL_RET(mut(p));  // a multi-byte page is not walked backwards
  uint32_t target = options & VL_OPT_CHARLEN ? unitsOf(f, ub(p), static_cast<uint32_t>(count))
                                             : static_cast<uint32_t>(count);
  uint32_t pos = 0;
  for (uint32_t len; pos + (len = f.len(ub(p) + pos)) <= target;) pos += len;
  VL_RET(cb(ub(p) + pos));
}
