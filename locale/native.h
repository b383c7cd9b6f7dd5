// Shared machinery of the native-name family: the native table, the platform locale
// save/restore, and the lock that keeps our own platform-locale changes from overlapping.
#pragma once
#include <clocale>
#include <cstdint>
#include <cstring>

#include "frame/frame.h"
#include "store/store.h"

namespace vl::nat {

// One row of the native table. Native names fill at most 11 bytes; the extra byte keeps
// the terminator of the longest ("ja_JP.eucJP").
struct Row {
  char native[12];
  char language[32];
  char territory[32];
  char codePage[32];
  char sort[32];
};

extern const Row kRows[];
extern const uint32_t kRowCount;

// Longest platform locale name that is saved for restoring.
constexpr size_t kSaveMax = 1024;

// The first row whose native name equals the given span exactly (case-sensitive), or null.
inline const Row *findRow(const char *native, size_t length) {
  if (length >= sizeof(Row::native)) return nullptr;
  for (uint32_t i = 0; i < kRowCount; ++i)
    if (std::strncmp(kRows[i].native, native, length) == 0 && kRows[i].native[length] == 0) return &kRows[i];
  return nullptr;
}

// Serialises the save/set/restore sequences of this family, so that two threads building
// user locales at once never restore each other's half-changed platform state.
inline OSL1_Lock *platformLock() {
  static OSL1_Lock lock = {PTHREAD_MUTEX_INITIALIZER};
  return &lock;
}

// Copies the platform's current locale (all categories) into out; false when it is
// kSaveMax characters or longer (len receives its length) or cannot be queried.
inline bool savePlatform(char *out, size_t *len) {
  const char *cur = std::setlocale(LC_ALL, nullptr);
  *len = cur ? std::strlen(cur) : 0;
  if (!cur || *len >= kSaveMax) return false;
  std::memcpy(out, cur, *len + 1);
  return true;
}

// Copies at most size - 1 bytes of s and terminates (size > 0).
inline void copyTrunc(char *out, size_t size, const char *s) {
  size_t n = std::strlen(s);
  if (n >= size) n = size - 1;
  std::memcpy(out, s, n);
  out[n] = 0;
}

}  // namespace vl::nat

namespace vl::nat {

// Walks the definition store's entries in table order; visit(type, name) returns the
// callback's answer, and 0 stops the walk.
template <class Visit>
int enumerate(Visit visit) {
  VLObjManager *m = vlglobals ? vlglobals->objManager : nullptr;
  if (!m || !m->entries) return 0;
  const uint16_t total = m->typeStart[4];
  for (uint16_t i = 0; i < total; ++i) {
    const VLObjEntry &e = m->entries[i];
    char name[sizeof e.name + 1];
    std::memcpy(name, e.name, sizeof e.name);
    name[sizeof e.name] = 0;
    if (!visit(static_cast<int>(e.type), name)) break;
  }
  return 0;
}

}  // namespace vl::nat
