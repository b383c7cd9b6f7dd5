// Every public call that can allocate, with each of its allocations failing in turn: the
// call reports 20 (or the code it documents), whatever it was given stays usable, and no
// block is left once the library ends.
#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <fstream>
#include <functional>
#include <string>
#include <vector>

#include "frame/frame.h"
#include "nls1.h"
#include "veltrin.h"
#include "support/hooks.h"

namespace {

struct Ctx {
  VLLocale *l = nullptr;      // German_Germany.MS1252, loaded before the call
  VLLocale *other = nullptr;  // Japanese_Japan.IBM930
  VLObjEntry *entry = nullptr;
  VLConversion *conv = nullptr;
  VLCatalog *cat = nullptr;
  std::string path;
};

VLObjEntry *object(uint16_t type, const char *name) {
  uint32_t rc = 0;
  return VLGetObjFromName(vlglobals->objManager, type, name, int32_t(std::strlen(name)), 0, &rc);
}

VLLocale *locale(const char *name) {
  uint32_t rc = 0;
  return VLGetLocale(name, 0, &rc);
}

// A handle is usable when its items read back and its texts convert.
bool usable(VLLocale *l) {
  if (!l) return false;
  char buf[64];
  VLUChar u[64];
  return VLGetLocaleTextInfo(l, VL_ITEM_LOCALE, buf, sizeof buf, 0) > 0 &&
         VLGetLocaleTextInfoU(l, VL_ITEM_LOCALE, u, 64, 0) > 0 && VLStringToUnicode(u, 64, l, "abc", 3, 0) == 3;
}

// A catalog compiled once by the tool, in a directory of its own.
const std::string &catalogDir() {
  static const std::string dir = [] {
    char tmpl[] = "/tmp/vlfault.XXXXXX";
    std::string d = mkdtemp(tmpl) ? tmpl : "/tmp";
    std::ofstream(d + "/fault.msg") << "$set 1\n1 eins\n2 zwei\n$set 2\n7 sieben\n";
    std::string cmd = std::string(VL_TEST_TLX) + " gencat --dir " + VL_TEST_DEFS_DIR +
                      " --locale German_Germany.MS1252 " + d + "/fault.cat " + d + "/fault.msg";
    EXPECT_EQ(std::system(cmd.c_str()), 0);
    return d;
  }();
  return dir;
}

struct Row {
  const char *name;
  std::function<void(Ctx &)> setup;  // its allocations never fail
  std::function<uint32_t(Ctx &)> call;
  std::function<bool(Ctx &)> stillUsable;
};

uint32_t getLocale(const char *name) {
  uint32_t rc = 0;
  VLLocale *l = VLGetLocale(name, 0, &rc);
  if (l) VLReleaseLocale(l);
  return l ? 0 : rc;
}

void loadBoth(Ctx &c) {
  c.l = locale("German_Germany.MS1252");
  c.other = locale("Japanese_Japan.IBM930");
}

bool bothUsable(Ctx &c) { return usable(c.l) && usable(c.other); }

// After a failed first load, the same name must still give a handle.
bool loadsAgain(const char *name) { return getLocale(name) == 0; }

const Row kRows[] = {
    {"VLGetLocale loading three objects", [](Ctx &) {}, [](Ctx &) { return getLocale("German_Germany.MS1252"); },
     [](Ctx &) { return loadsAgain("German_Germany.MS1252"); }},
    {"VLGetLocale of a shift-sensitive page", [](Ctx &) {},
     [](Ctx &) { return getLocale("Japanese_Japan.IBM930"); },
     [](Ctx &) { return loadsAgain("Japanese_Japan.IBM930"); }},
    {"VLGetLocaleU with objects loaded", loadBoth,
     [](Ctx &) {
       const VLUChar name[] = {'G', 'e', 'r', 'm', 'a', 'n', 0};
       uint32_t rc = 0;
       VLLocale *l = VLGetLocaleU(name, 0, &rc);
       if (l) VLReleaseLocale(l);
       return l ? 0u : rc;
     },
     bothUsable},
    {"VLConvertNativeLocale", [](Ctx &) {},
     [](Ctx &) {
       uint32_t rc = 0;
       VLLocale *l = VLConvertNativeLocale("de_DE.utf8", VL_LOCALE_FALLBACK, &rc);
       if (l) VLReleaseLocale(l);
       return l ? 0u : rc;
     },
     [](Ctx &) { return loadsAgain("German_Germany.UTF-8"); }},
    {"VLLocaleSetModifiable", loadBoth, [](Ctx &c) { return VLLocaleSetModifiable(c.l); }, bothUsable},
    {"VLSetLocaleTextInfo", loadBoth,
     [](Ctx &c) { return VLSetLocaleTextInfo(c.l, 64, "EUR", 3, 0) ? 0u : uint32_t(VLGetError(c.l)); }, bothUsable},
    {"VLSetLocaleTextInfoU on a shift page", loadBoth,
     [](Ctx &c) {
       const VLUChar text[] = {0x5186, 0};
       return VLSetLocaleTextInfoU(c.other, 64, text, -1, 0) ? 0u : uint32_t(VLGetError(c.other));
     },
     bothUsable},
    {"VLLocaleChangeTerritory", loadBoth,
     [](Ctx &c) { return VLLocaleChangeTerritory(c.l, object(1, "Japan")); }, bothUsable},
    {"VLLocaleChangeCodePage",
     [](Ctx &c) {
       loadBoth(c);
       c.entry = object(2, "MS1250");
     },
     [](Ctx &c) { return VLLocaleChangeCodePage(c.l, c.entry); }, bothUsable},
    {"VLOpenConversion", loadBoth,
     [](Ctx &c) {
       c.conv = VLOpenConversion(c.other, c.l);
       return c.conv ? 0u : uint32_t(VLGetError(c.other));
     },
     bothUsable},
    // Families built on a handle: what they allocate is a work area, and a failure must
    // leave both the handle and the caller's strings as they were.
    {"VLStrcmp without regard to case, on the mapped path", loadBoth,
     [](Ctx &c) {
       int32_t r = VLStrcmp(c.l, "Stra\xDF" "e", -1, "STRASSE", -1, VL_CMP_NOCASE);
       return r == 0 ? uint32_t(VLGetError(c.l)) : 99u;
     },
     bothUsable},
    {"VLStrcoll beyond the stack work area",
     [](Ctx &c) {
       uint32_t rc = 0;
       c.l = VLGetLocale("German_Germany.MS1252@Swedish", 0, &rc);
       c.other = locale("Japanese_Japan.IBM930");
     },
     [](Ctx &c) {
       std::string a(3000, 'a'), b = "A" + a.substr(1);  // equal primaries: the full walk
       VLStrcoll(c.l, a.c_str(), -1, b.c_str(), -1, 0);
       return uint32_t(VLGetError(c.l));
     },
     bothUsable},
    {"VLOpenCatalog in memory",
     [](Ctx &c) {
       loadBoth(c);
       c.path = catalogDir();
     },
     [](Ctx &c) {
       c.cat = VLOpenCatalog(c.l, (c.path + "/%N").c_str(), "fault.cat", 0x80000061u);
       return c.cat ? 0u : uint32_t(VLGetError(c.l));
     },
     bothUsable},
    {"VLSetLocale", [](Ctx &) { VLSetLocale("German_Germany.MS1252", 0); },
     [](Ctx &) { return VLSetLocale("French_France.Latin1", 0); },
     [](Ctx &) { return usable(vlglocale); }},
};

void PrintTo(const Row &row, std::ostream *os) { *os << row.name; }

class FaultInjection : public ::testing::TestWithParam<Row> {};

// Runs setup and the call in one life of the library; failAt counts from the call's start.
uint32_t oneLife(const Row &row, long failAt, long *callAllocs, bool *usableAfter) {
  ts::resetHooks();
  uint32_t init = VLInit(VL_TEST_DEFS_DIR, ts::countingAlloc, ts::countingFree, 0, 0);
  EXPECT_EQ(init, 0u);
  Ctx c;
  row.setup(c);
  long before = ts::hooks.allocs;
  if (failAt > 0) ts::hooks.failAt = before + failAt;
  uint32_t rc = row.call(c);
  *callAllocs = ts::hooks.allocs - before;
  ts::hooks.failAt = -1;
  *usableAfter = row.stillUsable(c);
  if (c.conv) VLCloseConversion(c.conv);
  if (c.cat) VLCloseCatalog(c.cat);
  if (c.l) VLReleaseLocale(c.l);
  if (c.other) VLReleaseLocale(c.other);
  VLTerm();
  return rc;
}

TEST_P(FaultInjection, EachAllocationFailsInTurn) {
  const Row &row = GetParam();
  long total = 0;
  bool ok = false;
  ASSERT_EQ(oneLife(row, -1, &total, &ok), 0u);
  EXPECT_TRUE(ok);
  EXPECT_EQ(ts::hooks.live, 0);
  ASSERT_GT(total, 0) << "the call allocates nothing: drop the row";
  for (long k = 1; k <= total; ++k) {
    long n = 0;
    uint32_t rc = oneLife(row, k, &n, &ok);
    EXPECT_TRUE(ts::hooks.failed) << "allocation " << k;
    EXPECT_EQ(rc, VL_RC_NOMEM) << "allocation " << k << " of " << total;
    EXPECT_TRUE(ok) << "not usable after allocation " << k << " failed";
    EXPECT_EQ(ts::hooks.live, 0) << "leak after allocation " << k << " failed";
  }
}

INSTANTIATE_TEST_SUITE_P(PublicCalls, FaultInjection, ::testing::ValuesIn(kRows),
                         [](const ::testing::TestParamInfo<Row> &info) {
                           std::string n;
                           for (const char *p = info.param.name; *p; ++p)
                             n += (std::isalnum(static_cast<unsigned char>(*p)) ? *p : '_');
                           return n;
                         });

}  // namespace
