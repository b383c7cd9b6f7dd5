// VLReadString: reads a line of code page bytes.
#include "stream/stream.h"

VL_TRACE_MODULE("vlrdstr");

int32_t VLReadString(VLStream *stream, VLLocale *locale, char *out, int32_t size, uint32_t options) {
  VL_FLOW("VLReadString");
  VL_RET(vl::stm::readString<vl::stm::Form::kPlain>(stream, locale, out, size, options, nullptr));
}
