// Reader for the LC_COLLATE sections of the C library's locale sources: the common
// template table and the tailorings that copy it.
#pragma once
#include <array>
#include <list>
#include <map>
#include <set>
#include <string>
#include <vector>

namespace mkdefs::coll {

// One line of the order. A name is a symbol as written ("<U0061>", "<S0061>", "<c-h>").
struct Entry {
  std::string name;
  bool weighed = false;                          // false: the entry weighs itself on every level
  std::array<std::vector<std::string>, 4> level; // names per level; empty = IGNORE
  int section = -1;                              // index into Table::forward, -1 before any order_start
};

struct Table {
  std::vector<std::array<bool, 4>> forward;       // per order_start: forward on each level
  std::list<Entry> order;                         // final order, reorders applied
  std::map<std::string, std::u32string> elements; // collating-element name -> characters
};

// Reads the LC_COLLATE of locale (a file of dir), following "copy" into other files.
bool readCollation(const std::string &dir, const std::string &locale, Table *out, std::string *err);

// The character of a "<Uxxxx>" name, or 0 when the name is not one.
char32_t charOf(const std::string &name);

}  // namespace mkdefs::coll
