// Sort objects: the body layout as written, and the builder from collation sources.
#pragma once
#include <array>
#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "container.h"

namespace mkdefs {

// One sort body before it is laid out. Flags and classes as the library reads them:
// block flags 0x01 ignorable, 0x02 arithmetic primary, 0x04 arithmetic fourth level;
// weight flags 0x8000 fourth-level word, 0x4000 expands, class in bits 0x3c00.
struct SortBody {
  struct Block { uint8_t flags = 0, cls = 0; uint16_t base = 0; };
  struct Weight { uint16_t word = 0; uint8_t sec = 0, ter = 0; uint16_t flags = 0; };
  struct Expansion { uint16_t unit, p1; uint8_t s1, t1; uint16_t p2; uint8_t s2, t2; };
  struct Combination { uint16_t u1, u2, word; uint8_t sec, ter; uint16_t flags; };
  uint8_t defSec = 0, defTer = 0;
  std::array<Block, 256> blocks{};
  std::vector<Weight> weights;
  std::vector<Expansion> expansions;
  std::vector<Combination> combinations;
  // Big-endian body; fails when it exceeds one section.
  bool bytes(Bytes *out, std::string *err) const;
};

struct SortObject {
  uint16_t id = 0;
  std::string name;       // control file name, e.g. "Swedish"
  SortBody body;
  std::string report;     // what the object could not express
};

// The "Default" sort from the common table and one sort per tailoring language, read from
// the C library's locale sources. Ids from 1 in the order returned ("Default" first).
bool buildSorts(const std::string &localeSrcDir, std::vector<SortObject> *out, std::string *err);

// Which sort a language collates by, as the native locale table names it ("Default" when
// its rows name no sort of their own); empty when the language's rows are binary only.
std::string sortOfLanguage(const std::string &language);

}  // namespace mkdefs
