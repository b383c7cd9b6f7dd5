// Fetches a message converted into the caller's code page, or the default text.
#include "catalog/catalog.h"

VL_TRACE_MODULE("vlgetmsg");

uint32_t VLGetMessage(VLCatalog *catalog, uint32_t set, uint32_t message, char *buffer, int32_t length,
                      const char *defaultText, uint32_t) {
  VL_FLOW("VLGetMessage");
  using namespace vl::cat;
  VLLocale *l = reportTo(catalog);
  if (!catalog || !buffer) VL_RET(fail(l, VL_RC_BADARG));
  vl::setRc(l, VL_RC_OK);
  if (length <= 0) {
    buffer[0] = 0;  // callers print the buffer whatever the length said
    VL_RET(uint32_t{0});
  }
  VLMcSet record;
  const char *text = nullptr;
  size_t n = 0;
  if (catalog->inMemory) {  // the loaded copies, searched in place
    const VLMcSet *s = bounded(catalog->sets, catalog->setCount, set);
    const VLMcMsg *m = s ? bounded(s->index, s->count, message) : nullptr;
    if (m) text = m->text, n = m->length;
  } else if (VLMcSet *s = MCGetSet(catalog, set, &record)) {
    if ((text = MCGetMsg(catalog, s, message))) n = std::strlen(text);
  }
  if (text) {
    const VLLocale *from = catalog->catLocale;
    // The same code page needs no conversion; a cut still falls on a character boundary,
    // and only a shift run would need closing.
    if (from && from->codePage == l->codePage && !vl::step::isShifted(l)) {
      if (n < static_cast<size_t>(length)) {
        std::memcpy(buffer, text, n + 1);
      } else {
        int32_t k = VLStrcpy(l, buffer, length - 1, text, static_cast<int32_t>(n), 0);
        buffer[k > 0 ? k : 0] = 0;
      }
    } else {
      VLConvertStringEx(l, buffer, 0, length, catalog->catLocale, text, 0, static_cast<int32_t>(n), VL_OPT_NULLTERM);
    }
    if (!catalog->inMemory) vl::release(const_cast<char *>(text));
    VL_RET(fail(l, VL_RC_OK));
  }
  // A damaged catalog keeps its code in the handle even when a default stands in.
  const uint32_t rc = static_cast<uint32_t>(l->lastError);
  if (defaultText) {
    if (!copyDefault(l, buffer, length, defaultText)) VL_RET(fail(l, VL_RC_NOMEM));
    vl::setRc(l, rc);
    VL_RET(uint32_t{0});
  }
  buffer[0] = 0;
  VL_RET(fail(l, rc ? rc : VL_RC_CAT_NOMSG));
}
