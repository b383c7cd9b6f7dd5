// Loads one set of an in-memory catalog: its own copies of the text block and the index,
// every entry checked once here so that lookups can trust them.
#include "catalog/catalog.h"

VL_TRACE_MODULE("vlmcldst");

VLMcSet *VLMcLoadSet(VLCatalog *catalog, VLMcSet *set) {
  VL_FLOW("VLMcLoadSet");
  using namespace vl::cat;
  VLLocale *l = reportTo(catalog);
  if (!catalog || !set || !catalog->image) VL_RET(static_cast<VLMcSet *>(nullptr));
  const auto *file = static_cast<const uint8_t *>(catalog->image);
  const uint32_t size = catalog->size;
  if (!within(set->textOffset, set->textSize, size) ||
      !within(set->indexOffset, uint64_t{set->count} * kEntry, size)) {
    VL_ERR("Set %u lies outside the catalog", set->number);
    fail(l, VL_RC_CAT_INVALID);
    VL_RET(static_cast<VLMcSet *>(nullptr));
  }
  vl::Block<char> text(size_t{set->textSize ? set->textSize : 1u});
  vl::Block<VLMcMsg> index(sizeof(VLMcMsg) * (set->count ? set->count : 1u));
  if (!text || !index) {
    fail(l, VL_RC_NOMEM);
    VL_RET(static_cast<VLMcSet *>(nullptr));
  }
  std::memcpy(text.get(), file + set->textOffset, set->textSize);
  const uint8_t *e = file + set->indexOffset;
  uint32_t last = 0;
  for (uint32_t i = 0; i < set->count; ++i, e += kEntry) {
    const uint32_t number = vl::rd32(e), length = vl::rd32(e + 4), at = vl::rd32(e + 8);
    // Ascending numbers for the search; each text inside the block and followed by its 0.
    if (number <= last || uint64_t{at} + length >= set->textSize || text.get()[at + length] != 0) {
      VL_ERR("Message %u of set %u is out of order or outside its text block", number, set->number);
      fail(l, VL_RC_CAT_INVALID);
      VL_RET(static_cast<VLMcSet *>(nullptr));
    }
    last = number;
    // The length a caller sees: up to the first 0, as the text is used as a C string.
    const char *t = text.get() + at;
    index.get()[i] = VLMcMsg{number, static_cast<uint32_t>(strnlen(t, length)), t};
  }
  set->text = text.take();
  set->index = index.take();
  VL_RET(set);
}
