// Counted initialisation: the first call creates the global area and the object manager.
#include "frame/frame.h"

VL_TRACE_MODULE("vlinit");

uint32_t VLInit(const char *directory, VLAllocHook allocHook, VLFreeHook freeHook, uint32_t allocContext,
                uint32_t options) {
  VL_FLOW("VLInit");
  if (!vlglobals) {
    VL_STATE("Creating global area");
    VLAllocHook a = allocHook ? allocHook : VLDefAlloc;
    auto *g = static_cast<VLGlobals *>(a(allocContext, sizeof(VLGlobals)));
    if (!g) {
      VL_ERR("Unable to allocate %d bytes for globals", static_cast<int>(sizeof(VLGlobals)));
      VL_RET(VL_RC_NOMEM);
    }
    std::memset(g, 0, sizeof *g);
    vlglobals = g;
  }
  VLGlobals *g = vlglobals;
  if (g->initCount == 0) {
    VL_STATE("Veltrin init count = %d", 0);
    OSL1_InitializeLock(&g->lock);
    OSL1_GetLock(&g->lock);
    g->pathSeparator[0] = '/';
    g->nameSeparator[0] = '_';
    g->level = 4;
    vlalloc_cbk = allocHook ? allocHook : VLDefAlloc;
    vlfree_cbk = freeHook ? freeHook : VLDefFree;
    if (allocContext) g->allocContext = allocContext;
    g->fileContext = 1;
    uint32_t mrc = 0;
    VLObjManager *m = VLInitObjManager(directory, options, &mrc);
    uint32_t rc;
    if (!m) {
      g->fileContext = 0;
      rc = VL_RC_NOMANAGER;  // whatever the manager ran into
    } else {
      g->objManager = m;
      ++g->initCount;
      rc = mrc ? VL_RC_DEFAULTS : VL_RC_OK;
    }
    OSL1_ReleaseLock(&g->lock);
    if (!m) {
      OSL1_DestroyLock(&g->lock);
      // Nothing else holds the area: give it back so that a later call starts afresh.
      vlglobals = nullptr;
      vlfree_cbk(g->allocContext, g);
      vlalloc_cbk = VLDefAlloc;
      vlfree_cbk = VLDefFree;
    }
    VL_RET(rc);
  }
  {
    vl::LockGuard lock(&g->lock);
    ++g->initCount;
    VL_STATE("Veltrin init count = %d", g->initCount);
  }
  VL_RET(VL_RC_OK);
}
