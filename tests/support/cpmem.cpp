#include "support/cpmem.h"

#include "codepage/cpbody.h"
#include "store/store.h"

namespace cpmem {

namespace cp = vl::cp;

void add16(Bytes &b, uint16_t v) { b.insert(b.end(), {static_cast<uint8_t>(v >> 8), static_cast<uint8_t>(v)}); }
static void add32(Bytes &b, uint32_t v) {
  add16(b, static_cast<uint16_t>(v >> 16));
  add16(b, static_cast<uint16_t>(v));
}
static void set16(Bytes &b, size_t at, size_t v) {
  b[at] = static_cast<uint8_t>(v >> 8);
  b[at + 1] = static_cast<uint8_t>(v);
}

Page::Page() {
  len.fill(1);
  for (unsigned i = 0; i < 256; ++i) uni[i] = i < 0x80 ? static_cast<uint16_t>(i) : 0xFFFD;
  index.fill(Index{0, 0, 1, 0, 0, 0});
}

std::vector<Bytes> Page::sections() const {
  Bytes b = {subst, 0x0A, 0x0D, 0x0A, 0x0A, maxLen};
  add16(b, static_cast<uint16_t>(pairs.size()));
  b.insert(b.end(), {so, si});
  b.insert(b.end(), len.begin(), len.end());
  b.resize(cp::kSbcsUni, 0);
  for (uint16_t u : uni) add16(b, u);
  add16(b, 0);
  for (int i = 0; i < 256; ++i) add32(b, 0x400);
  for (const Index &x : index) {
    b.insert(b.end(), {x.kind, x.mask, x.lo, x.hi});
    add16(b, x.low);
    add16(b, x.high);
  }
  add16(b, flags);
  b.resize(cp::kHeader, 0);
  auto table = [&b](uint32_t at) {
    b.resize((b.size() + 3) & ~size_t{3}, 0);
    set16(b, at, b.size());
  };
  if (!full.empty()) table(cp::kFullOff);
  for (uint32_t v : full) add32(b, v);
  if (!pairs.empty()) table(cp::kPairOff);
  for (auto [h, f] : pairs) add32(b, h), add32(b, f);
  if (!typeNodes.empty()) table(cp::kTypeTrieOff);
  for (const TypeNode &n : typeNodes) b.insert(b.end(), {n.leaf, n.mask}), add16(b, n.base);
  if (!records.empty()) table(cp::kTypeRecOff);
  for (const VLCtypeRecord &r : records) add32(b, r.type), add32(b, static_cast<uint32_t>(r.caseDelta));
  Bytes t;
  for (const Node &n : nodes) t.insert(t.end(), {n.leaf, n.mask, n.lo, n.hi}), add16(t, n.base);
  if (!nodes.empty()) set16(b, cp::kValueOff, t.size());
  for (uint16_t v : values) add16(t, v);
  return {b, t, low, high};
}

Loaded::Loaded(const std::vector<Bytes> &sections, uint16_t id) : data(sections) {
  entry.id = id;
  entry.type = VL_OBJ_CODEPAGE;
  for (size_t i = 0; i < 4 && i < data.size(); ++i) {
    entry.section[i] = data[i].empty() ? nullptr : data[i].data();
    entry.sectionSize[i] = static_cast<uint16_t>(data[i].size());
  }
  rc = vl::store::checkObject(&entry);
}

}  // namespace cpmem
