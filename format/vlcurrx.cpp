// Writes a monetary amount by the territory's conventions, from the caller's shift state.
#include "format/numfam.h"

VL_TRACE_MODULE("vlcurrx");

int32_t VLCurrencyToStringEx(VLLocale *locale, char *buffer, VLShiftState state, int32_t size, uint32_t options,
                             double amount) {
  VL_FLOW("VLCurrencyToStringEx");
  VL_RET(vl::num::currencyToString<vl::num::Form::Ex>(locale, buffer, state, size, options, amount));
}
