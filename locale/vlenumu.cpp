// Every object of the definition store, with its name in UTF-16.
#include "locale/native.h"

VL_TRACE_MODULE("vlenumu");

int VLEnumLocalesU(VLEnumCallbackU callback, void *context) {
  VL_FLOW("VLEnumLocalesU");
  if (!callback) VL_RET(0);
  VL_RET(vl::nat::enumerate([&](int type, const char *name) {
    VLUChar u[40] = {0};
    // Object names are ASCII: without the ASCII page (it may fail to load) they widen as they are.
    if (*name && VLComStrToUnicode(reinterpret_cast<const unsigned char *>(name), 0xFFFFFFFFu, u) < 0)
      for (size_t i = 0; name[i] && i + 1 < std::size(u); ++i) u[i] = static_cast<unsigned char>(name[i]);
    return callback(context, type, u);
  }));
}
