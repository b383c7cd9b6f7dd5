// Frees the texts of an old handle image that the kept image no longer uses.
#include "locale/locale.h"

void VLLocaleFreeOldText(const VLLocale *keep, const VLLocale *old) {
  if (!keep || !old) return;
  for (int i = 0; i < 8; ++i) {
    if (old->texts[i] != keep->texts[i]) vl::release(old->texts[i]);
    if (old->textsU[i] != keep->textsU[i]) vl::release(old->textsU[i]);
  }
}
