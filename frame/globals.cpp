// Process-wide globals of the library.
#include "frame/frame.h"

VLGlobals *vlglobals = nullptr;
VLAllocHook vlalloc_cbk = VLDefAlloc;
VLFreeHook vlfree_cbk = VLDefFree;
VLLocale *vlglocale = nullptr;
