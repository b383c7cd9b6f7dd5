#include "tools/tlx/catfile.h"

#include <cstring>

#include "veltrin.h"

namespace catfile {

namespace {
void put32(std::string &s, size_t at, uint32_t v) { std::memcpy(&s[at], &v, 4); }
uint32_t get32(const std::string &s, uint64_t at) {
  uint32_t v;
  std::memcpy(&v, s.data() + at, 4);
  return v;
}
}  // namespace

std::string write(const Catalog &c) {
  std::map<uint32_t, std::map<uint32_t, std::string>> sets;
  for (const auto &[n, msgs] : c.sets)
    if (!msgs.empty()) sets[n] = msgs;
  if (sets.empty()) sets[1];  // a catalog holds at least one set
  std::string f(VL_CAT_HEADER, '\0');
  put32(f, 0, VL_CAT_MAGIC);
  put32(f, 4, VL_CAT_VERSION);
  put32(f, 8, static_cast<uint32_t>(VLMcGetByteOrder()));
  put32(f, 12, static_cast<uint32_t>(sets.size()));
  put32(f, 16, VL_CAT_HEADER);
  std::memcpy(&f[20], c.locale.data(), std::min<size_t>(c.locale.size(), VL_CAT_LOCALENAME - 1));
  size_t k = 0;
  for (const auto &[n, msgs] : sets) {
    const size_t rec = f.size(), index = rec + VL_CAT_SETRECORD, text = index + msgs.size() * VL_CAT_INDEXENTRY;
    f.resize(text);
    std::string block;
    size_t e = index;
    for (const auto &[m, t] : msgs) {
      put32(f, e, m);
      put32(f, e + 4, static_cast<uint32_t>(t.size()));
      put32(f, e + 8, static_cast<uint32_t>(block.size()));
      block += t;
      block += '\0';
      e += VL_CAT_INDEXENTRY;
    }
    f += block;
    put32(f, rec, n);
    put32(f, rec + 4, ++k < sets.size() ? static_cast<uint32_t>(f.size()) : 0u);
    put32(f, rec + 8, static_cast<uint32_t>(msgs.size()));
    put32(f, rec + 12, static_cast<uint32_t>(index));
    put32(f, rec + 16, static_cast<uint32_t>(text));
    put32(f, rec + 20, static_cast<uint32_t>(block.size()));
  }
  return f;
}

bool parse(const std::string &b, Catalog *c, std::string *why) {
  if (b.empty()) return true;
  if (b.size() < VL_CAT_HEADER || get32(b, 0) != VL_CAT_MAGIC || get32(b, 4) != VL_CAT_VERSION ||
      get32(b, 8) != static_cast<uint32_t>(VLMcGetByteOrder())) {
    *why = "not a catalog of this host";
    return false;
  }
  c->locale.assign(b.data() + 20, strnlen(b.data() + 20, VL_CAT_LOCALENAME));
  uint64_t at = get32(b, 16);
  for (uint32_t i = 0, n = get32(b, 12); i < n; ++i) {
    if (at + VL_CAT_SETRECORD > b.size()) return *why = "set record outside the file", false;
    const uint32_t set = get32(b, at), count = get32(b, at + 8);
    const uint64_t index = get32(b, at + 12), text = get32(b, at + 16), size = get32(b, at + 20);
    if (index + uint64_t{count} * VL_CAT_INDEXENTRY > b.size() || text + size > b.size())
      return *why = "set outside the file", false;
    auto &msgs = c->sets[set];
    for (uint32_t k = 0; k < count; ++k) {
      const uint64_t e = index + uint64_t{k} * VL_CAT_INDEXENTRY;
      const uint64_t len = get32(b, e + 4), off = get32(b, e + 8);
      if (off + len > size) return *why = "text outside its block", false;
      msgs[get32(b, e)] = b.substr(text + off, len);
    }
    at = get32(b, at + 4);
  }
  return true;
}

}  // namespace catfile
