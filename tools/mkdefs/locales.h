// Languages and territories from the C library's locale sources.
#pragma once
#include <cstdint>
#include <functional>
#include <string>
#include <vector>

#include "container.h"
#include "specialcase.h"

namespace mkdefs {

struct DefObject {
  uint8_t type = 0;            // 0 language, 1 territory
  uint16_t id = 0;
  std::string name;            // control file name, e.g. "German", "Germany"
  std::vector<Bytes> sections; // big-endian, section 0 is the body
};

// What the special-case tables of the languages are made from.
struct Casing {
  const SpecialCasing &rules;
  const UnicodeProps &ucd;
};

// codePageId maps a code page name as the native locale table writes it ("Latin1",
// "MS932", ...) to its object id, or 0 when there is no such code page. Without casing
// the special-case tables stay empty; report gets one line per language about them.
bool buildLanguagesAndTerritories(const std::string &localeSrcDir,
                                  const std::function<uint16_t(const std::string &)> &codePageId,
                                  std::vector<DefObject> *out, std::string *err,
                                  const Casing *casing = nullptr, std::vector<std::string> *report = nullptr);

}  // namespace mkdefs
