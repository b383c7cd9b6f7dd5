// An information item as UTF-16.
#include "locale/info.h"

VL_TRACE_MODULE("vlgettxu");

int32_t VLGetLocaleTextInfoU(VLLocale *locale, int32_t item, VLUChar *buffer, int32_t size, uint32_t options) {
  VL_FLOW("VLGetLocaleTextInfoU");
  VL_RET(vl::info::getText<vl::info::Form::U>(locale, item, buffer, 0, size, options));
}
