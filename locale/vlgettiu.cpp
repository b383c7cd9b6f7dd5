// Where an item's text is kept, with the handle's UTF-16 values.
#include "locale/info.h"

VL_TRACE_MODULE("vlgettiu");

const void *VLLocaleGetTextItemU(VLLocale *locale, int32_t item, int current, int *kind) {
  VL_FLOW("VLLocaleGetTextItemU");
  VLLocale *l = vl::info::target(locale);
  vl::info::Item it{};
  if (!l || !vl::info::locate(l, item, current != 0, true, &it)) {
    vl::setRc(l, VL_RC_BADITEM);
    VL_RET(static_cast<const void *>(nullptr));
  }
  if (kind) *kind = it.kind;
  vl::setRc(l, VL_RC_OK);
  VL_RET(it.p);
}
