// Finds a message of a set: a bounded search of the loaded index, or a read of the file's
// index and a copy of the text the caller frees with VLMcFree.
#include "catalog/catalog.h"

VL_TRACE_MODULE("mcgetmsg");

namespace {

using namespace vl::cat;

char *fromFile(VLCatalog *c, const VLMcSet *s, uint32_t message, VLLocale *l) {
  if (!s->textSize) return nullptr;
  if (!within(s->textOffset, s->textSize, c->size) || !within(s->indexOffset, uint64_t{s->count} * kEntry, c->size)) {
    fail(l, VL_RC_CAT_INVALID);
    return nullptr;
  }
  // The text of the entry found, copied for the caller.
  auto take = [&](const uint8_t *e) -> char * {
    const uint32_t length = vl::rd32(e + 4), at = vl::rd32(e + 8);
    if (!within(at, length, s->textSize)) {
      fail(l, VL_RC_CAT_INVALID);
      return nullptr;
    }
    auto *text = static_cast<char *>(vl::alloc(length + size_t{1}));
    if (!text) {
      fail(l, VL_RC_NOMEM);
      return nullptr;
    }
    if (length && !readAt(c, uint64_t{s->textOffset} + at, text, length)) {
      vl::release(text);
      fail(l, VL_RC_CAT_INVALID);
      return nullptr;
    }
    text[length] = 0;
    return text;
  };
  // Numbers are usually dense from 1: the entry where the message would then be is read
  // first, the index in blocks after that, so that a lookup costs few reads.
  uint8_t one[kEntry];
  if (message - 1 < s->count && readAt(c, s->indexOffset + uint64_t{message - 1} * kEntry, one, kEntry) &&
      vl::rd32(one) == message)
    return take(one);
  constexpr uint32_t kBlock = 64;
  uint8_t block[kBlock * kEntry];
  for (uint32_t i = 0; i < s->count; i += kBlock) {
    const uint32_t n = s->count - i < kBlock ? s->count - i : kBlock;
    if (!readAt(c, s->indexOffset + uint64_t{i} * kEntry, block, n * kEntry)) {
      fail(l, VL_RC_CAT_INVALID);
      return nullptr;
    }
    for (uint32_t k = 0; k < n; ++k)
      if (vl::rd32(block + k * kEntry) == message) return take(block + k * kEntry);
  }
  return nullptr;
}

}  // namespace

char *MCGetMsg(VLCatalog *catalog, VLMcSet *set, uint32_t message) {
  VL_FLOW("MCGetMsg");
  if (!catalog || !set || message < 1) VL_RET(static_cast<char *>(nullptr));
  if (catalog->inMemory) {
    const VLMcMsg *m = bounded(set->index, set->count, message);
    VL_RET(m ? const_cast<char *>(m->text) : static_cast<char *>(nullptr));
  }
  VL_RET(fromFile(catalog, set, message, reportTo(catalog)));
}
