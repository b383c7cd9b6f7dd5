// Maps text of a shift-sensitive code page from the given shift state.
#include "codepage/mapfam.h"

VL_TRACE_MODULE("vlmapstx");

int32_t VLMapStringEx(VLLocale *locale, char *out, int32_t outLen, const char *in, VLShiftState state,
                      int32_t inLen, uint32_t selector) {
  VL_FLOW("VLMapStringEx");
  using namespace vl::map;
  Sel sel;
  if (!accept(locale, selector, &sel)) VL_RET(int32_t{-1});
  if (sel.op == Op::Copy) VL_RET(VLStrcpyEx(locale, out, state, outLen, in, state, inLen, 0));
  VLLocale *l = use(locale);
  if (!l || !out || !in || outLen <= 0) VL_RET(int32_t{0});
  if (!isShifted(l)) {
    ByteWriter w{ub(out), static_cast<uint32_t>(outLen)};
    VL_RET(mapString(bytesOf(l), CpPage{l->codePage}, w, ub(in), inLen, sel, l->language));
  }
  const Shifted f = shiftedOf(l, state);
  ShiftWriter w{ub(out), static_cast<uint32_t>(outLen), 0, f.state, f.so, f.si};
  VL_RET(mapString(f, CpPage{l->codePage}, w, ub(in), inLen, sel, l->language));
}
