// Finds the first line end of the wanted kinds in a string.
#include "codepage/step.h"

VL_TRACE_MODULE("vlgeteol");

char *VLGetEol(VLLocale *locale, const char *s, int32_t length, uint32_t *kind, int32_t *eolLength,
               uint32_t options) {
  VL_FLOW("VLGetEol");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l) VL_RET(static_cast<char *>(nullptr));
  VL_RET(getEolBytes(l, bytesOf(l), s, length, kind, eolLength, options));
}
