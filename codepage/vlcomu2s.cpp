// UTF-16 to ASCII bytes through the US-ASCII code page object (number 367), one byte
// per unit.
#include <climits>

#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlcomu2s");

int32_t VLComUnicodeToStr(const VLUChar *u, uint32_t length, unsigned char *out) {
  VL_FLOW("VLComUnicodeToStr");
  uint32_t rc = 0;
  const VLCodePage *cp =
      vlglobals ? VLGetObjFromID(vlglobals->objManager, VL_OBJ_CODEPAGE, VL_CP_ASCII, 0, &rc) : nullptr;
  // An empty code page range can answer with an entry of another type.
  if (!vl::cp::usable(cp) || cp->type != VL_OBJ_CODEPAGE || !u || !out) {
    VL_ERR("Code page %d not available, rc = %d", static_cast<int>(VL_CP_ASCII), static_cast<int>(rc));
    VL_RET(int32_t{-1});
  }
  size_t n = length;
  if (length == 0xFFFFFFFFu) {
    n = 0;
    while (u[n]) ++n;
    if (n < 1) VL_RET(int32_t{-1});
  }
  if (n > INT32_MAX) n = INT32_MAX;  // the count must fit the result; a 0 ends it sooner
  size_t i = 0;
  for (; i < n && u[i]; ++i) {
    uint8_t b[4];
    vl::cp::uniToMb(cp, u[i], b);
    out[i] = b[0];
  }
  out[i] = 0;
  VL_RET(static_cast<int32_t>(i));
}
