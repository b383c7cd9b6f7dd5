// Language-specific special casing: tables 44 (upper) and 45 (lower) of a language body.
#include "store/store.h"

int VLLangGetSpecial(const VLObjEntry *language, VLUChar first, VLUChar second, VLUChar *out1, VLUChar *out2,
                     int table) {
  if (!language || (table != 44 && table != 45)) return 0;
  const auto *b = static_cast<const uint8_t *>(__atomic_load_n(&language->section[0], __ATOMIC_ACQUIRE));
  if (!b) return 0;
  // Counts at words 3 and 4; table offsets at words 49 and 50 (checked when loaded).
  uint16_t count = vl::rd16(b + (table == 44 ? 6 : 8));
  if (!count) return 0;
  const uint8_t *t = b + vl::rd16(b + 2 * (table + 5));
  for (uint16_t i = 0; i < count; ++i, t += 8) {
    if (vl::rd16(t) == first && vl::rd16(t + 2) == second) {
      VLUChar r1 = vl::rd16(t + 4), r2 = vl::rd16(t + 6);
      if (out1) *out1 = r1;
      if (out2) *out2 = r2;
      return r2 ? 2 : 1;
    }
  }
  return 0;
}
