// Sets an information item from code-page text that starts in the caller's shift state.
#include "locale/info.h"

VL_TRACE_MODULE("vlsettxx");

int VLSetLocaleTextInfoEx(VLLocale *locale, int32_t item, const char *data, VLShiftState state, int32_t length,
                          uint32_t options) {
  VL_FLOW("VLSetLocaleTextInfoEx");
  VL_RET(vl::info::setText<vl::info::Form::Ex>(vl_trc, locale, item, data, state, length, options));
}
