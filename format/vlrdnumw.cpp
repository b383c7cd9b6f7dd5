// Reads a decimal number from W values.
#include "format/timescan.h"

VL_TRACE_MODULE("vlrdnumw");

int32_t VLStrReadNumberW(uint32_t *error, const VLWChar *input, int32_t *position, int32_t length, int32_t width,
                         int32_t maximum, int ascii) {
  VL_FLOW("VLStrReadNumberW");
  using namespace vl::tf;
  VL_RET(readNumberAt(error, WForm{}, input, position, nullptr, length, width, maximum, ascii != 0));
}
