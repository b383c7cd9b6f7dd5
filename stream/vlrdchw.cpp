// Reads one character of the locale's code page as a W value.
#include "stream/stream.h"

VL_TRACE_MODULE("vlrdchw");

VLWChar VLReadCharW(VLStream *stream, VLLocale *locale) {
  VL_FLOW("VLReadCharW");
  using namespace vl::stm;
  VLLocale *l = enter(stream, locale, kRead);
  if (!l) VL_RET(kNoChar);
  VLWChar v;
  if (!readChar(stream, l, pageOf(l), &v)) VL_RET(kNoChar);
  VL_RET(v);
}
