// VLReadStringW: reads a line of W values.
#include "stream/stream.h"

VL_TRACE_MODULE("vlrdstw");

int32_t VLReadStringW(VLStream *stream, VLLocale *locale, VLWChar *out, int32_t size, uint32_t options) {
  VL_FLOW("VLReadStringW");
  VL_RET(vl::stm::readString<vl::stm::Form::kW>(stream, locale, out, size, options, nullptr));
}
