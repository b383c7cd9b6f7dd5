// Writer side of the definition file container: big-endian, as the files are kept on disk.
#pragma once
#include <cstdint>
#include <string>
#include <vector>

namespace mkdefs {

using Bytes = std::vector<uint8_t>;

// Big-endian appenders used by every body builder.
void put8(Bytes &b, uint8_t v);
void put16(Bytes &b, uint16_t v);
void put32(Bytes &b, uint32_t v);
void set16(Bytes &b, size_t at, uint16_t v);
void set32(Bytes &b, size_t at, uint32_t v);

// A whole container file: 76-byte header (magic, version word with the generation in
// its top four bits, section count, sizes and offsets) followed by the sections.
// Fails (returns false) when a section exceeds 65,535 bytes or there are not 1 to 4.
bool containerFile(const std::vector<Bytes> &sections, uint32_t generation, Bytes *out, std::string *err);

struct ControlRow {
  uint16_t id;
  uint8_t type;        // 0 language, 1 territory, 2 code page, 3 sort
  std::string name;    // at most 33 characters
};
// The control file: its section 0 holds the 38-byte rows, sorted by type then id here.
bool controlFile(std::vector<ControlRow> rows, Bytes *out, std::string *err);

// "la_00001.nls" and friends.
std::string objectFileName(uint8_t type, uint16_t id);

bool writeFile(const std::string &path, const Bytes &data, std::string *err);

}  // namespace mkdefs
