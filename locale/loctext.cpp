// Text helpers shared by the handle functions.
#include "locale/locale.h"

size_t vl::loc::ulen(const VLUChar *u) {
  size_t n = 0;
  while (u[n]) ++n;
  return n;
}

VLUChar *vl::loc::copyU(const VLUChar *u) {
  size_t n = ulen(u) + 1;
  auto *c = static_cast<VLUChar *>(alloc(n * sizeof(VLUChar)));
  if (c) std::memcpy(c, u, n * sizeof(VLUChar));
  return c;
}

char *vl::loc::toCodePage(const VLCodePage *cp, const VLUChar *u) {
  size_t n = ulen(u);
  // Each unit takes at most the longest character and one shift byte; then a closing
  // shift byte and the terminator. Not the page's own maximum: a body could understate it.
  auto *out = static_cast<unsigned char *>(alloc(n * (cp::kMaxCharBytes + 1u) + 2));
  if (!out) return nullptr;
  bool shift = cp::isShift(cp);
  bool dbcs = false;
  size_t o = 0;
  unsigned char buf[4];
  for (size_t i = 0; i < n; ++i) {
    int k = VLCpUnicodeToChar(cp, u[i], buf);
    if (shift) {
      if (k > 1 && !dbcs) {
        out[o++] = cp::shiftOut(cp);
        dbcs = true;
      } else if (k == 1 && dbcs) {
        out[o++] = cp::shiftIn(cp);
        dbcs = false;
      }
    }
    for (int j = 0; j < k; ++j) out[o++] = buf[j];
  }
  if (dbcs) out[o++] = cp::shiftIn(cp);
  out[o] = 0;
  return reinterpret_cast<char *>(out);
}

bool vl::loc::releaseTexts(VLLocale *l) {
  bool ok = true;
  for (int i = 0; i < 8; ++i) {
    ok &= release(l->texts[i]);
    ok &= release(l->textsU[i]);
    l->texts[i] = nullptr;
    l->textsU[i] = nullptr;
  }
  return ok;
}
