// Writes a monetary amount by the territory's conventions (wide characters).
#include "format/numfam.h"

VL_TRACE_MODULE("vlwcurr");

int32_t VLCurrencyToStringW(VLLocale *locale, VLWChar *buffer, int32_t size, uint32_t options, double amount) {
  VL_FLOW("VLCurrencyToStringW");
  VL_RET(vl::num::currencyToString<vl::num::Form::W>(locale, buffer, 0, size, options, amount));
}
