// Sets an information item from W values.
#include "locale/info.h"

VL_TRACE_MODULE("vlsettxw");

int VLSetLocaleTextInfoW(VLLocale *locale, int32_t item, const VLWChar *data, int32_t length, uint32_t options) {
  VL_FLOW("VLSetLocaleTextInfoW");
  VL_RET(vl::info::setText<vl::info::Form::W>(vl_trc, locale, item, data, 0, length, options));
}
