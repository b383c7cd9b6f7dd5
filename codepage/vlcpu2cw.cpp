// One UTF-16 unit to a W value; the substitution byte when unmapped.
#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlcpu2cw");

VLWChar VLCpUnicodeToCharW(const VLCodePage *cp, VLUChar unit) {
  VL_FLOW("VLCpUnicodeToCharW");
  if (!vl::cp::usable(cp)) VL_RET(VLWChar{0});
  VL_RET(vl::cp::uniToW(cp, unit));
}
