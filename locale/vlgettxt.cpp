// An information item as text in the locale's code page.
#include "locale/info.h"

VL_TRACE_MODULE("vlgettxt");

int32_t VLGetLocaleTextInfo(VLLocale *locale, int32_t item, char *buffer, int32_t size, uint32_t options) {
  VL_FLOW("VLGetLocaleTextInfo");
  VL_RET(vl::info::getText<vl::info::Form::Plain>(locale, item, buffer, 0, size, options));
}
