// Sets an information item from UTF-16 (converted into the locale's code page first).
#include "locale/info.h"

VL_TRACE_MODULE("vlsettxu");

int VLSetLocaleTextInfoU(VLLocale *locale, int32_t item, const VLUChar *data, int32_t length, uint32_t options) {
  VL_FLOW("VLSetLocaleTextInfoU");
  VL_RET(vl::info::setText<vl::info::Form::U>(vl_trc, locale, item, data, 0, length, options));
}
