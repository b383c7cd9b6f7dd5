// Path pieces: where each piece of a path starts and ends.
#pragma once
#include <cstring>

namespace vl::path {

// Largest piece each splitter writes, terminator included.
constexpr size_t kDriveMax = 4, kDirMax = 256, kFileMax = 15, kExtentMax = 5;

struct Pieces {
  size_t driveEnd;  // drive is [0, driveEnd)
  size_t dirEnd;    // directory is [driveEnd, dirEnd)
  size_t nameEnd;   // whole file name is [dirEnd, nameEnd)
  size_t dot;       // last '.' of the file name, or nameEnd when none
  bool dotName;     // the name is "." or ".." (part of the directory)
};

inline Pieces split(const char *p) {
  Pieces s{};
  size_t n = std::strlen(p);
  const char *colon = std::strchr(p, ':');
  if (colon && static_cast<size_t>(colon - p) + 1 < 4) s.driveEnd = static_cast<size_t>(colon - p) + 1;
  const char *slash = std::strrchr(p + s.driveEnd, '/');
  s.dirEnd = slash ? static_cast<size_t>(slash - p) + 1 : s.driveEnd;
  const char *rest = p + s.dirEnd;
  if (std::strcmp(rest, ".") == 0 || std::strcmp(rest, "..") == 0) {
    s.dotName = true;
    s.dirEnd = n;
  }
  s.nameEnd = n;
  const char *dot = std::strrchr(p + s.dirEnd, '.');
  s.dot = dot ? static_cast<size_t>(dot - p) : n;
  return s;
}

// Writes [from, to) into out when it fits in max bytes with the terminator; returns its length.
inline int piece(const char *p, size_t from, size_t to, size_t max, char *out) {
  size_t n = to - from;
  if (n + 1 > max) n = 0;
  std::memcpy(out, p + from, n);
  out[n] = 0;
  return static_cast<int>(n);
}

}  // namespace vl::path
