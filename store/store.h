// The object manager's records and the container format as read from disk.
#pragma once
#include <atomic>
#include <cstdint>

#include "frame/frame.h"

struct VLAlias {
  VLAlias *next;
  char codePage[33];
  char alias[65];
};

struct VLObjManager {
  VLObjEntry *entries;
  uint16_t typeStart[5];  // entries of type t are [typeStart[t], typeStart[t + 1])
  uint8_t noBuiltinFallback;
  char directory[256];
  VLAlias *aliases;
};

namespace vl::store {

// Bumped by every unload: caches derived from a body drop it when this moves.
inline std::atomic<uint32_t> unloads{0};

constexpr uint32_t kMagic = 0x476CF462;
constexpr uint32_t kHeaderSize = 76;
constexpr uint32_t kDiskRecord = 38;

struct Header {
  uint32_t version;
  uint16_t count;
  uint16_t size[4];
  uint32_t offset[4];
};

// Reads the big-endian container header; false on a wrong magic or section count.
inline bool parseHeader(const uint8_t *raw, Header *h) {
  if (be32(raw) != kMagic) return false;
  h->version = be32(raw + 4);
  h->count = be16(raw + 8);
  h->size[0] = be16(raw + 10);
  h->offset[0] = be32(raw + 12);
  for (int i = 1; i < 4; ++i) {
    h->size[i] = be16(raw + 8 + 8 * i);
    h->offset[i] = be32(raw + 12 + 8 * i);
  }
  return h->count >= 1 && h->count <= 4;
}

inline uint32_t generation(const Header &h) { return h.version >> 28; }

// Checks every count, offset and index of a freshly read object (file byte order) and
// converts it to native byte order in place. Returns 0, 2000 for a malformed object, or
// 20 when scratch memory could not be had.
uint32_t checkObject(VLObjEntry *entry);

// VLGetObjFromID without its one surprise: when a type has no objects, the id search may
// answer with the last object of the type before; that object is refused here.
inline VLObjEntry *objById(VLObjManager *m, uint16_t type, uint16_t id, int noLoad, uint32_t *rc) {
  VLObjEntry *e = VLGetObjFromID(m, type, id, noLoad, rc);
  if (e && e->type != type) {
    *rc = VL_RC_NOTFOUND;
    return nullptr;
  }
  return e;
}

// The built-in table rows.
extern const VLObjEntry kBuiltinEntries[3];

}  // namespace vl::store

namespace vl {
extern const uint16_t kBuiltinSize[4];
}
