// Swaps the code page of a live handle, all or nothing.
#include "locale/locale.h"

VL_TRACE_MODULE("vlchgcp");

uint32_t VLLocaleChangeCodePage(VLLocale *locale, VLObjEntry *codePage) {
  VL_FLOW("VLLocaleChangeCodePage");
  VLLocale *l = vl::orDefault(locale);
  if (!l || !codePage || codePage->type != VL_OBJ_CODEPAGE || !vl::loc::body(codePage))
    VL_RET(vl::setRc(l, VL_RC_BADARG));
  const VLCodePage *old = l->codePage;
  VLLocale before = *l;
  l->codePage = codePage;
  l->flags = static_cast<uint16_t>((l->flags & ~(VL_LF_SINGLEBYTE | VL_LF_SHIFT)) | vl::loc::localeFlagsFor(codePage));
  uint32_t rc = 0;
  for (int i = 0; i < 5 && !rc; ++i) {
    unsigned char b[4];
    VLUChar u = vl::cp::sbcsUni(old, l->chars[2 + i]);
    if (VLCpUnicodeToChar(codePage, u, b) != 1)
      rc = VL_RC_NOSBCSPUNCT;
    else
      l->chars[2 + i] = b[0];
  }
  for (int i = 0; i < 8 && !rc; ++i) {
    l->texts[i] = nullptr;
    if (!before.texts[i]) continue;
    size_t n = std::strlen(before.texts[i]);
    // Room for every character at the longest any page has plus a shift byte each way.
    auto *t = static_cast<char *>(vl::alloc((vl::cp::kMaxCharBytes + 2u) * n + 2));
    if (!t) {
      rc = VL_RC_NOMEM;
      break;
    }
    VLLocaleCnvText(old, codePage, before.texts[i], t);
    l->texts[i] = t;
  }
  if (rc) {
    for (int i = 0; i < 8; ++i)
      if (l->texts[i] != before.texts[i]) vl::release(l->texts[i]);
    *l = before;
  } else {
    for (int i = 0; i < 8; ++i)
      if (l->texts[i] != before.texts[i]) vl::release(before.texts[i]);
  }
  VL_RET(vl::setRc(l, rc));
}
