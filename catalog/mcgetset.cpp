// Finds a set: a bounded search of the loaded sets, or a walk of the file's set chain
// (the header is checked on the first walk).
#include "catalog/catalog.h"

VL_TRACE_MODULE("mcgetset");

namespace {

using namespace vl::cat;

uint32_t openHeader(VLCatalog *c) {
  uint8_t h[kHeader];
  if (!readAt(c, 0, h, kHeader) || !headerOk(h, c->size)) return VL_RC_CAT_INVALID;
  if (!c->catLocale)
    if (uint32_t rc = headerLocale(h, &c->catLocale)) return rc;
  c->setCount = vl::rd32(h + 12);
  c->firstSet = vl::rd32(h + 16);
  return VL_RC_OK;
}

}  // namespace

VLMcSet *MCGetSet(VLCatalog *catalog, uint32_t set, VLMcSet *buffer) {
  VL_FLOW("MCGetSet");
  if (!catalog || set < 1) VL_RET(static_cast<VLMcSet *>(nullptr));
  if (catalog->inMemory) VL_RET(bounded(catalog->sets, catalog->setCount, set));
  VLLocale *l = reportTo(catalog);
  if (!buffer || !catalog->file) VL_RET(static_cast<VLMcSet *>(nullptr));
  if (!catalog->firstSet) {
    if (uint32_t rc = openHeader(catalog)) {
      VL_ERR("Catalog header refused, rc = %u", rc);
      fail(l, rc);
      VL_RET(static_cast<VLMcSet *>(nullptr));
    }
  }
  uint32_t at = catalog->firstSet;
  uint8_t rec[kSetRec];
  // No more records than the header counts: a looping chain ends here.
  for (uint32_t i = 0; i < catalog->setCount && at; ++i) {
    if (!within(at, kSetRec, catalog->size) || !readAt(catalog, at, rec, kSetRec)) {
      fail(l, VL_RC_CAT_INVALID);
      VL_RET(static_cast<VLMcSet *>(nullptr));
    }
    readSet(rec, buffer);
    if (buffer->number == set) VL_RET(buffer);
    at = buffer->next;
  }
  if (at) fail(l, VL_RC_CAT_INVALID);
  VL_RET(static_cast<VLMcSet *>(nullptr));
}
