// Upper-case counterpart of a UTF-16 unit.
#include "codepage/unimap.h"
#include "frame/frame.h"

VL_TRACE_MODULE("vluniupp");

VLUChar VLUnicodeToUpper(VLLocale *locale, VLUChar unit) {
  VL_FLOW("VLUnicodeToUpper");
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
  VL_RET(vl::umap::toUpper(unit));
}
