// A pair of units that collates as one element.
#include "string/collfam.h"

int VLSortGetCombination(const VLObjEntry *sort, VLUChar u1, VLUChar u2, uint16_t *p, uint8_t *s, uint8_t *t,
                         uint16_t *q, uint8_t *cls) {
  vl::sort::Weights w;
  const int n = sort && sort->section[0] ? vl::sort::combinationOf(sort, u1, u2, &w) : 0;
  return vl::coll::handOut(w, n, p, s, t, q, nullptr, nullptr, nullptr, nullptr, cls);
}
