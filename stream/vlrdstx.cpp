// VLReadStringEx: reads a line of code page bytes with the shift bytes its characters
// need, continuing from the output's shift state.
#include "stream/stream.h"

VL_TRACE_MODULE("vlrdstx");

int32_t VLReadStringEx(VLStream *stream, VLLocale *locale, char *out, VLShiftState *state, int32_t size,
                       uint32_t options) {
  VL_FLOW("VLReadStringEx");
  VL_RET(vl::stm::readString<vl::stm::Form::kEx>(stream, locale, out, size, options, state));
}
