// Points an entry at the built-in body of its type.
#include "store/store.h"

int VLLoadDefaultObj(VLObjManager *, VLObjEntry *e) {
  if (!e || e->type > VL_OBJ_CODEPAGE) return 1;
  // Section 0 is left alone until the release store below: lock-free lookups read it.
  for (int i = 1; i < 4; ++i) e->section[i] = nullptr;
  for (int i = 0; i < 4; ++i) e->sectionSize[i] = 0;
  if (e->type == VL_OBJ_CODEPAGE) {
    e->section[2] = const_cast<void *>(VLDefCP3);
    e->sectionSize[2] = vl::kBuiltinSize[3];
  }
  e->sectionSize[0] = vl::kBuiltinSize[e->type];
  e->flags = 0x01;
  const void *body = e->type == VL_OBJ_LANGUAGE ? VLDefaultLanguage
                     : e->type == VL_OBJ_TERRITORY ? VLDefaultTerritory
                                                   : VLDefaultCodePage;
  __atomic_store_n(&e->section[0], const_cast<void *>(body), __ATOMIC_RELEASE);
  return 0;
}
