// Counted termination: the last call releases the default locale, the object manager
// and the global area.
#include "frame/frame.h"

VL_TRACE_MODULE("vlterm");

uint32_t VLTerm(void) {
  VL_FLOW("VLTerm");
  VLGlobals *g = vlglobals;
  if (!g || g->initCount == 0) VL_RET(VL_RC_OK);
  {
    vl::LockGuard lock(&g->lock);
    --g->initCount;
    VL_STATE("Veltrin init count = %d", g->initCount);
    if (g->initCount != 0) VL_RET(VL_RC_OK);
  }
  VLLocale *def = vlglocale;
  vlglocale = nullptr;
  uint32_t rc = def ? VLReleaseLocale(def) : 0;
  VLObjManager *m = g->objManager;
  g->objManager = nullptr;
  uint32_t mrc = m ? VLTermObjManager(m) : 0;
  if (rc == 0) rc = mrc;
  g->fileContext = 0;
  OSL1_DestroyLock(&g->lock);
  // The area is cleared so that the library can be initialised again in this process.
  vlglobals = nullptr;
  VLFreeHook f = vlfree_cbk;
  uint32_t ctx = g->allocContext;
  vlalloc_cbk = VLDefAlloc;
  vlfree_cbk = VLDefFree;
  if (!f(ctx, g) && rc == 0) rc = VL_RC_FREEFAIL;
  VL_RET(rc);
}
