// Builds definition directories for tests: healthy, missing, corrupt, truncated.
#pragma once
#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "container.h"
#include "cpbuild.h"

namespace ts {

using mkdefs::Bytes;

// A directory under /tmp removed with everything in it.
struct TempDir {
  std::string path;
  TempDir();
  ~TempDir();
  TempDir(const TempDir &) = delete;
  TempDir &operator=(const TempDir &) = delete;
  std::string file(const std::string &name) const { return path + "/" + name; }
};

// Texts of a language or territory body, by body word.
using Texts = std::map<int, std::u16string>;
using Words = std::map<int, uint16_t>;

// Body of 16-bit words and UTF-16 texts, big-endian, as the files hold it.
Bytes textBody(int headerWords, const Words &words, const Texts &texts);
Bytes languageBody(uint16_t territory, uint16_t codePage, uint16_t sort, const std::u16string &code,
                   const std::u16string &name);
Bytes territoryBody(const std::u16string &currency, const std::u16string &code, uint16_t decimal = '.',
                    uint16_t group = ',');

// Mappings of a few kinds of code page, through the generator's own builder.
mkdefs::CpSource singleByteSource(uint16_t id, const std::string &name);   // ISO-8859-1-like
mkdefs::CpSource doubleByteSource(uint16_t id, const std::string &name);   // lead 0x81-0x9F
mkdefs::CpSource shiftSource(uint16_t id, const std::string &name);        // EBCDIC with SO/SI
const mkdefs::UnicodeProps &unicode();

struct Object {
  uint8_t type;
  uint16_t id;
  std::string name;
  std::vector<Bytes> sections;
  uint32_t generation = 2;
};

struct DefDir {
  std::vector<Object> objects;
  void add(uint8_t type, uint16_t id, const std::string &name, std::vector<Bytes> sections, uint32_t gen = 2) {
    objects.push_back({type, id, name, std::move(sections), gen});
  }
  void addCodePage(const mkdefs::CpSource &src);
  // The standard healthy set: English(1)/German(2), UnitedStates(840)/Germany(276),
  // US-ASCII-like 367, Latin1-like 819, a double-byte 932 and a shift-sensitive 930.
  static DefDir standard();
  // Writes control.nls and every object file (and alias.txt when given).
  void write(const std::string &dir, const std::string &aliases = "") const;
};

// Reads and rewrites one object file in place (for corruption tests).
Bytes readFile(const std::string &path);
void writeBytes(const std::string &path, const Bytes &b);
std::string objectPath(const std::string &dir, uint8_t type, uint16_t id);

}  // namespace ts
