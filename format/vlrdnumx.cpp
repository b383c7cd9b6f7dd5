// Reads a decimal number, passing the shift bytes before it; digits are single-byte only.
#include "format/timescan.h"

VL_TRACE_MODULE("vlrdnumx");

int32_t VLStrReadNumberEx(uint32_t *error, const char *input, int32_t *position, VLShiftState *state, int32_t length,
                          int32_t width, int32_t maximum, int ascii) {
  VL_FLOW("VLStrReadNumberEx");
  using namespace vl::tf;
  VL_RET(
      readNumberAt(error, Shifted{0x0E, 0x0F, 2, 0}, ub(input), position, state, length, width, maximum, ascii != 0));
}
