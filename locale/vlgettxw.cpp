// An information item as W values.
#include "locale/info.h"

VL_TRACE_MODULE("vlgettxw");

int32_t VLGetLocaleTextInfoW(VLLocale *locale, int32_t item, VLWChar *buffer, int32_t size, uint32_t options) {
  VL_FLOW("VLGetLocaleTextInfoW");
  VL_RET(vl::info::getText<vl::info::Form::W>(locale, item, buffer, 0, size, options));
}
