// Writes a monetary amount by the territory's conventions (UTF-16).
#include "format/numfam.h"

VL_TRACE_MODULE("vlcurru");

int32_t VLCurrencyToStringU(VLLocale *locale, VLUChar *buffer, int32_t size, uint32_t options, double amount) {
  VL_FLOW("VLCurrencyToStringU");
  VL_RET(vl::num::currencyToString<vl::num::Form::U>(locale, buffer, 0, size, options, amount));
}
