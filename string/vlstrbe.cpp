// Swaps the bytes of each 16-bit unit, so that units compare by memcmp in value order.
#include <cstdint>
#include <utility>

#include "frame/frame.h"

void VLStrBigEndian(void *buffer, int32_t byteCount) {
  if (!buffer) return;
  auto *b = static_cast<uint8_t *>(buffer);
  for (int32_t i = 0; i + 1 < byteCount; i += 2) std::swap(b[i], b[i + 1]);
}
