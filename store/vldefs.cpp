// Replaces the manager's table with the three built-in objects.
#include "store/store.h"

const VLObjEntry vl::store::kBuiltinEntries[3] = {
    {1, VL_OBJ_LANGUAGE, 0x01, "English", nullptr, {}, {}},
    {1, VL_OBJ_TERRITORY, 0x01, "UnitedStates", nullptr, {}, {}},
    {1, VL_OBJ_CODEPAGE, 0x01, "US-ASCII", nullptr, {}, {}},
};

int VLLoadDefaults(VLObjManager *m) {
  auto *e = static_cast<VLObjEntry *>(vl::alloc(sizeof(VLObjEntry) * 3));
  if (!e) return 0;
  for (int i = 0; i < 3; ++i) {
    e[i] = vl::store::kBuiltinEntries[i];
    VLLoadDefaultObj(m, &e[i]);
  }
  m->entries = e;
  for (int t = 0; t < 4; ++t) m->typeStart[t] = static_cast<uint16_t>(t);
  m->typeStart[4] = 3;
  m->noBuiltinFallback = 1;
  m->directory[0] = 0;
  return 1;
}
