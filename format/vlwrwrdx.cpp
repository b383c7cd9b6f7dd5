// Appends a locale text item, following the output's shift state in *state.
#include "format/timefam.h"

VL_TRACE_MODULE("vlwrwrdx");

uint32_t VLStrWriteWordEx(VLLocale *locale, char *buffer, int32_t *position, VLShiftState *state, int32_t size,
                          int32_t item, int32_t source) {
  VL_FLOW("VLStrWriteWordEx");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(isShifted(l) ? writeWordAt(l, shiftedOf(l, 0), ub(buffer), position, state, size, item, source)
                      : VLStrWriteWord(l, buffer, position, size, item, source));
}
