// The next collation element of a shift-sensitive string; the state follows the walk.
#include "string/collfam.h"

int VLStrGetNextWeightEx(VLLocale *locale, const char **str, VLShiftState *state, int32_t *remaining,
                         uint32_t *counter, uint16_t *p1, uint8_t *s1, uint8_t *t1, uint16_t *q1, uint16_t *p2,
                         uint8_t *s2, uint8_t *t2, uint16_t *q2, uint8_t *cls, uint16_t *pending) {
  using namespace vl::coll;
  VLLocale *l = use(locale);
  if (l && !isShifted(l))
    return VLStrGetNextWeight(locale, str, remaining, counter, p1, s1, t1, q1, p2, s2, t2, q2, cls, pending);
  return nextWeight(locale, l ? shiftedOf(l, state ? *state : 0) : Shifted{},
                    reinterpret_cast<const unsigned char **>(str), remaining, counter, p1, s1, t1, q1, p2, s2, t2,
                    q2, cls, pending, state);
}
