// Sets an information item from text in the locale's code page.
#include "locale/info.h"

VL_TRACE_MODULE("vlsettxt");

int VLSetLocaleTextInfo(VLLocale *locale, int32_t item, const char *data, int32_t length, uint32_t options) {
  VL_FLOW("VLSetLocaleTextInfo");
  VL_RET(vl::info::setText<vl::info::Form::Plain>(vl_trc, locale, item, data, 0, length, options));
}
