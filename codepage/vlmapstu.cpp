// Maps UTF-16 text by the built-in tables.
#include "codepage/mapfam.h"

VL_TRACE_MODULE("vlmapstu");

int32_t VLMapStringU(VLLocale *locale, VLUChar *out, int32_t outLen, const VLUChar *in, int32_t inLen,
                     uint32_t selector) {
  VL_FLOW("VLMapStringU");
  using namespace vl::map;
  Sel sel;
  if (!accept(locale, selector, &sel)) VL_RET(int32_t{-1});
  if (sel.op == Op::Copy) VL_RET(VLStrcpyU(locale, out, outLen, in, inLen));
  if (!out || !in || outLen <= 0) VL_RET(int32_t{0});
  UnitWriter<VLUChar> w{out, static_cast<uint32_t>(outLen)};
  VL_RET(mapString(UForm{}, UniPage{}, w, in, inLen, sel, languageOf(vl::orDefault(locale))));
}
