#include "cpread.h"

#include <stdexcept>
#include <vector>

namespace mkdefs {

namespace {

constexpr size_t kSbcsUni = 778, kSbcsType = 1292, kIndex = 2316, kFlags = 4364;
constexpr size_t kFullOff = 4366, kPairOff = 4368, kTypeTrieOff = 4370, kTypeRecOff = 4372, kValueOff = 4374;

const Bytes &section(const CpSections &cp, size_t i) {
  static const Bytes kNone;
  return i < cp.sections.size() ? cp.sections[i] : kNone;
}
uint8_t at8(const Bytes &b, size_t at) {
  if (at >= b.size()) throw std::out_of_range("read past the end of a section");
  return b[at];
}
uint16_t at16(const Bytes &b, size_t at) { return static_cast<uint16_t>(at8(b, at) << 8 | at8(b, at + 1)); }
uint32_t at32(const Bytes &b, size_t at) { return static_cast<uint32_t>(at16(b, at)) << 16 | at16(b, at + 2); }

}  // namespace

CpReader::CpReader(const CpSections &cp, bool v1) : cp_(cp), v1_(v1) {
  if (!v1_ || section(cp_, 1).empty()) return;
  // The first generation keeps no value array offset: the values follow the last node
  // reachable from the root.
  const Bytes &t = section(cp_, 1);
  std::vector<size_t> todo = {0};
  std::vector<bool> seen(t.size() / 4, false);
  size_t last = 0;
  for (size_t i = 0; i < todo.size(); ++i) {
    const size_t n = todo[i];
    if (n >= seen.size() || seen[n]) continue;
    seen[n] = true;
    last = std::max(last, n);
    if (at8(t, 4 * n)) continue;
    const size_t base = at16(t, 4 * n + 2), mask = at8(t, 4 * n + 1);
    for (size_t b = 0; b <= mask; ++b) todo.push_back(base + b);
  }
  v1ValueOff_ = 4 * (last + 1);
}

uint8_t CpReader::body(size_t at) const { return at8(section(cp_, 0), at >= 10 ? at - shiftDown() : at); }
uint16_t CpReader::body16(size_t at) const { return at16(section(cp_, 0), at >= 10 ? at - shiftDown() : at); }
uint32_t CpReader::body32(size_t at) const { return at32(section(cp_, 0), at >= 10 ? at - shiftDown() : at); }

uint16_t CpReader::flags() const { return body16(kFlags); }
uint16_t CpReader::offset(size_t at) const { return body16(at); }

uint16_t CpReader::singleToUnicode(uint8_t b) const { return body16(kSbcsUni + 2 * b); }
uint32_t CpReader::singleType(uint8_t b) const { return body32(kSbcsType + 4 * b); }

uint16_t CpReader::toUnicode(const std::string &bytes) const {
  const Bytes &t = section(cp_, 1);
  const size_t nodeSize = v1_ ? 4 : 6;
  const size_t valueOff = v1_ ? v1ValueOff_ : body16(kValueOff);
  size_t node = 0;
  for (size_t i = 0; i < bytes.size(); ++i) {
    const uint8_t b = static_cast<uint8_t>(bytes[i]);
    const size_t at = nodeSize * node;
    const uint8_t leaf = at8(t, at), mask = at8(t, at + 1);
    const uint8_t lo = v1_ ? 0 : at8(t, at + 2), hi = v1_ ? 255 : at8(t, at + 3);
    const uint16_t base = at16(t, at + nodeSize - 2);
    if (b < lo || b > hi) return 0xFFFD;
    if (leaf) return at16(t, valueOff + 2 * (base + (b & mask)));
    node = base + (b & mask);
  }
  return 0xFFFD;  // ran out of bytes above a leaf
}

uint32_t CpReader::fromUnicode(uint16_t unit) const {
  const size_t e = kIndex + 8 * (unit >> 8);
  const uint8_t kind = body(e), mask = body(e + 1), lo = body(e + 2), hi = body(e + 3);
  const uint8_t l = static_cast<uint8_t>(unit);
  if (l < lo || l > hi) return body(0);
  const size_t i = l & mask;
  const Bytes &low = section(cp_, 2), &high = section(cp_, 3);
  const size_t lowOff = body16(e + 4), highOff = body16(e + 6);
  switch (kind) {
    case 0: return at8(low, lowOff + i);
    case 1: return at16(low, lowOff + 2 * i);
    case 2: return at16(low, lowOff + 2 * i) + (static_cast<uint32_t>(at8(high, highOff + i)) << 16);
    case 3: return at16(low, lowOff + 2 * i) | static_cast<uint32_t>(at16(high, highOff + 2 * i)) << 16;
    case 4: return at8(low, lowOff + i) + (static_cast<uint32_t>(at8(high, highOff + i)) << 8);
    default: return 0;
  }
}

CpReader::Type CpReader::type(const std::string &bytes) const {
  const Bytes &b = section(cp_, 0);
  const size_t nodes = body16(kTypeTrieOff), recs = body16(kTypeRecOff);
  if (!nodes || !recs) throw std::runtime_error("no type trie");
  size_t node = 0;
  for (unsigned char c : bytes) {
    const uint8_t leaf = at8(b, nodes + 4 * node), mask = at8(b, nodes + 4 * node + 1);
    const size_t at = at16(b, nodes + 4 * node + 2) + (c & mask);
    if (leaf) return Type{at32(b, recs + 8 * at), static_cast<int32_t>(at32(b, recs + 8 * at + 4))};
    node = at;
  }
  throw std::runtime_error("type trie deeper than the character");
}

uint32_t CpReader::fullWidthOfByte(uint8_t b) const {
  const size_t off = body16(kFullOff);
  return off ? at32(section(cp_, 0), off + 4 * b) : 0;
}

uint32_t CpReader::halfToFull(uint32_t w) const {
  const size_t count = body16(6), off = body16(kPairOff);
  if (!count) return 0;
  size_t lo = 0, hi = count - 1;
  const Bytes &b = section(cp_, 0);
  while (lo < hi) {
    const size_t mid = (lo + hi) / 2;
    if (w <= at32(b, off + 8 * mid)) hi = mid; else lo = mid + 1;
  }
  return at32(b, off + 8 * hi) == w ? at32(b, off + 8 * hi + 4) : 0;
}

}  // namespace mkdefs
