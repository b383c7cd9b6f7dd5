// Code page objects: fixed header tables, the Unicode-to-code-page index with its low and
// high tables, the bounded conversion trie, width tables, and the character type trie.
#include "cpbuild.h"

#include <algorithm>
#include <functional>
#include <optional>
#include <stdexcept>
#include <tuple>
#include <unordered_map>

namespace mkdefs {

namespace {

constexpr size_t kHeader = 4376;
constexpr size_t kV1Header = 4372;
constexpr size_t kLenTable = 10, kSbcsUpper = 266, kSbcsLower = 522, kSbcsUni = 778, kSbcsType = 1292;
constexpr size_t kIndex = 2316;
constexpr size_t kFlags = 4364, kFullOff = 4366, kPairOff = 4368, kTypeTrieOff = 4370;
constexpr size_t kTypeRecOff = 4372, kValueOff = 4374;
constexpr size_t kMaxSection = 0xFFFF;
constexpr uint16_t kUtf8 = 57352;
constexpr uint16_t kNoChar = 0xFFFD;
constexpr uint32_t kUnassigned = 0x400;
constexpr uint16_t kFlagAscii = 0x0001, kFlagShift = 0x0002, kFlagOneByteTypes = 0x0004;

struct Failure : std::runtime_error {
  using std::runtime_error::runtime_error;
};

uint32_t packW(const std::string &s) {
  uint32_t w = 0;
  for (unsigned char c : s) w = w << 8 | c;
  return w;
}

std::string utf8Of(uint32_t u) {
  std::string s;
  if (u < 0x80) {
    s += static_cast<char>(u);
  } else if (u < 0x800) {
    s += static_cast<char>(0xC0 | u >> 6);
    s += static_cast<char>(0x80 | (u & 0x3F));
  } else {
    s += static_cast<char>(0xE0 | u >> 12);
    s += static_cast<char>(0x80 | (u >> 6 & 0x3F));
    s += static_cast<char>(0x80 | (u & 0x3F));
  }
  return s;
}

// Smallest mask of low bits under which [lo, hi] stays distinct (one aligned block).
uint8_t blockMask(unsigned lo, unsigned hi) {
  unsigned k = 0;
  while ((lo >> k) != (hi >> k)) ++k;
  return static_cast<uint8_t>((1u << k) - 1);
}

using Key = int64_t;
constexpr Key kAny = -1;      // slot never read
constexpr Key kAnyLeaf = -2;  // slot reachable by a byte no character uses: any leaf will do

// An append-only array into which patterns with free slots are fitted, reusing any
// stretch or tail of what is already there. This is what makes identical trie leaves
// and runs of type records shared.
class Packer {
 public:
  Packer(Key filler, std::function<bool(Key)> isLeaf = nullptr) : filler_(filler), isLeaf_(std::move(isLeaf)) {}

  size_t size() const { return arr_.size(); }
  Key at(size_t i) const { return arr_[i]; }
  void push(Key k) {
    where_[k].push_back(arr_.size());
    arr_.push_back(k);
  }
  void replace(size_t i, Key k) { arr_[i] = k; }  // only for the reserved root slot

  // Position for pat's slot 0 that appends the least.
  size_t find(const std::vector<Key> &pat) const {
    size_t first = 0;
    while (first < pat.size() && pat[first] < 0) ++first;
    const size_t n = arr_.size();
    const size_t tail = n > first ? n - first : 0;
    if (first < pat.size()) {
      auto it = where_.find(pat[first]);
      if (it != where_.end())
        for (size_t pos : it->second) {
          if (pos < first) continue;
          if (pos - first >= tail) break;
          if (fits(pat, pos - first)) return pos - first;
        }
    }
    for (size_t p = tail; p < n; ++p)
      if (fits(pat, p)) return p;
    return n;
  }
  size_t growth(const std::vector<Key> &pat, size_t p) const {
    return p + pat.size() > arr_.size() ? p + pat.size() - arr_.size() : 0;
  }
  size_t place(const std::vector<Key> &pat) {
    const size_t p = find(pat);
    for (size_t i = arr_.size() - std::min(arr_.size(), p); i < pat.size(); ++i)
      push(pat[i] < 0 ? filler_ : pat[i]);
    return p;
  }

 private:
  bool fits(const std::vector<Key> &pat, size_t p) const {
    for (size_t i = 0; i < pat.size() && p + i < arr_.size(); ++i) {
      const Key want = pat[i], have = arr_[p + i];
      if (want == kAny) continue;
      if (want == kAnyLeaf) {
        if (!isLeaf_ || !isLeaf_(have)) return false;
        continue;
      }
      if (want != have) return false;
    }
    return true;
  }

  Key filler_;
  std::function<bool(Key)> isLeaf_;
  std::vector<Key> arr_;
  std::unordered_map<Key, std::vector<size_t>> where_;
};

uint16_t index16(size_t p, const char *what) {
  if (p > 0xFFFF) throw Failure(std::string(what) + " beyond 65535");
  return static_cast<uint16_t>(p);
}

// Groups byte strings by their first byte, the rest of each string kept.
template <class V>
std::map<uint8_t, std::map<std::string, V>> byFirstByte(const std::map<std::string, V> &seqs) {
  std::map<uint8_t, std::map<std::string, V>> g;
  for (const auto &[s, v] : seqs) g[static_cast<uint8_t>(s[0])][s.substr(1)] = v;
  return g;
}

bool allOneByte(const auto &seqs) {
  return std::all_of(seqs.begin(), seqs.end(), [](const auto &kv) { return kv.first.size() == 1; });
}

// ---- Conversion trie: 6-byte nodes with bounds, then the UTF-16 values. -------------------

struct Node6 {
  uint8_t leaf, mask, lo, hi;
  uint16_t base;
  auto tie() const { return std::tie(leaf, mask, lo, hi, base); }
  bool operator<(const Node6 &o) const { return tie() < o.tie(); }
};
constexpr Node6 kEmptyLeaf{1, 0, 0xFF, 0x00, 0};  // bounds that no byte satisfies

class ConvTrie {
 public:
  ConvTrie() : values_(kNoChar), nodes_(0) {
    keyOf(kEmptyLeaf);
    nodes_.push(kAny);  // node 0 is the root, filled in last
  }

  void build(const std::map<std::string, uint16_t> &seqs) {
    Node6 root = level(seqs);
    if (root.leaf) throw Failure("conversion trie root must consume the lead byte");
    nodes_.replace(0, keyOf(root));
  }

  Bytes section(uint16_t *valueOffset) const {
    Bytes b;
    for (size_t i = 0; i < nodes_.size(); ++i) {
      const Key k = nodes_.at(i);
      const Node6 n = k < 0 ? kEmptyLeaf : list_[static_cast<size_t>(k)];
      put8(b, n.leaf);
      put8(b, n.mask);
      put8(b, n.lo);
      put8(b, n.hi);
      put16(b, n.base);
    }
    *valueOffset = index16(b.size(), "section 1 (conversion trie): value array offset");
    for (size_t i = 0; i < values_.size(); ++i) put16(b, static_cast<uint16_t>(values_.at(i)));
    return b;
  }

 private:
  Key keyOf(const Node6 &n) {
    auto [it, added] = ids_.emplace(n, static_cast<Key>(list_.size()));
    if (added) list_.push_back(n);
    return it->second;
  }

  Node6 level(const std::map<std::string, uint16_t> &seqs) {
    const uint8_t lo = static_cast<uint8_t>(seqs.begin()->first[0]);
    const uint8_t hi = static_cast<uint8_t>(seqs.rbegin()->first[0]);
    const uint8_t mask = blockMask(lo, hi);
    std::vector<Key> pat((hi & mask) + 1u, kAny);
    if (allOneByte(seqs)) {
      for (unsigned b = lo; b <= hi; ++b) pat[b & mask] = kNoChar;
      for (const auto &[s, u] : seqs) pat[static_cast<uint8_t>(s[0]) & mask] = u;
      return Node6{1, mask, lo, hi, index16(values_.place(pat), "section 1 (conversion trie): value")};
    }
    for (unsigned b = lo; b <= hi; ++b) pat[b & mask] = keyOf(kEmptyLeaf);
    for (const auto &[b, rest] : byFirstByte(seqs)) {
      if (rest.count(""))
        throw Failure("byte sequence is both a character and the prefix of another");
      pat[b & mask] = keyOf(level(rest));
    }
    return Node6{0, mask, lo, hi, index16(nodes_.place(pat), "section 1 (conversion trie): node")};
  }

  Packer values_;
  Packer nodes_;
  std::map<Node6, Key> ids_;
  std::vector<Node6> list_;
};

// ---- Type trie: 4-byte nodes without bounds, then 8-byte type records. --------------------

struct Record {
  uint32_t type;
  int32_t delta;
  bool operator<(const Record &o) const { return std::tie(type, delta) < std::tie(o.type, o.delta); }
};
constexpr Record kNoRecord{kUnassigned, 0};

struct Node4 {
  uint8_t leaf, mask;
  uint16_t base;
  bool operator<(const Node4 &o) const { return std::tie(leaf, mask, base) < std::tie(o.leaf, o.mask, o.base); }
};

class TypeTrie {
 public:
  TypeTrie()
      : recs_(0), nodes_(0, [this](Key k) {
          return k >= 0 && static_cast<size_t>(k) < nodeList_.size() && nodeList_[static_cast<size_t>(k)].leaf;
        }) {
    recKey(kNoRecord);  // key 0, the filler record
    nodeKey(Node4{1, 0, 0});  // key 0, a leaf on the filler record
    nodes_.push(kRootSlot);
  }

  // seqs: every character of more than one byte, by its bytes. oneByte: the records of
  // the one-byte characters, by byte; they take records 1 to 256, which the library reads
  // directly, and a single-byte page's root is a leaf over them.
  void build(const std::map<std::string, Record> &seqs, const std::vector<Record> &oneByte) {
    recs_.push(0);  // the filler record sits at index 0
    for (const Record &r : oneByte) recs_.push(recKey(r));
    Node4 root{1, 0xFF, 1};
    if (!seqs.empty()) {
      root = level(withKeys(seqs));
      if (root.leaf) throw Failure("type trie root must consume the lead byte");
    }
    nodes_.replace(0, nodeKey(root));
  }

  void write(Bytes &b) const {
    for (size_t i = 0; i < nodes_.size(); ++i) {
      const Node4 &n = nodeList_[static_cast<size_t>(nodes_.at(i))];
      put8(b, n.leaf);
      put8(b, n.mask);
      put16(b, n.base);
    }
  }
  void writeRecords(Bytes &b) const {
    for (size_t i = 0; i < recs_.size(); ++i) {
      const Record &r = recList_[static_cast<size_t>(recs_.at(i))];
      put32(b, r.type);
      put32(b, static_cast<uint32_t>(r.delta));
    }
  }

 private:
  static constexpr Key kRootSlot = 0x7FFFFFFF;  // never equal to a real node key

  Key recKey(const Record &r) {
    auto [it, added] = recIds_.emplace(r, static_cast<Key>(recList_.size()));
    if (added) recList_.push_back(r);
    return it->second;
  }
  Key nodeKey(const Node4 &n) {
    auto [it, added] = nodeIds_.emplace(n, static_cast<Key>(nodeList_.size()));
    if (added) nodeList_.push_back(n);
    return it->second;
  }
  std::map<std::string, Key> withKeys(const std::map<std::string, Record> &seqs) {
    std::map<std::string, Key> out;
    for (const auto &[s, r] : seqs) out[s] = recKey(r);
    return out;
  }

  // Fits slots (byte -> key) under the cheapest low-bit mask that keeps unequal keys
  // apart; bytes without a slot become free.
  std::pair<uint8_t, size_t> choose(Packer &into, const std::map<uint8_t, Key> &slots, Key freeSlot) {
    size_t bestCost = SIZE_MAX, bestPos = 0;
    uint8_t bestMask = 0xFF;
    for (unsigned k = 0; k <= 8; ++k) {
      const uint8_t mask = static_cast<uint8_t>((1u << k) - 1);
      std::vector<Key> pat(mask + 1u, freeSlot);
      bool ok = true;
      for (const auto &[b, key] : slots) {
        Key &slot = pat[b & mask];
        if (slot >= 0 && slot != key) {
          ok = false;
          break;
        }
        slot = key;
      }
      if (!ok) continue;
      const size_t p = into.find(pat);
      const size_t cost = into.growth(pat, p);
      if (cost < bestCost) {
        bestCost = cost;
        bestPos = p;
        bestMask = mask;
      }
      if (cost == 0) break;
    }
    return {bestMask, bestPos};
  }

  Node4 fitted(Packer &into, const std::map<uint8_t, Key> &slots, Key freeSlot, uint8_t leaf) {
    auto [mask, p] = choose(into, slots, freeSlot);
    std::vector<Key> pat(mask + 1u, freeSlot);
    for (const auto &[b, key] : slots) pat[b & mask] = key;
    const size_t at = into.place(pat);
    if (at != p) throw Failure("type trie placement changed between search and commit");
    return Node4{leaf, mask, index16(at, leaf ? "section 0 (body): type record" : "section 0 (body): type node")};
  }

  Node4 inner(const std::map<uint8_t, Key> &slots) { return fitted(nodes_, slots, kAnyLeaf, 0); }

  Node4 level(const std::map<std::string, Key> &seqs) {
    std::map<uint8_t, Key> slots;
    if (allOneByte(seqs)) {
      for (const auto &[s, k] : seqs) slots[static_cast<uint8_t>(s[0])] = k;
      return fitted(recs_, slots, kAny, 1);
    }
    for (const auto &[b, rest] : byFirstByte(seqs)) {
      if (rest.count("")) throw Failure("byte sequence is both a character and the prefix of another");
      slots[b] = nodeKey(level(rest));
    }
    return inner(slots);
  }

  Packer recs_;
  Packer nodes_;
  std::map<Record, Key> recIds_;
  std::vector<Record> recList_;
  std::map<Node4, Key> nodeIds_;
  std::vector<Node4> nodeList_;
};

// ---- The Unicode-to-code-page index and its two tables. ----------------------------------

struct IndexRow {
  uint8_t kind = 0, lo = 0xFF, hi = 0x00;  // empty: no low byte lies within the bounds
  std::vector<uint32_t> w;                  // W of each low byte lo..hi, substitution where unmapped
  uint16_t lowOff = 0, highOff = 0;
  size_t n() const { return w.size(); }
};

size_t lowWidth(uint8_t kind) { return kind == 0 || kind == 4 ? 1 : 2; }
size_t highWidth(uint8_t kind) { return kind == 3 ? 2 : (kind == 2 || kind == 4) ? 1 : 0; }

void buildIndex(const std::map<uint16_t, uint32_t> &fromW, uint8_t subst, Bytes &body, Bytes &low, Bytes &high) {
  std::vector<IndexRow> rows(256);
  for (const auto &[u, w] : fromW) {
    IndexRow &r = rows[u >> 8];
    const uint8_t l = static_cast<uint8_t>(u);
    if (r.w.empty()) r.lo = l;
    r.hi = l;
    r.w.resize(static_cast<size_t>(r.hi - r.lo) + 1, subst);
    r.w[l - r.lo] = w;
  }
  size_t lowSize = 0, highSize = 0;
  for (IndexRow &r : rows) {
    if (r.w.empty()) continue;
    const uint32_t top = *std::max_element(r.w.begin(), r.w.end());
    r.kind = top <= 0xFF ? 0 : top <= 0xFFFF ? 1 : top <= 0xFFFFFF ? 2 : 3;
    lowSize += r.n() * lowWidth(r.kind);
    highSize += r.n() * highWidth(r.kind);
  }
  // 16-bit rows move their high bytes to the high table (kind 4) while the low table is
  // too full, largest rows first.
  const size_t room = kMaxSection - 1024;  // slack for the padding in front of each zone
  while (lowSize > room) {
    IndexRow *best = nullptr;
    for (IndexRow &r : rows)
      if (r.kind == 1 && (!best || r.n() > best->n())) best = &r;
    if (!best) break;
    best->kind = 4;
    lowSize -= best->n();
    highSize += best->n();
  }
  // 16-bit slots come first in each table and 8-bit ones after them, so that a loader
  // converting 16-bit slots to its byte order never touches an 8-bit table.
  auto lay = [](Bytes &t, size_t width, size_t lo, size_t n) {
    size_t start = std::max(t.size(), width * lo);
    if (width == 2 && start % 2) ++start;
    t.resize(start + width * n, 0);
    if (start - width * lo > 0xFFFF) throw Failure("sections 2 and 3 (index tables): offset beyond 65535");
    return start;
  };
  for (size_t width : {2u, 1u})
    for (IndexRow &r : rows) {
      if (r.w.empty()) continue;
      if (lowWidth(r.kind) == width) {
        size_t s = lay(low, width, r.lo, r.n());
        r.lowOff = static_cast<uint16_t>(s - width * r.lo);
        for (size_t i = 0; i < r.n(); ++i) {
          const uint32_t w = r.w[i];
          if (width == 1) {
            low[s + i] = static_cast<uint8_t>(w);  // kind 0: the byte; kind 4: low byte of W
          } else {
            set16(low, s + 2 * i, static_cast<uint16_t>(w));
          }
        }
      }
      if (highWidth(r.kind) == width) {
        size_t s = lay(high, width, r.lo, r.n());
        r.highOff = static_cast<uint16_t>(s - width * r.lo);
        for (size_t i = 0; i < r.n(); ++i) {
          const uint32_t w = r.w[i];
          if (width == 1) {
            high[s + i] = static_cast<uint8_t>(r.kind == 4 ? w >> 8 : w >> 16);
          } else {
            set16(high, s + 2 * i, static_cast<uint16_t>(w >> 16));
          }
        }
      }
    }
  for (size_t h = 0; h < 256; ++h) {
    const IndexRow &r = rows[h];
    const size_t at = kIndex + 8 * h;
    body[at] = r.kind;
    body[at + 1] = 0xFF;
    body[at + 2] = r.lo;
    body[at + 3] = r.hi;
    set16(body, at + 4, r.lowOff);
    set16(body, at + 6, r.highOff);
  }
}

// ---- Putting a code page together. ----------------------------------------------------------

struct Page {
  const CpSource &src;
  const UnicodeProps &ucd;
  bool utf8;
  std::array<std::optional<uint16_t>, 256> single;  // one-byte characters
  std::map<std::string, uint16_t> multi;             // longer ones (without shift bytes)

  // The bytes of u when they decode back to u.
  std::optional<std::string> roundTrip(uint16_t u) const {
    if (utf8) {
      if (u >= 0xD800 && u <= 0xDFFF) return std::nullopt;
      return utf8Of(u);
    }
    auto f = src.fromUni.find(u);
    if (f == src.fromUni.end()) return std::nullopt;
    auto t = src.toUni.find(f->second);
    if (t == src.toUni.end() || t->second != u) return std::nullopt;
    return f->second;
  }

  Record record(const std::string &bytes, uint16_t u) const {
    const uint32_t type = ucd.typeWord[u];
    uint16_t other = u;
    if ((type & 0x002) && ucd.lower[u] != u) {
      other = ucd.lower[u];
    } else if ((type & 0x004) && ucd.upper[u] != u) {
      other = ucd.upper[u];
    }
    int32_t delta = 0;
    if (other != u) {
      auto o = roundTrip(other);
      // In a shift code page the other case must live in the same state.
      if (o && (!src.shift || o->size() == bytes.size()))
        delta = static_cast<int32_t>(packW(*o) - packW(bytes));
    }
    return Record{type, delta};
  }

  // The byte of the other case of one-byte character b, when that is a one-byte
  // character too; b itself otherwise.
  uint8_t oneByteCase(uint8_t b, const std::vector<uint16_t> &map) const {
    if (!single[b] || src.lenByLead[b] != 1) return b;
    auto o = roundTrip(map[*single[b]]);
    return o && o->size() == 1 ? static_cast<uint8_t>((*o)[0]) : b;
  }

  // Type records of the characters of more than one byte.
  std::map<std::string, Record> typeSeqs() const {
    std::map<std::string, Record> seqs;
    if (utf8) {
      for (uint32_t u = 0x80; u < 0x10000; ++u) {
        if (u >= 0xD800 && u <= 0xDFFF) continue;
        const std::string s = utf8Of(u);
        seqs[s] = record(s, static_cast<uint16_t>(u));
      }
    } else {
      for (const auto &[s, u] : multi) seqs[s] = record(s, u);
    }
    return seqs;
  }

  // Type records of the one-byte characters, by byte.
  std::vector<Record> oneByteRecords() const {
    std::vector<Record> out(256, kNoRecord);
    for (int b = 0; b < 256; ++b)
      if (single[b] && src.lenByLead[b] == 1) out[b] = record(std::string(1, static_cast<char>(b)), *single[b]);
    return out;
  }
};

void checkSource(const CpSource &s, bool utf8) {
  if (s.maxLen < 1 || s.maxLen > 4) throw Failure("maximum character length must be 1 to 4");
  if (s.shift && s.maxLen != 2) throw Failure("a shift code page has double-byte characters");
  for (int b = 0; b < 256; ++b) {
    const uint8_t l = s.lenByLead[b];
    if (l < 1 || l > s.maxLen || (s.shift && l != 1))
      throw Failure("length of lead byte " + std::to_string(b) + " is " + std::to_string(l));
  }
  if (utf8) return;
  for (const auto &[bytes, u] : s.toUni) {
    const size_t want = s.shift ? (bytes.size() == 1 ? 1 : s.maxLen) : s.lenByLead[static_cast<uint8_t>(bytes[0])];
    if (bytes.empty() || bytes.size() != want)
      throw Failure("byte sequence of " + std::to_string(bytes.size()) + " bytes disagrees with its lead byte");
    if (u >= 0xD800 && u <= 0xDFFF) throw Failure("surrogate unit among the mappings");
  }
  for (const auto &[u, bytes] : s.fromUni) {
    if (bytes.empty() || bytes.size() > s.maxLen) throw Failure("encoding of a unit has a bad length");
    if (s.shift && bytes.size() == 1 && (static_cast<uint8_t>(bytes[0]) == s.so || static_cast<uint8_t>(bytes[0]) == s.si))
      throw Failure("a unit encodes to a shift byte");
  }
}

std::string sectionName(size_t i) {
  static const char *const kNames[4] = {"section 0 (body)", "section 1 (conversion trie)",
                                        "section 2 (low table)", "section 3 (high table)"};
  return kNames[i];
}

void buildV2(const CpSource &src, const UnicodeProps &ucd, bool withTypeTrie, CpSections *out) {
  const bool utf8 = src.id == kUtf8;
  checkSource(src, utf8);
  Page page{src, ucd, utf8, {}, {}};
  if (utf8) {
    for (int b = 0; b < 0x80; ++b) page.single[b] = static_cast<uint16_t>(b);
  } else {
    for (const auto &[bytes, u] : src.toUni) {
      if (bytes.size() == 1)
        page.single[static_cast<uint8_t>(bytes[0])] = u;
      else
        page.multi[bytes] = u;
    }
  }

  Bytes body(kHeader, 0);
  body[0] = src.subst;
  body[1] = src.lf;
  body[2] = src.cr;
  body[3] = src.ls;
  body[4] = src.ps;
  body[5] = src.maxLen;
  if (src.shift) {
    body[8] = src.so;
    body[9] = src.si;
  }
  for (int b = 0; b < 256; ++b) {
    body[kLenTable + b] = src.lenByLead[b];
    const auto &u = page.single[b];
    set16(body, kSbcsUni + 2 * b, u ? *u : kNoChar);
    set32(body, kSbcsType + 4 * b, u ? ucd.typeWord[*u] : kUnassigned);
    body[kSbcsUpper + b] = page.oneByteCase(static_cast<uint8_t>(b), ucd.upper);
    body[kSbcsLower + b] = page.oneByteCase(static_cast<uint8_t>(b), ucd.lower);
  }
  uint16_t flags = static_cast<uint16_t>((src.ascii ? kFlagAscii : 0) | (src.shift ? kFlagShift : 0));

  std::map<uint16_t, uint32_t> fromW;
  if (utf8) {
    for (int u = 0; u < 0x80; ++u) fromW[static_cast<uint16_t>(u)] = static_cast<uint32_t>(u);
  } else {
    for (const auto &[u, bytes] : src.fromUni) fromW[u] = packW(bytes);
  }
  Bytes low, high, trie;
  buildIndex(fromW, src.subst, body, low, high);

  if (src.maxLen > 1) {
    if (!utf8) {
      ConvTrie conv;
      conv.build(page.multi);
      uint16_t valueOff = 0;
      trie = conv.section(&valueOff);
      set16(body, kValueOff, valueOff);
    }

    // Full-width W of each single byte.
    set16(body, kFullOff, static_cast<uint16_t>(body.size()));
    for (int b = 0; b < 256; ++b) {
      uint32_t w = 0;
      if (page.single[b] && src.lenByLead[b] == 1) {
        const uint16_t f = ucd.wide[*page.single[b]];
        if (f)
          if (auto o = page.roundTrip(f)) w = packW(*o);
      }
      put32(body, w);
    }

    // Half-width / full-width pairs, ascending by the half-width W.
    std::map<uint32_t, uint32_t> pairs;
    for (uint32_t u = 0; u < 0x10000; ++u) {
      const uint16_t f = ucd.wide[u];
      if (!f) continue;
      auto h = page.roundTrip(static_cast<uint16_t>(u));
      auto w = page.roundTrip(f);
      if (h && w) pairs.emplace(packW(*h), packW(*w));
    }
    if (!pairs.empty()) {
      set16(body, 6, index16(pairs.size(), "section 0 (body): pair"));
      set16(body, kPairOff, static_cast<uint16_t>(body.size()));
      for (const auto &[h, f] : pairs) {
        put32(body, h);
        put32(body, f);
      }
    }
  }
  if (withTypeTrie) {
    TypeTrie types;
    types.build(page.typeSeqs(), page.oneByteRecords());
    set16(body, kTypeTrieOff, index16(body.size(), "section 0 (body): type trie offset"));
    types.write(body);
    set16(body, kTypeRecOff, index16(body.size(), "section 0 (body): type record offset"));
    types.writeRecords(body);
    flags |= kFlagOneByteTypes;
  }
  set16(body, kFlags, flags);

  out->sections = {std::move(body), std::move(trie), std::move(low), std::move(high)};
}

}  // namespace

bool buildCodePage(const CpSource &src, const UnicodeProps &ucd, CpSections *out, std::string *err) {
  if (ucd.typeWord.size() < 0x10000 || ucd.upper.size() < 0x10000 || ucd.lower.size() < 0x10000 ||
      ucd.wide.size() < 0x10000) {
    *err = "Unicode data not loaded";
    return false;
  }
  try {
    CpSections built;
    // UTF-8 converts by arithmetic; its type trie is a bonus that is dropped if it cannot fit.
    std::string whyNot;
    try {
      buildV2(src, ucd, true, &built);
      if (built.sections[0].size() > kMaxSection)
        whyNot = "the body would need " + std::to_string(built.sections[0].size()) + " bytes";
    } catch (const Failure &f) {
      if (src.id != kUtf8) throw;
      whyNot = f.what();
    }
    if (src.id == kUtf8 && !whyNot.empty()) {
      buildV2(src, ucd, false, &built);
      built.note = "type trie left out: " + whyNot;
    }
    for (size_t i = 0; i < built.sections.size(); ++i)
      if (built.sections[i].size() > kMaxSection) {
        *err = src.name + ": " + sectionName(i) + " needs " + std::to_string(built.sections[i].size()) +
               " bytes, more than 65535";
        return false;
      }
    *out = std::move(built);
    return true;
  } catch (const std::exception &e) {
    *err = src.name + ": " + e.what();
    return false;
  }
}

// ---- First generation. ----------------------------------------------------------------------

namespace {

struct V2Node {
  uint8_t leaf, mask, lo, hi;
  uint16_t base;
};

// Rebuilds a bounded trie as one without bounds: every node covers all 256 bytes, and a
// byte the bounds used to refuse reaches U+FFFD.
class V1Trie {
 public:
  V1Trie(const Bytes &v2, size_t valueOff) : v2_(v2), valueOff_(valueOff) {}

  Bytes build() {
    nodes_.push_back({});  // root
    std::vector<size_t> todo = {0};
    std::vector<size_t> from = {0};
    // Breadth-first so that every node written is reachable and the last one written is
    // the last one reachable: the value array follows it.
    for (size_t i = 0; i < todo.size(); ++i) {
      const V2Node n = node(from[i]);
      const size_t self = todo[i];
      if (n.leaf) {
        nodes_[self] = {1, 0xFF, leafValues(n)};
        continue;
      }
      const size_t first = nodes_.size();
      nodes_.resize(first + 256);
      nodes_[self] = {0, 0xFF, index16(first, "first-generation node")};
      for (unsigned b = 0; b < 256; ++b) {
        if (b < n.lo || b > n.hi) {
          nodes_[first + b] = {1, 0, fffd()};
          continue;
        }
        todo.push_back(first + b);
        from.push_back(n.base + (b & n.mask));
      }
    }
    Bytes out;
    for (const Entry &e : nodes_) {
      put8(out, e.leaf);
      put8(out, e.mask);
      put16(out, e.base);
    }
    for (uint16_t v : values_) put16(out, v);
    return out;
  }

 private:
  struct Entry {
    uint8_t leaf = 1, mask = 0;
    uint16_t base = 0;
  };

  V2Node node(size_t i) const {
    if (6 * i + 6 > valueOff_) throw Failure("conversion trie node out of range");
    const uint8_t *p = v2_.data() + 6 * i;
    return V2Node{p[0], p[1], p[2], p[3], static_cast<uint16_t>(p[4] << 8 | p[5])};
  }
  uint16_t value(size_t i) const {
    const size_t at = valueOff_ + 2 * i;
    if (at + 2 > v2_.size()) throw Failure("conversion value out of range");
    return static_cast<uint16_t>(v2_[at] << 8 | v2_[at + 1]);
  }
  uint16_t fffd() {
    if (!fffdAt_) fffdAt_ = add(std::vector<uint16_t>{kNoChar});
    return *fffdAt_;
  }
  uint16_t add(const std::vector<uint16_t> &run) {
    auto it = runs_.find(run);
    if (it != runs_.end()) return it->second;
    const uint16_t at = index16(values_.size(), "first-generation value");
    values_.insert(values_.end(), run.begin(), run.end());
    runs_.emplace(run, at);
    return at;
  }
  uint16_t leafValues(const V2Node &n) {
    std::vector<uint16_t> run(256, kNoChar);
    for (unsigned b = n.lo; b <= n.hi; ++b) run[b] = value(n.base + (b & n.mask));
    return add(run);
  }

  const Bytes &v2_;
  size_t valueOff_;
  std::vector<Entry> nodes_;
  std::vector<uint16_t> values_;
  std::map<std::vector<uint16_t>, uint16_t> runs_;
  std::optional<uint16_t> fffdAt_;
};

}  // namespace

bool toGeneration1(const CpSections &v2, CpSections *out, std::string *err) {
  try {
    if (v2.sections.empty() || v2.sections[0].size() < kHeader) throw Failure("not a code page body");
    const Bytes &b2 = v2.sections[0];
    // Without the shift bytes at 8 and 9 every table moves 2 bytes down; the variable
    // tables move 4 (the value array offset is gone too).
    Bytes b1(b2.begin(), b2.begin() + 8);
    b1.insert(b1.end(), b2.begin() + 10, b2.begin() + kFullOff);
    for (size_t at = kFullOff; at < kValueOff; at += 2) {
      const uint16_t off = static_cast<uint16_t>(b2[at] << 8 | b2[at + 1]);
      put16(b1, off ? static_cast<uint16_t>(off - (kHeader - kV1Header)) : 0);
    }
    if (b1.size() != kV1Header) throw Failure("first-generation header size");
    b1.insert(b1.end(), b2.begin() + kHeader, b2.end());

    CpSections v1;
    v1.sections = v2.sections;
    v1.sections[0] = std::move(b1);
    const bool hasTrie = v2.sections.size() > 1 && !v2.sections[1].empty();
    if (hasTrie) {
      const size_t valueOff = static_cast<size_t>(b2[kValueOff] << 8 | b2[kValueOff + 1]);
      v1.sections[1] = V1Trie(v2.sections[1], valueOff).build();
    }
    for (size_t i = 0; i < v1.sections.size(); ++i)
      if (v1.sections[i].size() > kMaxSection)
        throw Failure("first-generation " + sectionName(i) + " needs " + std::to_string(v1.sections[i].size()) +
                      " bytes");
    *out = std::move(v1);
    return true;
  } catch (const std::exception &e) {
    *err = e.what();
    return false;
  }
}

}  // namespace mkdefs
