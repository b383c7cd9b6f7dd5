// The last return code of a handle.
#include "frame/frame.h"

int32_t VLGetError(VLLocale *locale) {
  VLLocale *l = vl::orDefault(locale);
  return l ? l->lastError : 0;
}
