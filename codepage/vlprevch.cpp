// Pointer to the previous character. Multi-byte pages cannot be read backwards, so the
// walk starts again at the string start.
#include "codepage/step.h"

VL_TRACE_MODULE("vlprevch");

char *VLPrevChar(VLLocale *locale, const char *start, const char *p) {
  VL_FLOW("VLPrevChar");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !p) VL_RET(static_cast<char *>(nullptr));
  vl::setRc(l, VL_RC_OK);
  Bytes f = bytesOf(l);
  if (f.singleByte()) VL_RET(cb(ub(p) - 1));
  if (!start || p <= start) VL_RET(mut(start ? start : p));
  const unsigned char *q = ub(start), *end = ub(p);
  while (q + f.len(q) < end) q += f.len(q);
  VL_RET(cb(q));
}
