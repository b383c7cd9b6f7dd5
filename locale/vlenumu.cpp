// Every object of the definition store, with its name in UTF-16.
#include "locale/native.h"

VL_TRACE_MODULE("vlenumu");

int VLEnumLocalesU(VLEnumCallbackU callback, void *context) {
  VL_FLOW("VLEnumLocalesU");
  if (!callback) VL_RET(0);
  VL_RET(vl::nat::enumerate([&](int type, const char *name) {
    VLUChar u[40] = {0};
    if (*name) VLComStrToUnicode(reinterpret_cast<const unsigned char *>(name), 0xFFFFFFFFu, u);
    return callback(context, type, u);
  }));
}
