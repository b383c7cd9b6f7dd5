// Appends a fixed-width number, leaving a double-byte run first when *state says so.
#include "format/timefam.h"

VL_TRACE_MODULE("vlwrnumx");

uint32_t VLStrWriteNumberEx(VLLocale *locale, char *buffer, int32_t *position, VLShiftState *state, int32_t size,
                            int32_t value, int32_t width, int ascii, int modifier) {
  VL_FLOW("VLStrWriteNumberEx");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(isShifted(l) ? writeNumberAt(l, shiftedOf(l, 0), ub(buffer), position, state, size, value, width, ascii != 0,
                                      modifier != 0)
                      : VLStrWriteNumber(l, buffer, position, size, value, width, ascii, modifier));
}
