// Makes the catalog record over an open file. In file mode the header waits for the first
// lookup; in memory mode the whole file is checked and its sets copied now, after which
// the file image is let go: lookups only read the copies.
#include "catalog/catalog.h"

VL_TRACE_MODULE("vlmcldct");

namespace {

using namespace vl::cat;

uint32_t loadSets(VLCatalog *c) {
  const auto *img = static_cast<const uint8_t *>(c->image);
  if (!headerOk(img, c->size)) return VL_RC_CAT_INVALID;
  if (uint32_t rc = headerLocale(img, &c->catLocale)) return rc;
  const uint32_t count = vl::rd32(img + 12);
  c->sets = static_cast<VLMcSet *>(vl::allocZero(sizeof(VLMcSet) * count));
  if (!c->sets) return VL_RC_NOMEM;
  c->setCount = count;
  uint32_t at = vl::rd32(img + 16), last = 0;
  // Exactly `count` records, ascending, each inside the file: a chain that loops, runs
  // short or runs on is refused.
  for (uint32_t i = 0; i < count; ++i) {
    if (!at || !within(at, kSetRec, c->size)) return VL_RC_CAT_INVALID;
    VLMcSet *s = c->sets + i;
    readSet(img + at, s);
    if (s->number <= last) return VL_RC_CAT_INVALID;
    last = s->number;
    if (!VLMcLoadSet(c, s)) return static_cast<uint32_t>(reportTo(c)->lastError);
    at = s->next;
  }
  return at ? VL_RC_CAT_INVALID : VL_RC_OK;
}

}  // namespace

VLCatalog *VLMcLoadCat(VLLocale *locale, VLFile *file, uint32_t options) {
  VL_FLOW("VLMcLoadCat");
  VLLocale *l = vl::orDefault(locale);
  const int64_t size = file ? VLFileSize(file) : -1;
  if (size < 0 || size > INT32_MAX) {
    fail(l, VL_RC_CAT_INVALID);
    VL_RET(static_cast<VLCatalog *>(nullptr));
  }
  auto *c = static_cast<VLCatalog *>(vl::allocZero(sizeof(VLCatalog)));
  if (!c) {
    fail(l, VL_RC_NOMEM);
    VL_RET(c);
  }
  c->size = static_cast<uint32_t>(size);
  c->file = file;
  c->locale = l;
  c->inMemory = (options & kOneMask) == kOneMask;
  vl::setRc(l, VL_RC_OK);
  if (!c->inMemory) VL_RET(c);

  uint32_t rc = VL_RC_CAT_INVALID;
  if (c->size >= kHeader) {
    c->image = VLLoadFile(file, 0, c->size, &rc);
    if (c->image) rc = loadSets(c);
  }
  VLUnloadFile(c->image);
  c->image = nullptr;
  if (rc != VL_RC_OK) {
    VL_ERR("Catalog refused, rc = %u", rc);
    dispose(c);
    fail(l, rc);
    VL_RET(static_cast<VLCatalog *>(nullptr));
  }
  VL_RET(c);
}
