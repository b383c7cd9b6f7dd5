// Shared state of the service layer: the process and thread blocks and the start flag.
#pragma once
#include <cstdint>

#include "frame/frame.h"
#include "nls1.h"

// 1 once this layer started the library, -1 when that failed, 0 before.
extern std::atomic<int32_t> tlxinflg;

namespace vl::svc {

// Resolves the process block (starting the library on first use); true when usable.
bool ready();
// The calling thread's block: the slot holding its handle (null when unresolvable).
VLLocale **threadSlot();
// A null handle stands for the calling thread's.
inline VLLocale *orThread(VLLocale *l) { return l ? l : NLS1_PrivateFunction_GetThreadLocale(); }

}  // namespace vl::svc
