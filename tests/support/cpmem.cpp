#include "support/cpmem.h"

#include <algorithm>
#include <fstream>
#include <stdexcept>

#include "codepage/cpbody.h"
#include "store/store.h"

namespace cpmem {

namespace cp = vl::cp;

void add16(Bytes &b, uint16_t v) {
  b.push_back(static_cast<uint8_t>(v >> 8));
  b.push_back(static_cast<uint8_t>(v));
}
void add32(Bytes &b, uint32_t v) {
  add16(b, static_cast<uint16_t>(v >> 16));
  add16(b, static_cast<uint16_t>(v));
}
static void set16(Bytes &b, size_t at, uint16_t v) {
  b[at] = static_cast<uint8_t>(v >> 8);
  b[at + 1] = static_cast<uint8_t>(v);
}
static uint16_t get16(const Bytes &b, size_t at) { return static_cast<uint16_t>(b[at] << 8 | b[at + 1]); }

Page::Page() {
  len.fill(1);
  type.fill(0x400);
  for (unsigned i = 0; i < 256; ++i) uni[i] = i < 0x80 ? static_cast<uint16_t>(i) : 0xFFFD;
  index.fill(Index{0, 0, 1, 0, 0, 0});
}

std::vector<Bytes> Page::sections() const {
  Bytes b;
  for (uint8_t v : {subst, lf, cr, ls, ps, maxLen}) b.push_back(v);
  add16(b, static_cast<uint16_t>(pairs.size()));
  b.push_back(so);
  b.push_back(si);
  b.insert(b.end(), len.begin(), len.end());
  b.resize(cp::kSbcsUni, 0);
  for (uint16_t u : uni) add16(b, u);
  add16(b, 0);
  for (uint32_t t : type) add32(b, t);
  for (const Index &x : index) {
    for (uint8_t v : {x.kind, x.mask, x.lo, x.hi}) b.push_back(v);
    add16(b, x.low);
    add16(b, x.high);
  }
  add16(b, flags);
  b.resize(cp::kHeader, 0);
  auto table = [&b](uint32_t at) {
    b.resize((b.size() + 3) & ~size_t{3}, 0);
    set16(b, at, static_cast<uint16_t>(b.size()));
  };
  if (!full.empty()) {
    table(cp::kFullOff);
    for (uint32_t v : full) add32(b, v);
  }
  if (!pairs.empty()) {
    table(cp::kPairOff);
    for (auto [h, f] : pairs) {
      add32(b, h);
      add32(b, f);
    }
  }
  if (!typeNodes.empty()) {
    table(cp::kTypeTrieOff);
    for (const TypeNode &n : typeNodes) {
      b.push_back(n.leaf);
      b.push_back(n.mask);
      add16(b, n.base);
    }
    table(cp::kTypeRecOff);
    for (const VLCtypeRecord &r : records) {
      add32(b, r.type);
      add32(b, static_cast<uint32_t>(r.caseDelta));
    }
  }
  Bytes t;
  for (const Node &n : nodes) {
    for (uint8_t v : {n.leaf, n.mask, n.lo, n.hi}) t.push_back(v);
    add16(t, n.base);
  }
  if (!nodes.empty()) set16(b, cp::kValueOff, static_cast<uint16_t>(t.size()));
  for (uint16_t v : values) add16(t, v);
  return {b, t, low, high};
}

std::vector<Bytes> toGen1(const std::vector<Bytes> &v2) {
  const Bytes &b = v2[0];
  Bytes v1(b.begin(), b.begin() + cp::kShiftOut);
  v1.insert(v1.end(), b.begin() + cp::kLenTable, b.begin() + cp::kFullOff);
  for (uint32_t at = cp::kFullOff; at < cp::kValueOff; at += 2) {
    uint16_t o = get16(b, at);
    add16(v1, o ? static_cast<uint16_t>(o - 4) : 0);
  }
  v1.insert(v1.end(), b.begin() + cp::kHeader, b.end());
  Bytes t;
  const Bytes &t2 = v2[1];
  uint16_t valueOff = t2.empty() ? 0 : get16(b, cp::kValueOff);
  for (size_t n = 0; n < valueOff; n += cp::kNodeSize) {
    if (t2[n + 2] != 0 || t2[n + 3] != 0xFF) throw std::invalid_argument("bounded node");
    for (size_t k : {0, 1, 4, 5}) t.push_back(t2[n + k]);
  }
  t.insert(t.end(), t2.begin() + valueOff, t2.end());
  return {v1, t, v2[2], v2[3]};
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

Bytes container(const std::vector<Bytes> &sections, uint32_t generation) {
  Bytes f;
  add32(f, vl::store::kMagic);
  add32(f, generation << 28);
  add16(f, static_cast<uint16_t>(sections.size()));
  uint32_t at = vl::store::kHeaderSize;
  for (size_t i = 0; i < 4; ++i) {
    uint32_t size = i < sections.size() ? static_cast<uint32_t>(sections[i].size()) : 0;
    add16(f, static_cast<uint16_t>(size));
    if (i) add16(f, 0);
    add32(f, at);
    at += size;
  }
  f.resize(vl::store::kHeaderSize, 0);
  for (const Bytes &s : sections) f.insert(f.end(), s.begin(), s.end());
  return f;
}

Bytes control(std::vector<std::pair<uint16_t, std::string>> codePages) {
  std::sort(codePages.begin(), codePages.end());
  Bytes rows;
  for (const auto &[id, name] : codePages) {
    add16(rows, id);
    rows.push_back(VL_OBJ_CODEPAGE);
    rows.push_back(0);
    Bytes n(name.begin(), name.end());
    n.resize(34, 0);
    rows.insert(rows.end(), n.begin(), n.end());
  }
  return container({rows}, 2);
}

void writeFile(const std::string &path, const Bytes &data) {
  std::ofstream out(path, std::ios::binary);
  out.write(reinterpret_cast<const char *>(data.data()), static_cast<std::streamsize>(data.size()));
  if (!out) throw std::runtime_error("cannot write " + path);
}

}  // namespace cpmem
