// The native locale table.
#include "locale/native.h"

namespace vl::nat {

const Row kRows[] = {
#include "locale/nattab.inc"
};
const uint32_t kRowCount = sizeof kRows / sizeof kRows[0];

}  // namespace vl::nat
