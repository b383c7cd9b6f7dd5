// Container and control file writer.
#include "container.h"

#include <algorithm>
#include <cstdio>
#include <fstream>
#include <utility>

namespace mkdefs {

namespace {
constexpr uint32_t kMagic = 0x476CF462;
constexpr size_t kHeaderSize = 76;
constexpr size_t kRowSize = 38;
constexpr size_t kNameField = 34;
}  // namespace

void put8(Bytes &b, uint8_t v) { b.push_back(v); }
void put16(Bytes &b, uint16_t v) {
  b.push_back(static_cast<uint8_t>(v >> 8));
  b.push_back(static_cast<uint8_t>(v));
}
void put32(Bytes &b, uint32_t v) {
  put16(b, static_cast<uint16_t>(v >> 16));
  put16(b, static_cast<uint16_t>(v));
}
void set16(Bytes &b, size_t at, uint16_t v) {
  b.at(at) = static_cast<uint8_t>(v >> 8);
  b.at(at + 1) = static_cast<uint8_t>(v);
}
void set32(Bytes &b, size_t at, uint32_t v) {
  set16(b, at, static_cast<uint16_t>(v >> 16));
  set16(b, at + 2, static_cast<uint16_t>(v));
}

bool containerFile(const std::vector<Bytes> &sections, uint32_t generation, Bytes *out, std::string *err) {
  if (sections.empty() || sections.size() > 4) {
    *err = "a container holds 1 to 4 sections, not " + std::to_string(sections.size());
    return false;
  }
  if (generation == 0 || generation > 15) {
    *err = "format generation must fit four bits and be non-zero";
    return false;
  }
  for (size_t i = 0; i < sections.size(); ++i)
    if (sections[i].size() > 0xFFFF) {
      *err = "section " + std::to_string(i) + " holds " + std::to_string(sections[i].size()) +
             " bytes, more than 65535";
      return false;
    }
  Bytes f(kHeaderSize, 0);
  set32(f, 0, kMagic);
  set32(f, 4, generation << 28);
  set16(f, 8, static_cast<uint16_t>(sections.size()));
  // Section 0's size shares its word with the section count; the others have a reserved
  // half-word beside theirs. Sections follow the header in order, each on a 4-byte
  // boundary; an empty one gets offset 0.
  for (size_t i = 0; i < sections.size(); ++i) {
    set16(f, i == 0 ? 10 : 8 + 8 * i, static_cast<uint16_t>(sections[i].size()));
    if (sections[i].empty()) continue;
    while (f.size() % 4) f.push_back(0);
    set32(f, 12 + 8 * i, static_cast<uint32_t>(f.size()));
    f.insert(f.end(), sections[i].begin(), sections[i].end());
  }
  *out = std::move(f);
  return true;
}

bool controlFile(std::vector<ControlRow> rows, Bytes *out, std::string *err) {
  std::sort(rows.begin(), rows.end(), [](const ControlRow &a, const ControlRow &b) {
    return std::pair(a.type, a.id) < std::pair(b.type, b.id);
  });
  Bytes table;
  for (size_t i = 0; i < rows.size(); ++i) {
    const ControlRow &r = rows[i];
    if (r.type > 3) {
      *err = "object " + r.name + " has type " + std::to_string(r.type);
      return false;
    }
    if (r.name.empty() || r.name.size() >= kNameField || r.name.find('\0') != std::string::npos) {
      *err = "object name '" + r.name + "' must hold 1 to 33 characters";
      return false;
    }
    if (i > 0 && rows[i - 1].type == r.type && rows[i - 1].id == r.id) {
      *err = "objects " + rows[i - 1].name + " and " + r.name + " share type " + std::to_string(r.type) +
             " and id " + std::to_string(r.id);
      return false;
    }
    put16(table, r.id);
    put8(table, r.type);
    put8(table, 0);
    const size_t at = table.size();
    table.resize(at + kNameField, 0);
    std::copy(r.name.begin(), r.name.end(), table.begin() + static_cast<long>(at));
  }
  if (table.size() != rows.size() * kRowSize) {
    *err = "control row size mismatch";
    return false;
  }
  return containerFile({table}, 2, out, err);
}

std::string objectFileName(uint8_t type, uint16_t id) {
  static const char *const kPrefix[4] = {"la", "te", "cp", "so"};
  char buf[32];
  std::snprintf(buf, sizeof buf, "%s_%05u.nls", type < 4 ? kPrefix[type] : "xx", static_cast<unsigned>(id));
  return buf;
}

bool writeFile(const std::string &path, const Bytes &data, std::string *err) {
  // Written beside the target and renamed, so a reader never sees half a file.
  const std::string tmp = path + ".tmp";
  {
    std::ofstream f(tmp, std::ios::binary | std::ios::trunc);
    if (!f) {
      *err = "cannot create " + tmp;
      return false;
    }
    f.write(reinterpret_cast<const char *>(data.data()), static_cast<std::streamsize>(data.size()));
    if (!f.flush()) {
      *err = "cannot write " + tmp;
      return false;
    }
  }
  if (std::rename(tmp.c_str(), path.c_str()) != 0) {
    std::remove(tmp.c_str());
    *err = "cannot rename " + tmp + " to " + path;
    return false;
  }
  return true;
}

}  // namespace mkdefs
