// An information item as text in the locale's code page, continuing the caller's shift state.
#include "locale/info.h"

VL_TRACE_MODULE("vlgettxx");

int32_t VLGetLocaleTextInfoEx(VLLocale *locale, int32_t item, char *buffer, VLShiftState state, int32_t size,
                              uint32_t options) {
  VL_FLOW("VLGetLocaleTextInfoEx");
  VL_RET(vl::info::getText<vl::info::Form::Ex>(locale, item, buffer, state, size, options));
}
