// The catalog file as the tools see it: sets of numbered byte texts, written in this
// host's byte order.
#pragma once
#include <cstdint>
#include <map>
#include <string>

namespace catfile {

struct Catalog {
  std::string locale;
  std::map<uint32_t, std::map<uint32_t, std::string>> sets;
};

// The file of a catalog: header, then per set its record, index and text block.
std::string write(const Catalog &c);
// Reads a catalog file back; an empty input is an empty catalog. False with a reason
// when it is not a catalog of this host.
bool parse(const std::string &bytes, Catalog *c, std::string *why);

}  // namespace catfile
