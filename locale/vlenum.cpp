// Every object of the definition store, with its name as bytes.
#include "locale/native.h"

VL_TRACE_MODULE("vlenum");

int VLEnumLocales(VLEnumCallback callback, void *context) {
  VL_FLOW("VLEnumLocales");
  if (!callback) VL_RET(0);
  VL_RET(vl::nat::enumerate([&](int type, const char *name) { return callback(context, type, name); }));
}
