// Every object of the definition store, with its name widened byte by byte.
#include "locale/native.h"

VL_TRACE_MODULE("vlenumw");

int VLEnumLocalesW(VLEnumCallbackW callback, void *context) {
  VL_FLOW("VLEnumLocalesW");
  if (!callback) VL_RET(0);
  VL_RET(vl::nat::enumerate([&](int type, const char *name) {
    VLWChar wide[40];
    size_t i = 0;
    for (; name[i] && i + 1 < sizeof wide / sizeof wide[0]; ++i) wide[i] = static_cast<unsigned char>(name[i]);
    wide[i] = 0;
    return callback(context, type, wide);
  }));
}
