// Reads a decimal number from UTF-16 (ASCII digits).
#include "format/timescan.h"

VL_TRACE_MODULE("vlrdnumu");

int32_t VLStrReadNumberU(uint32_t *error, const VLUChar *input, int32_t *position, int32_t length, int32_t width,
                         int32_t maximum, int /*ascii*/) {
  VL_FLOW("VLStrReadNumberU");
  using namespace vl::tf;
  VL_RET(readNumberAt(error, UForm{}, input, position, nullptr, length, width, maximum, true));
}
