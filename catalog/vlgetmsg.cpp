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
  if (length <= 0) VL_RET(uint32_t{0});
  VLMcSet record;
  VLMcSet *s = MCGetSet(catalog, set, &record);
  char *text = s ? MCGetMsg(catalog, s, message) : nullptr;
  if (text) {
    VLConvertStringEx(l, buffer, 0, length, catalog->catLocale, text, 0, static_cast<int32_t>(std::strlen(text)),
                      VL_OPT_NULLTERM);
    if (!catalog->inMemory) vl::release(text);
    VL_RET(fail(l, VL_RC_OK));
  }
  // A damaged catalog keeps its code in the handle even when a default stands in.
  const uint32_t rc = static_cast<uint32_t>(l->lastError);
  if (defaultText) {
    int32_t n = VLStrcpy(l, buffer, length - 1, defaultText, static_cast<int32_t>(std::strlen(defaultText)), 0);
    buffer[n > 0 ? n : 0] = 0;
    vl::setRc(l, rc);
    VL_RET(uint32_t{0});
  }
  buffer[0] = 0;
  VL_RET(fail(l, rc ? rc : VL_RC_CAT_NOMSG));
}
