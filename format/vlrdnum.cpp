// Reads a decimal number of at most width digits.
#include "format/timescan.h"

VL_TRACE_MODULE("vlrdnum");

int32_t VLStrReadNumber(uint32_t *error, const char *input, int32_t *position, int32_t length, int32_t width,
                        int32_t maximum, int ascii) {
  VL_FLOW("VLStrReadNumber");
  using namespace vl::tf;
  VL_RET(readNumberAt(error, Bytes{}, ub(input), position, nullptr, length, width, maximum, ascii != 0));
}
