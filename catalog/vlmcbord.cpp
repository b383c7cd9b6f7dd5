// The byte order catalogs are written in on this host: 1 big-endian, 2 little-endian.
#include "catalog/catalog.h"

int VLMcGetByteOrder(void) {
  const uint32_t probe = 0x00010203u;
  uint8_t b[4];
  std::memcpy(b, &probe, 4);
  return b[0] == 0 && b[1] == 1 && b[2] == 2 && b[3] == 3 ? 1 : 2;
}
