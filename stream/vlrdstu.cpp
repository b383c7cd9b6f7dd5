// VLReadStringU: reads a line of UTF-16 units from a UTF-16 stream.
#include "stream/stream.h"

VL_TRACE_MODULE("vlrdstu");

int32_t VLReadStringU(VLStream *stream, VLLocale *locale, VLUChar *out, int32_t size, uint32_t options) {
  VL_FLOW("VLReadStringU");
  VL_RET(vl::stm::readString<vl::stm::Form::kU>(stream, locale, out, size, options, nullptr));
}
