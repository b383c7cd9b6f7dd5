// Every block goes back through the hooks, and a failing allocation anywhere is reported
// as 20 without leaking.
#include <gtest/gtest.h>

#include "frame/frame.h"
#include "support/defdir.h"
#include "support/hooks.h"

namespace {

constexpr uint32_t kInitFailed = 0x10000;

// One life of the library: init, a few handles, loads and a change, term. A failed init
// comes back marked with kInitFailed.
uint32_t lifecycle(const char *dir) {
  uint32_t rc = VLInit(dir, ts::countingAlloc, ts::countingFree, 0, 0);
  if (rc != 0 && rc != VL_RC_DEFAULTS) return rc | kInitFailed;
  uint32_t first = 0;
  const char *names[] = {"German_Germany.MS932", "English.IBM-930", "German"};
  for (const char *n : names) {
    uint32_t lrc = 0;
    VLLocale *l = VLGetLocale(n, 0, &lrc);
    if (!l && !first) first = lrc;
    if (l) {
      uint32_t crc = 0;
      VLObjEntry *us = VLGetObjFromName(vlglobals->objManager, 1, "UnitedStates", 12, 0, &crc);
      if (us) {
        uint32_t r = VLLocaleChangeTerritory(l, us);
        if (r && !first) first = r;
      }
      VLReleaseLocale(l);
    }
  }
  VLTerm();
  return first;
}

// The first life fails nothing: every block comes back. Then each allocation fails in turn.
TEST(Memory, EachFailingAllocationIsReportedAndLeaksNothing) {
  ts::TempDir d;
  ts::DefDir::standard().write(d.path, "Latin1 CP819\n");
  ts::resetHooks();
  ASSERT_EQ(lifecycle(d.path.c_str()), 0u);
  EXPECT_EQ(ts::hooks.live, 0);
  const long total = ts::hooks.allocs;
  ASSERT_GT(total, 20);
  for (long k = 1; k <= total; ++k) {
    ts::resetHooks(k);
    uint32_t rc = lifecycle(d.path.c_str());
    ASSERT_TRUE(ts::hooks.failed) << k;
    EXPECT_EQ(ts::hooks.live, 0) << "allocation " << k;
    // A failed load of an object falls back to the built-in body (and its code is the
    // load's); an init says 20 for its own area and 11 when the manager could not be
    // made; everything else must say 20.
    uint32_t want = (rc & kInitFailed) ? (k == 1 ? VL_RC_NOMEM : VL_RC_NOMANAGER) : VL_RC_NOMEM;
    if (rc != 0) {
      EXPECT_EQ(rc & ~kInitFailed, want) << "allocation " << k;
    }
  }
}

}  // namespace
