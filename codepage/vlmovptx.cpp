// Moves a pointer in a shift-sensitive page, keeping track of the state; a shift byte
// that is itself the target is where the move stops.
#include "codepage/step.h"

VL_TRACE_MODULE("vlmovptx");

char *VLMoveStringPointerEx(VLLocale *locale, const char *p, VLShiftState state, int32_t count,
                            VLShiftState *stateOut, uint32_t options) {
  VL_FLOW("VLMoveStringPointerEx");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !p) VL_RET(static_cast<char *>(nullptr));
  if (!isShifted(l)) VL_RET(VLMoveStringPointer(l, p, count, options));
  if (options & ~VL_OPT_CHARLEN) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(static_cast<char *>(nullptr));
  }
  vl::setRc(l, VL_RC_OK);
  Shifted f = shiftedOf(l, state);
  const unsigned char *s = ub(p);
  uint32_t pos = 0;
  if (count > 0) {
    uint32_t target = options & VL_OPT_CHARLEN ? unitsOf(f, s, static_cast<uint32_t>(count))
                                               : static_cast<uint32_t>(count);
    for (;;) {
      if (f.isShift(s[pos])) {
        if (pos == target) break;
        f.shift(s[pos++]);
        continue;
      }
      if (pos + f.len(s + pos) > target) break;
      pos += f.len(s + pos);
    }
  }
  if (stateOut) *stateOut = f.state;
  VL_RET(cb(s + pos));
}
