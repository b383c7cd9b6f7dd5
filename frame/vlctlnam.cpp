#include "frame/frame.h"

char *VLGetControlFileName(const char *directory, char *buffer, int size) {
  static const char kName[] = "/control.nls";
  size_t d = std::strlen(directory);
  if (size < 0 || d > static_cast<size_t>(size) || static_cast<size_t>(size) - d < sizeof kName) return nullptr;
  std::memcpy(buffer, directory, d);
  std::memcpy(buffer + d, kName, sizeof kName);
  return buffer;
}
