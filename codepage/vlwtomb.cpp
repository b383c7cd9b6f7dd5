// Writes the bytes of a W value.
#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlwtomb");

int VLWToMb(unsigned char *out, VLWChar value) {
  VL_FLOW("VLWToMb");
  if (!out) VL_RET(0);
  VL_RET(vl::cp::wToMb(out, value));
}
