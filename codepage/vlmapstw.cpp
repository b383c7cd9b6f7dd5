// Maps W values of the locale's code page.
#include "codepage/mapfam.h"

VL_TRACE_MODULE("vlmapstw");

int32_t VLMapStringW(VLLocale *locale, VLWChar *out, int32_t outLen, const VLWChar *in, int32_t inLen,
                     uint32_t selector) {
  VL_FLOW("VLMapStringW");
  using namespace vl::map;
  Sel sel;
  if (!accept(locale, selector, &sel)) VL_RET(int32_t{-1});
  if (sel.op == Op::Copy) VL_RET(VLWcscpy(locale, out, outLen, in, inLen));
  VLLocale *l = use(locale);
  if (!l || !out || !in || outLen <= 0) VL_RET(int32_t{0});
  UnitWriter<VLWChar> w{out, static_cast<uint32_t>(outLen)};
  VL_RET(mapString(WForm{}, CpPage{l->codePage}, w, in, inLen, sel, l->language));
}
