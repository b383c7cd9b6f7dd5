// Weights of one unit.
#include "string/collfam.h"

int VLSortGetWeights(const VLObjEntry *sort, VLUChar unit, uint16_t *p1, uint8_t *s1, uint8_t *t1, uint16_t *q1,
                     uint16_t *p2, uint8_t *s2, uint8_t *t2, uint16_t *q2, uint8_t *cls) {
  vl::sort::Weights w;
  const int n = sort && sort->section[0] ? vl::sort::weightsOf(sort, unit, &w) : 0;
  return vl::coll::handOut(w, n, p1, s1, t1, q1, p2, s2, t2, q2, cls);
}
