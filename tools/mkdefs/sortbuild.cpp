// Sort objects from the collation sources. The source gives every character lists of
// symbols per level; the object has per unit at most two elements of one 16-bit primary,
// one 8-bit secondary and tertiary, and a 16-bit fourth-level weight for characters that
// weigh nothing on the first three levels. Primaries are the dense ranks of the symbols
// used; secondary and tertiary lists are ranked as whole sequences so that "<BASE><TREMA>"
// stays one value ordered after "<BASE>".
#include "sortbuild.h"

#include <algorithm>
#include <set>
#include <sstream>

#include "collsrc.h"

namespace mkdefs {
namespace {

struct SortSpec {
  uint16_t id;
  const char *name;
  const char *source;
};
// Ids never change once given; new sorts take the next number.
const SortSpec kSorts[] = {
    {1, "Default", "iso14651_t1"}, {2, "Croatian", "hr_HR"},   {3, "Czech", "cs_CZ"},
    {4, "Danish", "da_DK"},        {5, "Finnish", "fi_FI"},    {6, "Hungarian", "hu_HU"},
    {7, "Icelandic", "is_IS"},     {8, "Norwegian", "nb_NO"},  {9, "Polish", "pl_PL"},
    {10, "Slovak", "sk_SK"},       {11, "Slovenian", "sl_SI"}, {12, "Spanish", "es_ES"},
    {13, "Swedish", "sv_SE"},      {14, "Turkish", "tr_TR"},   {15, "Estonian", "et_EE"},
    {16, "Lithuanian", "lt_LT"},   {17, "Latvian", "lv_LV"},   {18, "Ukrainian", "uk_UA"},
};

struct NativeRow {
  const char *native, *language, *territory, *codePage, *sort;
};
const NativeRow kRows[] = {
#include "locale/nattab.inc"
};

using Seq = std::vector<uint32_t>;

// One unit or pair of the source, its levels resolved to order positions.
struct Item {
  char32_t u1 = 0, u2 = 0;  // u2 != 0: a two-unit combination
  std::array<Seq, 4> lv;
  uint8_t cls = 0xF;
};

struct Counts {
  size_t longContractions = 0, longExpansions = 0, beyondBmp = 0, merged = 0, unknown = 0, approximated = 0;
  size_t splitLevels = 0, codeOrder = 0;
};

// Ranks of distinct sequences, 1-based, in lexicographic order (a prefix first). Ranks
// beyond limit share the last value.
std::map<Seq, uint32_t> rank(const std::set<Seq> &all, uint32_t limit, size_t *merged) {
  std::map<Seq, uint32_t> r;
  uint32_t n = 0;
  for (const Seq &s : all) {
    if (n < limit) ++n; else ++*merged;
    r[s] = n;
  }
  return r;
}

struct Elem {
  uint16_t p = 0;
  uint8_t s = 0, t = 0;
  uint16_t q = 0;
};

bool buildOne(const coll::Table &t, SortBody *body, Counts *c, std::string *err) {
  std::map<std::string, uint32_t> ord;
  uint32_t n = 0;
  for (const coll::Entry &e : t.order) ord[e.name] = ++n;

  std::vector<Item> items;
  for (const coll::Entry &e : t.order) {
    Item it;
    char32_t ch = coll::charOf(e.name);
    if (ch) {
      if (ch > 0xFFFF) { ++c->beyondBmp; continue; }
      if (ch >= 0xD800 && ch <= 0xDFFF) continue;
      it.u1 = ch;
    } else {
      auto el = t.elements.find(e.name);
      if (el == t.elements.end()) continue;  // a symbol, weighs only through others
      if (el->second.size() != 2) { ++c->longContractions; continue; }
      if (el->second[0] > 0xFFFF || el->second[1] > 0xFFFF) { ++c->beyondBmp; continue; }
      it.u1 = el->second[0];
      it.u2 = el->second[1];
    }
    for (int l = 0; l < 4; ++l) {
      const std::vector<std::string> self{e.name};
      for (const std::string &s : e.weighed ? e.level[l] : self) {
        auto o = ord.find(s);
        if (o == ord.end()) { ++c->unknown; continue; }
        it.lv[l].push_back(o->second);
      }
    }
    if (e.section >= 0) {
      const auto &fw = t.forward[static_cast<size_t>(e.section)];
      it.cls = static_cast<uint8_t>((fw[0] ? 8 : 0) | (fw[1] ? 4 : 0) | (fw[2] ? 2 : 0) | (fw[3] ? 1 : 0));
    }
    if (it.lv[0].size() > 2) { ++c->longExpansions; it.lv[0].resize(2); }
    items.push_back(std::move(it));
  }

  // Split secondary and tertiary sequences between the elements of an expansion.
  auto part = [](const Item &it, int l, int el) -> Seq {
    const Seq &s = it.lv[l];
    if (it.lv[0].size() < 2) return el == 0 ? s : Seq{};
    if (s.empty()) return {};
    return el == 0 ? Seq{s[0]} : Seq(s.begin() + 1, s.end());
  };
  std::set<uint32_t> prims;
  std::set<Seq> secs, ters;
  for (const Item &it : items) {
    for (uint32_t p : it.lv[0]) prims.insert(p);
    for (int el = 0; el < 2; ++el) {
      Seq s = part(it, 1, el), tt = part(it, 2, el);
      if (!s.empty()) secs.insert(s);
      if (!tt.empty()) ters.insert(tt);
    }
  }
  if (prims.size() > 0xFF00) {
    *err = std::to_string(prims.size()) + " primary weights do not fit 16 bits";
    return false;
  }
  std::map<uint32_t, uint16_t> prank;
  // From 0x100: the high byte of a primary in a key never equals the 0x00 separator.
  uint16_t pr = 0xFF;
  for (uint32_t p : prims) prank[p] = ++pr;
  const auto srank = rank(secs, 255, &c->merged), trank = rank(ters, 255, &c->merged);
  std::set<uint32_t> fourths;
  for (const Item &it : items)
    if (it.lv[0].empty() && it.lv[1].empty() && it.lv[2].empty() && !it.lv[3].empty()) fourths.insert(it.lv[3][0]);
  std::map<uint32_t, uint16_t> qrank;
  uint16_t qr = 0;
  for (uint32_t q : fourths) qrank[q] = ++qr;

  auto elems = [&](const Item &it, Elem out[2]) -> int {
    if (it.lv[0].empty() && it.lv[1].empty() && it.lv[2].empty()) {
      if (it.lv[3].empty()) return 0;
      out[0].q = qrank.at(it.lv[3][0]);
      return 1;
    }
    int count = it.lv[0].size() == 2 ? 2 : 1;
    for (int el = 0; el < count; ++el) {
      if (el < static_cast<int>(it.lv[0].size())) out[el].p = prank.at(it.lv[0][static_cast<size_t>(el)]);
      Seq s = part(it, 1, el), tt = part(it, 2, el);
      out[el].s = s.empty() ? 0 : static_cast<uint8_t>(srank.at(s));
      out[el].t = tt.empty() ? 0 : static_cast<uint8_t>(trank.at(tt));
    }
    return count;
  };

  std::map<uint8_t, size_t> sFreq, tFreq;
  struct Unit {
    bool listed = false;
    int count = 0;
    Elem e[2];
    uint8_t cls = 0xF;
  };
  std::vector<Unit> units(0x10000);
  for (const Item &it : items) {
    Elem e[2];
    int k = elems(it, e);
    if (it.u2) {
      // A pair that expands to two elements (the reordering vowel pairs of Thai and its
      // neighbours) cannot be held; left out, its units weigh one by one.
      if (k == 2) {
        ++c->splitLevels;
        continue;
      }
      uint16_t flags = static_cast<uint16_t>(it.cls << 10 | (e[0].q ? 0x8000 : 0));
      body->combinations.push_back({static_cast<uint16_t>(it.u1), static_cast<uint16_t>(it.u2),
                                    e[0].q ? e[0].q : e[0].p, e[0].s, e[0].t, flags});
      continue;
    }
    Unit &u = units[it.u1];
    u.listed = true;
    u.count = k;
    u.e[0] = e[0];
    u.e[1] = e[1];
    u.cls = it.cls;
    for (int el = 0; el < k; ++el) {
      if (e[el].s) ++sFreq[e[el].s];
      if (e[el].t) ++tFreq[e[el].t];
    }
  }
  // Leaving trailing defaults out keeps the order only when the default is the lowest
  // weight of its level; a tailoring that puts capitals first gets no default.
  auto mostCommon = [](const std::map<uint8_t, size_t> &f) {
    uint8_t best = 0;
    size_t bn = 0;
    for (auto [v, k] : f)
      if (k > bn) best = v, bn = k;
    return best == 1 ? best : uint8_t{0};
  };
  body->defSec = mostCommon(sFreq);
  body->defTer = mostCommon(tFreq);
  // Ascending and unique, as lookups halve the table; a pair named twice keeps its first.
  std::stable_sort(body->combinations.begin(), body->combinations.end(),
                   [](const auto &a, const auto &b) { return std::tie(a.u1, a.u2) < std::tie(b.u1, b.u2); });
  body->combinations.erase(std::unique(body->combinations.begin(), body->combinations.end(),
                                       [](const auto &a, const auto &b) { return a.u1 == b.u1 && a.u2 == b.u2; }),
                           body->combinations.end());

  // Blocks: ignorable when nothing in them weighs, arithmetic when every listed unit is a
  // lone primary that follows its code, else 256 entries of the weight table (identical
  // blocks share them). Table blocks are taken by priority while the body fits one
  // section; the rest sort after everything else in code order.
  struct Candidate {
    unsigned hi;
    uint8_t cls;
    size_t listed;
    std::vector<SortBody::Weight> ws;
    std::vector<SortBody::Expansion> xs;
  };
  std::vector<Candidate> table;
  for (unsigned hi = 0; hi < 256; ++hi) {
    SortBody::Block &blk = body->blocks[hi];
    bool arith = true;
    int base = -1;
    size_t listed = 0;
    uint8_t cls = 0xF;
    for (unsigned lo = 0; lo < 256; ++lo) {
      const Unit &u = units[hi << 8 | lo];
      if (!u.listed || u.count == 0) continue;
      if (!listed++) cls = u.cls;
      if (u.count != 1 || u.e[0].s || u.e[0].t || u.e[0].q || !u.e[0].p || u.cls != cls ||
          (base >= 0 && base != u.e[0].p - static_cast<int>(lo)) || u.e[0].p < static_cast<int>(lo))
        arith = false;
      base = u.e[0].p - static_cast<int>(lo);
    }
    if (!listed) {
      blk.flags = 0x01;
      continue;
    }
    if (arith && base + 255 <= 0xFFFF) {
      c->approximated += 256 - listed;
      blk = {0x02, cls, static_cast<uint16_t>(base)};
      continue;
    }
    Candidate cand{hi, cls, listed, {}, {}};
    for (unsigned lo = 0; lo < 256; ++lo) {
      const char32_t unit = hi << 8 | lo;
      const Unit &u = units[unit];
      SortBody::Weight w;
      if (u.count == 2) {
        w.flags = static_cast<uint16_t>(u.cls << 10 | 0x4000);
        cand.xs.push_back({static_cast<uint16_t>(unit), u.e[0].p, u.e[0].s, u.e[0].t, u.e[1].p, u.e[1].s, u.e[1].t});
      } else if (u.count == 1) {
        w = {u.e[0].q ? u.e[0].q : u.e[0].p, u.e[0].s, u.e[0].t,
             static_cast<uint16_t>(u.cls << 10 | (u.e[0].q ? 0x8000 : 0))};
      }
      cand.ws.push_back(w);
    }
    table.push_back(std::move(cand));
  }
  static const unsigned kFirst[] = {0x00, 0x01, 0x02, 0x03, 0x04, 0x1E, 0x20, 0x05, 0x1F, 0x21, 0x30, 0xFF};
  auto prio = [](unsigned hi) {
    const auto *f = std::find(std::begin(kFirst), std::end(kFirst), hi);
    return f == std::end(kFirst) ? 100 : static_cast<int>(f - std::begin(kFirst));
  };
  std::stable_sort(table.begin(), table.end(), [&](const Candidate &a, const Candidate &b) {
    return prio(a.hi) != prio(b.hi) ? prio(a.hi) < prio(b.hi) : a.listed > b.listed;
  });
  std::map<std::vector<uint16_t>, uint16_t> shared;
  size_t bytes = 1036 + body->combinations.size() * 10;
  uint32_t nextPrimary = pr + 1u;
  std::vector<unsigned> dropped;
  for (const Candidate &cand : table) {
    std::vector<uint16_t> key;
    for (const auto &w : cand.ws) key.insert(key.end(), {w.word, static_cast<uint16_t>(w.sec << 8 | w.ter), w.flags});
    // Expanding units differ only by their expansion entries, so they never share.
    auto found = cand.xs.empty() ? shared.find(key) : shared.end();
    if (found != shared.end()) {
      body->blocks[cand.hi] = {0, cand.cls, found->second};
      continue;
    }
    const size_t cost = cand.ws.size() * 6 + cand.xs.size() * 14;
    if (bytes + cost > 0xFFFF) {
      dropped.push_back(cand.hi);
      continue;
    }
    bytes += cost;
    const auto at = static_cast<uint16_t>(body->weights.size());
    if (cand.xs.empty()) shared[key] = at;
    body->weights.insert(body->weights.end(), cand.ws.begin(), cand.ws.end());
    body->expansions.insert(body->expansions.end(), cand.xs.begin(), cand.xs.end());
    body->blocks[cand.hi] = {0, cand.cls, at};
  }
  std::sort(dropped.begin(), dropped.end());
  for (unsigned hi : dropped) {
    if (nextPrimary + 255 > 0xFFFF) {
      *err = "no primary weights left for the blocks beyond the weight table";
      return false;
    }
    body->blocks[hi] = {0x02, 0xF, static_cast<uint16_t>(nextPrimary)};
    nextPrimary += 256;
    c->codeOrder += 256;
  }
  std::sort(body->expansions.begin(), body->expansions.end(),
            [](const auto &a, const auto &b) { return a.unit < b.unit; });
  return true;
}

}  // namespace

std::string sortOfLanguage(const std::string &language) {
  for (const NativeRow &r : kRows)
    if (r.language == language && std::string(r.sort) != "Binary") return r.sort;
  return {};
}

bool buildSorts(const std::string &localeSrcDir, std::vector<SortObject> *out, std::string *err) {
  out->clear();
  for (const SortSpec &s : kSorts) {
    coll::Table t;
    Counts c;
    SortObject o;
    o.id = s.id;
    o.name = s.name;
    if (!coll::readCollation(localeSrcDir, s.source, &t, err) || !buildOne(t, &o.body, &c, err)) {
      *err = std::string(s.name) + ": " + *err;
      return false;
    }
    std::ostringstream r;
    r << "== " << s.name << " (sort " << s.id << ", from " << s.source << ")\n"
      << "weight table entries: " << o.body.weights.size() << "; expansions: " << o.body.expansions.size()
      << "; combinations: " << o.body.combinations.size() << "\n"
      << "not expressed: " << c.longContractions << " contractions of three or more units, " << c.longExpansions
      << " expansions to more than two elements, " << c.beyondBmp << " characters beyond the BMP, " << c.merged
      << " secondary or tertiary sequences merged, " << c.splitLevels
      << " combinations expanding to two elements (left out), " << c.unknown << " unknown weight symbols\n"
      << "approximated: " << c.approximated << " unlisted units in arithmetic blocks, " << c.codeOrder
      << " units of blocks beyond the weight table sorted by code after all others\n\n";
    o.report = r.str();
    out->push_back(std::move(o));
  }
  return true;
}

}  // namespace mkdefs
