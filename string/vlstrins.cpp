// Places one element's weights into caller-held level buffers.
#include "string/collfam.h"

namespace {
template <class T>
void put(T **mark, T **end, bool forward, const T *v, uint32_t n = 1) {
  if (mark && end && *mark && *end) vl::coll::placeRun(mark, end, v, n, forward);
}
}  // namespace

void VLStrInsertWeights(uint16_t primary, uint16_t **pMark, uint16_t **pEnd, uint8_t secondary, uint8_t **sMark,
                        uint8_t **sEnd, uint8_t tertiary, uint8_t **tMark, uint8_t **tEnd, uint16_t fourth,
                        uint16_t **qMark, uint16_t **qEnd, uint16_t position, uint8_t cls) {
  namespace so = vl::sort;
  const uint16_t pair[2] = {position, fourth};
  if (primary) put(pMark, pEnd, (cls & so::kFwdPrimary) != 0, &primary);
  if (secondary) put(sMark, sEnd, (cls & so::kFwdSecondary) != 0, &secondary);
  if (tertiary) put(tMark, tEnd, (cls & so::kFwdTertiary) != 0, &tertiary);
  if (fourth) put(qMark, qEnd, (cls & so::kFwdFourth) != 0, pair, 2);
}
