// Writes a monetary amount by the territory's conventions.
#include "format/numfam.h"

VL_TRACE_MODULE("vlcurr");

int32_t VLCurrencyToString(VLLocale *locale, char *buffer, int32_t size, uint32_t options, double amount) {
  VL_FLOW("VLCurrencyToString");
  VL_RET(vl::num::currencyToString<vl::num::Form::Plain>(locale, buffer, 0, size, options, amount));
}
