// Half-width counterpart of a UTF-16 unit.
#include "codepage/unimap.h"
#include "frame/frame.h"

VL_TRACE_MODULE("vlunif2h");

VLUChar VLUnicodeToF2H(VLLocale *locale, VLUChar unit) {
  VL_FLOW("VLUnicodeToF2H");
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
  VL_RET(vl::umap::toHalf(unit));
}
