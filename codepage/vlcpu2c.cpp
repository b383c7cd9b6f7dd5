// One UTF-16 unit to the bytes of the code page; the substitution byte when unmapped.
#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlcpu2c");

int VLCpUnicodeToChar(const VLCodePage *cp, VLUChar unit, unsigned char *out) {
  VL_FLOW("VLCpUnicodeToChar");
  if (!vl::cp::usable(cp) || !out) VL_RET(0);
  VL_RET(vl::cp::uniToMb(cp, unit, out));
}
