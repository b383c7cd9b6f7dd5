// Derives a handle's modifiable values from its territory and code page.
#include "locale/locale.h"

VL_TRACE_MODULE("derive");

uint32_t vl::loc::deriveModifiable(VLLocale *l) {
  const VLObjEntry *t = l->territory;
  const VLCodePage *c = l->codePage;
  for (int i = 0; i < 3; ++i)
    if (!(l->setMask & (kMaskNum0 << i))) l->num[i] = word(t, kNumWord + i);
  uint16_t tf = word(t, kFlagsWord);
  for (int i = 0; i < 6; ++i) {
    if (l->setMask & (kMaskFlag0 << i)) continue;
    uint16_t bit = static_cast<uint16_t>(1u << i);
    l->flags = static_cast<uint16_t>((tf & (2u << i)) ? (l->flags | bit) : (l->flags & ~bit));
  }
  uint16_t signs = word(t, kSignWord);
  if (!(l->setMask & kMaskSignPos)) l->chars[0] = static_cast<uint8_t>(signs >> 8);
  if (!(l->setMask & (kMaskSignPos << 1))) l->chars[1] = static_cast<uint8_t>(signs);
  for (int i = 0; i < 5; ++i) {
    if (l->setMask & (kMaskPunct0 << i)) continue;
    VLUChar u = word(t, kPunctWord + i);
    unsigned char b[4];
    l->wchars[i] = u;
    l->chars[2 + i] = VLCpUnicodeToChar(c, u, b) == 1 ? b[0] : 0;
  }
  for (int i = 0; i < 8; ++i) {
    if (l->setMask & (kMaskText0 << i)) continue;
    const VLUChar *src = text(t, kTextWord[i]);
    char *s = toCodePage(c, src);
    if (!s) return VL_RC_NOMEM;
    VLUChar *u = copyU(src);
    if (!u) {
      release(s);
      return VL_RC_NOMEM;
    }
    if (i == 1) VL_STATE("Setting currency for locale %p to %p", static_cast<void *>(l), static_cast<void *>(s));
    l->texts[i] = s;
    l->textsU[i] = u;
  }
  return 0;
}
