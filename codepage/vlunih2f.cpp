// Full-width counterpart of a UTF-16 unit.
#include "codepage/unimap.h"
#include "frame/frame.h"

VL_TRACE_MODULE("vlunih2f");

VLUChar VLUnicodeToH2F(VLLocale *locale, VLUChar unit) {
  VL_FLOW("VLUnicodeToH2F");
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
  VL_RET(vl::umap::toFull(unit));
}
