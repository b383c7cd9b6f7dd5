// Bytes of a W character: its value holds the bytes big-endian without leading zeros.
#include "frame/frame.h"

int32_t VLStrByteLength(VLWChar value) {
  if (value >= 0x1000000u) return 4;
  if (value & 0xff0000u) return 3;
  if (value & 0xff00u) return 2;
  return 1;
}
