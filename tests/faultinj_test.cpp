// Every public call that can allocate, with each of its allocations failing in turn: the
// call reports 20 (or the code it documents), whatever it was given stays usable, and no
// block is left once the library ends. Each run is a child process of its own, so the
// service layer, which starts the library once per process, starts afresh every time.
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <fstream>
#include <functional>
#include <string>
#include <vector>

#include "cpbuild.h"
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
  VLStream *stream = nullptr;
  VLFile *file = nullptr;
  void *block = nullptr;
  std::string path;
  uint32_t rc = 0;
};

// The bytes widened unit by unit, 0 included.
template <class T>
std::vector<T> wide(const std::string &s) {
  auto *p = reinterpret_cast<const unsigned char *>(s.c_str());
  return std::vector<T>(p, p + s.size() + 1);
}

uint32_t err(VLLocale *l) { return uint32_t(VLGetError(l)); }

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

// The definitions without "alias.txt", whose lines each allocate and may fail unreported.
const std::string &noAliasDir() {
  static const std::string dir = [] {
    char tmpl[] = "/tmp/vlfault.XXXXXX";
    std::string d = mkdtemp(tmpl) ? tmpl : "/tmp";
    std::string cmd = "cp -s " + std::string(VL_TEST_DEFS_DIR) + "/*.nls " + d;
    EXPECT_EQ(std::system(cmd.c_str()), 0);
    return d;
  }();
  return dir;
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
  std::function<void(Ctx &)> cleanup = nullptr;  // besides closing what Ctx holds
  std::vector<uint32_t> codes = {VL_RC_NOMEM};    // what a failed allocation may report
};

uint32_t getLocale(const char *name) {
  uint32_t rc = 0;
  VLLocale *l = VLGetLocale(name, 0, &rc);
  if (l) VLReleaseLocale(l);
  return l ? 0 : rc;
}

void none(Ctx &) {}
void loadBoth(Ctx &c) {
  c.l = locale("German_Germany.MS1252");
  c.other = locale("Japanese_Japan.IBM930");
}
bool bothUsable(Ctx &c) { return usable(c.l) && usable(c.other); }
bool libraryUsable(Ctx &) { return usable(vlglocale) || getLocale("German") == 0; }

// After a failed first load, the same name must still give a handle.
bool loadsAgain(const char *name) { return getLocale(name) == 0; }

void withCatalogPath(Ctx &c) {
  loadBoth(c);
  c.path = catalogDir() + "/%N";
}
void withCatalogFile(Ctx &c) {
  withCatalogPath(c);
  c.cat = VLOpenCatalog(c.l, c.path.c_str(), "fault.cat", VL_CAT_ONEPASS);
}
uint32_t opened(Ctx &c, VLCatalog *cat) {
  c.cat = cat;
  return cat ? 0 : err(c.l);
}
template <class T, class Fn>
uint32_t openWide(Ctx &c, Fn fn, uint32_t opts) {
  return opened(c, fn(c.l, wide<T>(c.path).data(), wide<T>("fault.cat").data(), opts));
}
template <class T, class Fn>
uint32_t messageWide(Ctx &c, Fn fn) {
  T buf[32];
  return fn(c.cat, 2, 7, buf, 32, nullptr, 0);
}
bool catalogUsable(Ctx &c) {
  char buf[32];
  return bothUsable(c) && VLGetMessage(c.cat, 1, 2, buf, sizeof buf, nullptr, 0) == 0 && !std::strcmp(buf, "zwei");
}
void openCatalogFile(Ctx &c) {
  loadBoth(c);
  c.path = catalogDir() + "/fault.cat";
  uint32_t rc = 0;
  c.file = VLOpenFile(1, c.path.c_str(), VL_FILE_READ, 0, &rc);
}

// UTF-16 text behind a stream's transfer function.
const VLUChar kStreamText[] = {'e', 'i', 'n', 's', '\n', 'z', 'w', 'e', 'i', '\n'};
size_t gStreamAt = 0;
int32_t fromText(uint32_t, void *buf, int32_t n) {
  size_t left = sizeof kStreamText - gStreamAt;
  if (!left) return -1;
  size_t k = std::min(left, size_t(n));
  std::memcpy(buf, reinterpret_cast<const char *>(kStreamText) + gStreamAt, k);
  gStreamAt += k;
  return int32_t(k);
}
void withStream(Ctx &c) {
  loadBoth(c);
  gStreamAt = 0;
  c.stream = VLOpenStream(c.l, fromText, 0, VL_STREAM_READ);
}
bool streamUsable(Ctx &c) { return bothUsable(c) && VLReadCharU(c.stream, c.l) != 0xFFFF; }

// The service layer started (with the thread's locale) before the call.
void withService(Ctx &c) {
  loadBoth(c);
  NLS1_PrivateFunction_GetThreadLocale();
}
bool threadUsable(Ctx &c) { return bothUsable(c) && usable(NLS1_PrivateFunction_GetThreadLocale()); }
void dropThreadLocale(Ctx &) {
  if (VLLocale *t = NLS1_PrivateFunction_GetThreadLocale()) VLReleaseLocale(t);
}
uint32_t serviceLocale(uint32_t language, uint32_t territory, uint32_t page) {
  uint32_t rc = 0;
  VLLocale *l = NLS1_GetLocale(NLS1_LOCALE_ID(language, territory), page, 0, &rc);
  if (l) VLReleaseLocale(l);
  return l ? 0 : rc;
}
uint32_t translate(Ctx &) {
  char out[8] = "";
  int32_t count = 0;
  uint32_t rc = 0;
  int32_t n = NLS1_TranslateString(273, out, sizeof out, 500, "\xC1\x5A", 2, &count, 0, &rc);
  return n < 0 ? rc : n == 2 && !std::memcmp(out, "\xC1\xFC", 2) ? 0 : 99;
}
uint16_t idOf(uint16_t type, const char *name) {
  uint32_t rc = 0;
  VLObjEntry *e = VLGetObjFromName(vlglobals->objManager, type, name, int32_t(std::strlen(name)), 1, &rc);
  return e ? e->id : 0;
}

// The code of a call that finds an object, read once the call is done.
uint32_t found(VLObjEntry *e, const uint32_t &rc) { return e ? 0 : rc; }

// The code of a call that gives a handle, read once the call is done.
uint32_t released(VLLocale *l, const uint32_t &rc) {
  if (l) VLReleaseLocale(l);
  return l ? 0 : rc;
}

// Equal in primaries: a comparison of the two takes the full walk and its work area.
const std::string kLong = std::string(3000, 'a') + "\xE4";
const std::string kLongA = "A" + kLong.substr(1);

// "Straße" against "STRASSE" without regard to case: equal, through special casing.
template <class T, class Fn>
uint32_t mappedWide(Ctx &c, Fn fn) {
  auto a = wide<T>("Strasse"), b = wide<T>("STRASSE");
  a.erase(a.begin() + 4), a[4] = 0xDF;
  return fn(c.l, a.data(), -1, b.data(), -1, VL_CMP_NOCASE) == 0 ? err(c.l) : 99u;
}
// The U and W members of collation over the long strings; the code they leave.
template <class T, class Fn>
uint32_t collWide(Ctx &c, Fn fn) {
  auto a = wide<T>(kLong), b = wide<T>(kLongA);
  fn(c.l, a.data(), -1, b.data(), -1, 0);
  return err(c.l);
}
template <class T, class Fn>
uint32_t xfrmWide(Ctx &c, Fn fn) {
  std::vector<char> key(20000);
  auto a = wide<T>(kLongA);
  return fn(c.l, key.data(), int32_t(key.size()), a.data(), -1, 0) > 0 ? 0 : err(c.l);
}

// Counts the names that arrive, and those that arrive empty.
int enumCount(void *n, int, const VLUChar *name) {
  ++static_cast<int *>(n)[*name ? 0 : 1];
  return 1;
}

const Row kRows[] = {
    // Library start and objects.
    {"VLInit", none,
     [](Ctx &) {
       VLTerm();
       return VLInit(noAliasDir().c_str(), ts::countingAlloc, ts::countingFree, 0, 0);
     },
     [](Ctx &) { return vlglobals || VLInit(noAliasDir().c_str(), ts::countingAlloc, ts::countingFree, 0, 0) == 0; },
     nullptr, {VL_RC_NOMEM, VL_RC_NOMANAGER}},
    {"VLInit on the built-in definitions", none,
     [](Ctx &) {
       VLTerm();
       uint32_t rc = VLInit("/nonexistent", ts::countingAlloc, ts::countingFree, 0, 0);
       return rc == VL_RC_DEFAULTS ? 0 : rc;
     },
     [](Ctx &) { return vlglobals || VLInit(VL_TEST_DEFS_DIR, ts::countingAlloc, ts::countingFree, 0, 0) == 0; },
     nullptr, {VL_RC_NOMEM, VL_RC_NOMANAGER}},
    {"VLOpenFile and VLLoadFile", none,
     [](Ctx &c) {
       uint32_t rc = 0;
       c.file = VLOpenFile(1, (std::string(VL_TEST_DEFS_DIR) + "/control.nls").c_str(), VL_FILE_READ, 0, &rc);
       c.block = c.file ? VLLoadFile(c.file, 0, 64, &rc) : nullptr;
       return c.block ? 0 : rc;
     },
     libraryUsable, [](Ctx &c) { VLUnloadFile(c.block); }},
    {"VLLoadObj of an entry found unloaded",
     [](Ctx &c) {
       uint32_t rc = 0;
       c.entry = VLGetObjFromName(vlglobals->objManager, VL_OBJ_CODEPAGE, "MS1250", 6, 1, &rc);
     },
     [](Ctx &c) { return found(VLLoadObj(vlglobals->objManager, c.entry, &c.rc), c.rc); },
     [](Ctx &) { return getLocale("Polish_Poland.MS1250") == 0; }},
    {"VLGetObjFromName loading a code page", none,
     [](Ctx &c) { return found(VLGetObjFromName(vlglobals->objManager, 2, "IBM930", 6, 0, &c.rc), c.rc); },
     [](Ctx &) { return object(2, "IBM930") != nullptr; }},
    {"VLGetObjFromNameW loading a sort", none,
     [](Ctx &c) {
       return found(VLGetObjFromNameW(vlglobals->objManager, VL_OBJ_SORT, wide<VLWChar>("Swedish").data(), 7, 0, &c.rc),
                    c.rc);
     },
     [](Ctx &) { return object(VL_OBJ_SORT, "Swedish") != nullptr; }},
    {"VLGetObjFromID loading a language", none,
     [](Ctx &c) { return found(VLGetObjFromID(vlglobals->objManager, 0, idOf(0, "German"), 0, &c.rc), c.rc); },
     [](Ctx &) { return object(0, "German") != nullptr; }},
    {"VLBuildAliasList", none,
     [](Ctx &) {
       VLDestroyAliasList(vlglobals->objManager);
       return uint32_t(VLBuildAliasList(vlglobals->objManager));
     },
     [](Ctx &) { return getLocale("German_Germany.MS1252") == 0; }, nullptr, {1}},
    {"VLCpV1toV2 of a loaded page", [](Ctx &c) { c.entry = object(2, "IBM037"); },
     [](Ctx &c) {
       mkdefs::CpSections v2, v1;
       for (int i = 0; i < 4; ++i) {
         auto *p = static_cast<const uint8_t *>(c.entry->section[i]);
         v2.sections.emplace_back(p, p + (p ? c.entry->sectionSize[i] : 0));
       }
       std::string why;
       if (!mkdefs::toGeneration1(v2, &v1, &why)) return 99u;
       void *trie = nullptr;
       VLObjEntry rec{};
       c.block = VLCpV1toV2(v1.sections[0].data(), uint32_t(v1.sections[0].size()), v1.sections[1].data(),
                            uint32_t(v1.sections[1].size()), &trie, &rec);
       vl::release(trie);
       return c.block ? 0u : 20u;
     },
     libraryUsable, [](Ctx &c) { vl::release(c.block); }},
    // Locales.
    {"VLGetLocale loading three objects", none, [](Ctx &) { return getLocale("German_Germany.MS1252"); },
     [](Ctx &) { return loadsAgain("German_Germany.MS1252"); }},
    {"VLGetLocale of a shift-sensitive page", none, [](Ctx &) { return getLocale("Japanese_Japan.IBM930"); },
     [](Ctx &) { return loadsAgain("Japanese_Japan.IBM930"); }},
    {"VLGetLocaleU with objects loaded", loadBoth,
     [](Ctx &) {
       uint32_t rc = 0;
       return released(VLGetLocaleU(wide<VLUChar>("German").data(), 0, &rc), rc);
     },
     bothUsable},
    {"VLGetLocaleW with a sort", none,
     [](Ctx &) {
       uint32_t rc = 0;
       return released(VLGetLocaleW(wide<VLWChar>("German_Germany.MS1252@Swedish").data(), 0, &rc), rc);
     },
     [](Ctx &) { return loadsAgain("German_Germany.MS1252@Swedish"); }},
    {"VLConvertNativeLocale", none,
     [](Ctx &) {
       uint32_t rc = 0;
       return released(VLConvertNativeLocale("de_DE.utf8", VL_LOCALE_FALLBACK, &rc), rc);
     },
     [](Ctx &) { return loadsAgain("German_Germany.UTF-8"); }},
    {"VLSetLocale", [](Ctx &) { VLSetLocale("German_Germany.MS1252", 0); },
     [](Ctx &) { return VLSetLocale("French_France.Latin1", 0); }, [](Ctx &) { return usable(vlglocale); }},
    {"VLSetLocaleU", none,
     [](Ctx &) { return VLSetLocaleU(wide<VLUChar>("Japanese_Japan.IBM930").data(), 0); },
     [](Ctx &) { return loadsAgain("Japanese_Japan.IBM930"); }},
    {"VLSetLocaleW", none,
     [](Ctx &) { return VLSetLocaleW(wide<VLWChar>("French_France.Latin1").data(), 0); },
     [](Ctx &) { return loadsAgain("French_France.Latin1"); }},
    {"VLEnumLocalesU", none,
     [](Ctx &) {
       int n[2] = {0, 0};
       return VLEnumLocalesU(enumCount, n) == 0 && n[0] > 100 && n[1] == 0 ? 0u : 99u;
     },
     libraryUsable, nullptr, {0}},
    {"VLLocaleSetModifiable", loadBoth, [](Ctx &c) { return VLLocaleSetModifiable(c.l); }, bothUsable},
    {"VLLocaleChangeTerritory", loadBoth,
     [](Ctx &c) { return VLLocaleChangeTerritory(c.l, object(1, "Japan")); }, bothUsable},
    {"VLLocaleChangeCodePage",
     [](Ctx &c) {
       loadBoth(c);
       c.entry = object(2, "MS1250");
     },
     [](Ctx &c) { return VLLocaleChangeCodePage(c.l, c.entry); }, bothUsable},
    // Information items.
    {"VLSetLocaleTextInfo", loadBoth, [](Ctx &c) { return VLSetLocaleTextInfo(c.l, 64, "EUR", 3, 0) ? 0 : err(c.l); },
     bothUsable},
    {"VLSetLocaleTextInfoU on a shift page", loadBoth,
     [](Ctx &c) {
       const VLUChar text[] = {0x5186, 0};
       return VLSetLocaleTextInfoU(c.other, 64, text, -1, 0) ? 0 : err(c.other);
     },
     bothUsable},
    {"VLSetLocaleTextInfoW", loadBoth,
     [](Ctx &c) {
       const VLWChar text[] = {'D', 'M', 0};
       return VLSetLocaleTextInfoW(c.l, 64, text, -1, 0) ? 0 : err(c.l);
     },
     bothUsable},
    {"VLSetLocaleTextInfoEx on a shift page", loadBoth,
     [](Ctx &c) { return VLSetLocaleTextInfoEx(c.other, 64, "YEN", 0, 3, 0) ? 0 : err(c.other); }, bothUsable},
    {"VLSetLocaleNumInfo", loadBoth, [](Ctx &c) { return VLSetLocaleNumInfo(c.l, 1, 3, 0) ? 0 : err(c.l); },
     bothUsable},
    // The name's text on an EBCDIC page needs the ASCII page, loaded when first asked for.
    {"VLGetLocaleTextInfo, right or refused", loadBoth,
     [](Ctx &c) {
       char buf[64] = "";
       int32_t n = VLGetLocaleTextInfo(c.other, VL_ITEM_LOCALE, buf, sizeof buf, 0);
       c.path = buf;
       return n > 0 ? 0 : err(c.other);
     },
     [](Ctx &c) {
       char buf[64] = "";
       VLGetLocaleTextInfo(c.other, VL_ITEM_LOCALE, buf, sizeof buf, 0);
       return bothUsable(c) && (c.path.empty() || c.path == buf);
     },
     nullptr, {0, VL_RC_NOMEM}},
    {"VLComStrToUnicode", none,
     [](Ctx &) {
       VLUChar u[8];
       return VLComStrToUnicode(reinterpret_cast<const unsigned char *>("abc"), 3, u) == 3 ? 0u : 20u;
     },
     libraryUsable},
    // Conversion and streams.
    {"VLOpenConversion", loadBoth,
     [](Ctx &c) {
       c.conv = VLOpenConversion(c.other, c.l);
       return c.conv ? 0 : err(c.other);
     },
     bothUsable},
    {"VLOpenStream", loadBoth,
     [](Ctx &c) {
       c.stream = VLOpenStream(c.l, fromText, 0, VL_STREAM_READ);
       return c.stream ? 0 : err(c.l);
     },
     bothUsable},
    {"VLReadCharU", withStream, [](Ctx &c) { return VLReadCharU(c.stream, c.l) == 'e' ? 0 : err(c.l); },
     streamUsable},
    {"VLReadStringU", withStream,
     [](Ctx &c) {
       VLUChar line[16];
       return VLReadStringU(c.stream, c.l, line, 16, VL_EOL_LF) == 5 ? 0 : err(c.l);
     },
     streamUsable},
    // Comparison and collation: what they allocate is a work area, and a failure must
    // leave both the handle and the caller's strings as they were.
    {"VLStrcmp without regard to case, on the mapped path", loadBoth,
     [](Ctx &c) { return VLStrcmp(c.l, "Stra\xDF" "e", -1, "STRASSE", -1, VL_CMP_NOCASE) == 0 ? err(c.l) : 99u; },
     bothUsable},
    {"VLStrcmp ignoring trailing blanks", loadBoth,
     [](Ctx &c) { return VLStrcmp(c.l, "abc   ", -1, "abc", -1, VL_CMP_NOBLANKS) == 0 ? err(c.l) : 99u; },
     bothUsable},
    {"VLStrcmpU without regard to case, on the mapped path", loadBoth,
     [](Ctx &c) { return mappedWide<VLUChar>(c, VLStrcmpU); }, bothUsable},
    {"VLWcscmp without regard to case, on the mapped path", loadBoth,
     [](Ctx &c) { return mappedWide<VLWChar>(c, VLWcscmp); }, bothUsable},
    {"VLStrcmpEx without regard to case, on a shift page", loadBoth,
     [](Ctx &c) { return VLStrcmpEx(c.other, kLong.c_str(), 0, -1, kLong.c_str(), 0, -1, VL_CMP_NOCASE) ? 99u : err(c.other); },
     bothUsable},
    {"VLStrcoll beyond the stack work area",
     [](Ctx &c) {
       c.l = locale("German_Germany.MS1252@Swedish");
       c.other = locale("Japanese_Japan.IBM930");
     },
     [](Ctx &c) {
       VLStrcoll(c.l, kLong.c_str(), -1, kLongA.c_str(), -1, 0);
       return err(c.l);
     },
     bothUsable},
    {"VLStrcollEx beyond the stack work area", loadBoth,
     [](Ctx &c) {
       VLStrcollEx(c.l, kLong.c_str(), 0, -1, kLongA.c_str(), 0, -1, VL_COLL_IGNORECASE);
       return err(c.l);
     },
     bothUsable},
    {"VLStrcollU beyond the stack work area", loadBoth,
     [](Ctx &c) { return collWide<VLUChar>(c, VLStrcollU); }, bothUsable},
    {"VLWcscoll beyond the stack work area", loadBoth,
     [](Ctx &c) { return collWide<VLWChar>(c, VLWcscoll); }, bothUsable},
    {"VLStrxfrm beyond the stack work area", loadBoth,
     [](Ctx &c) {
       std::vector<char> key(20000);
       return VLStrxfrm(c.l, key.data(), int32_t(key.size()), kLongA.c_str(), -1, VL_COLL_IGNORECASE) > 0 ? 0u
                                                                                                           : err(c.l);
     },
     bothUsable},
    {"VLStrxfrmEx beyond the stack work area", loadBoth,
     [](Ctx &c) {
       std::vector<char> key(20000);
       return VLStrxfrmEx(c.l, key.data(), int32_t(key.size()), kLongA.c_str(), 0, -1, 0) > 0 ? 0u : err(c.l);
     },
     bothUsable},
    {"VLStrxfrmU beyond the stack work area", loadBoth,
     [](Ctx &c) { return xfrmWide<VLUChar>(c, VLStrxfrmU); }, bothUsable},
    {"VLWcsxfrm beyond the stack work area", loadBoth,
     [](Ctx &c) { return xfrmWide<VLWChar>(c, VLWcsxfrm); }, bothUsable},
    {"VLStrstr by collation", loadBoth,
     [](Ctx &c) { return VLStrstr(c.l, kLongA.c_str(), -1, kLongA.c_str(), -1, VL_COLL_IGNORECASE) ? 0 : err(c.l); },
     bothUsable},
    {"VLStrGenSortKey", [](Ctx &c) { c.l = locale("German_Germany.MS1252@Swedish"); },
     [](Ctx &c) {
       unsigned char key[4];
       const VLUChar u[] = {'a', 0xE4, 'b'};
       return VLStrGenSortKey(c.l, key, sizeof key, u, 3) > 0 ? 0u : 20u;
     },
     [](Ctx &c) { return usable(c.l); }},
    // Catalogs, in file and in memory mode.
    {"VLOpenCatalog in memory", withCatalogPath,
     [](Ctx &c) { return opened(c, VLOpenCatalog(c.l, c.path.c_str(), "fault.cat", VL_CAT_INMEMORY)); }, bothUsable},
    {"VLOpenCatalog from the file", withCatalogPath,
     [](Ctx &c) { return opened(c, VLOpenCatalog(c.l, c.path.c_str(), "fault.cat", 0)); }, bothUsable},
    {"VLOpenCatalogU", withCatalogPath, [](Ctx &c) { return openWide<VLUChar>(c, VLOpenCatalogU, VL_CAT_INMEMORY); },
     bothUsable},
    {"VLOpenCatalogW", withCatalogPath, [](Ctx &c) { return openWide<VLWChar>(c, VLOpenCatalogW, 0); }, bothUsable},
    {"VLGetMessage from the file", withCatalogFile,
     [](Ctx &c) {
       char buf[32];
       return VLGetMessage(c.cat, 2, 7, buf, sizeof buf, nullptr, 0);
     },
     catalogUsable},
    {"VLGetMessageU from the file", withCatalogFile, [](Ctx &c) { return messageWide<VLUChar>(c, VLGetMessageU); },
     catalogUsable},
    {"VLGetMessageW from the file", withCatalogFile, [](Ctx &c) { return messageWide<VLWChar>(c, VLGetMessageW); },
     catalogUsable},
    {"VLMcLoadCat in memory", openCatalogFile,
     [](Ctx &c) {
       c.cat = VLMcLoadCat(c.l, c.file, VL_CAT_INMEMORY);
       if (c.cat) c.file = nullptr;
       return c.cat ? 0 : err(c.l);
     },
     bothUsable},
    {"VLMcLoadSet and MCGetMsg from the file", withCatalogFile,
     [](Ctx &c) {
       VLMcSet rec;
       VLMcSet *s = MCGetSet(c.cat, 1, &rec);
       if (!s) return err(c.l);
       VLMcSet *loaded = VLMcLoadSet(c.cat, s);
       if (!loaded) return err(c.l);
       char *t = MCGetMsg(c.cat, loaded, 2);
       VLMcFree(loaded->index), VLMcFree(loaded->text);
       loaded->index = nullptr, loaded->text = nullptr;
       if (!t) return err(c.l);
       VLMcFree(t);
       return 0u;
     },
     catalogUsable},
    {"VLMcRealloc keeps the block it cannot grow", [](Ctx &c) { c.block = VLMcMalloc(8); },
     [](Ctx &c) {
       std::memcpy(c.block, "kept", 5);
       void *p = VLMcRealloc(c.block, 8, 4096);
       if (p) c.block = p;
       return p ? 0u : 20u;
     },
     [](Ctx &c) { return !std::strcmp(static_cast<char *>(c.block), "kept"); },
     [](Ctx &c) { VLMcFree(c.block); }},
    // The service layer: locales by id, the thread's and the process's.
    {"NLS1_GetLocale by ids", withService,
     [](Ctx &) { return serviceLocale(idOf(0, "French"), idOf(1, "France"), idOf(2, "Latin1")); }, threadUsable,
     dropThreadLocale},
    {"NLS1_SetLocale for the thread", withService,
     [](Ctx &) { return NLS1_SetLocale(NLS1_LOCALE_ID(idOf(0, "French"), idOf(1, "France")), 0, NLS1_SET_THREAD); },
     threadUsable, dropThreadLocale},
    {"NLS1_SetLocale for the process too", withService,
     [](Ctx &) {
       return NLS1_SetLocale(NLS1_LOCALE_ID(idOf(0, "Japanese"), 0), idOf(2, "IBM930"),
                             NLS1_SET_THREAD | NLS1_SET_PROCESS);
     },
     threadUsable, dropThreadLocale},
    {"NLS1_SetLocaleFromNative", withService,
     [](Ctx &) { return NLS1_SetLocaleFromNative("de_DE.utf8", NLS1_SET_THREAD); }, threadUsable,
     dropThreadLocale},
    {"NLS1_SetNativeLocale", withService, [](Ctx &) { return NLS1_SetNativeLocale("ja_JP.eucJP", 0); },
     threadUsable, dropThreadLocale},
    {"NLS1_ConvertNativeLocale", withService,
     [](Ctx &) {
       uint32_t rc = 0;
       return released(NLS1_ConvertNativeLocale("fr_FR.utf8", 0, &rc), rc);
     },
     threadUsable, dropThreadLocale},
    {"NLS1_SetLocaleTextInfo on the thread's locale", withService,
     [](Ctx &) {
       return NLS1_SetLocaleTextInfo(nullptr, 64, "EUR", 3, 0) ? 0 : err(NLS1_PrivateFunction_GetThreadLocale());
     },
     threadUsable, dropThreadLocale},
    // Starting the service builds the process's and the thread's locales: what fails
    // there must not keep the thread without one, nor stop the translation.
    {"NLS1_TranslateString starting the service", loadBoth, translate, threadUsable, dropThreadLocale,
     {0, VL_RC_NOMEM}},
    {"NLS1_TranslateString between two pages not yet loaded", withService, translate, threadUsable,
     dropThreadLocale},
};

void PrintTo(const Row &row, std::ostream *os) { *os << row.name; }

class FaultInjection : public ::testing::TestWithParam<Row> {};

struct Life {
  uint32_t rc = 0;
  long callAllocs = 0;
  long live = 0;
  bool usable = false;
  bool failed = false;
};

// Runs setup, the call, the check and the cleanup in one life of the library, in a child
// process; failAt counts from the call's start. False when the child did not finish.
bool oneLife(const Row &row, long failAt, Life *out) {
  int fds[2];
  if (pipe(fds) != 0) return false;
  pid_t pid = fork();
  if (pid == 0) {
    close(fds[0]);
    Life life;
    ts::resetHooks();
    if (VLInit(VL_TEST_DEFS_DIR, ts::countingAlloc, ts::countingFree, 0, 0) != 0) _exit(3);
    Ctx c;
    row.setup(c);
    long before = ts::hooks.allocs;
    if (failAt > 0) ts::hooks.failAt = before + failAt;
    life.rc = row.call(c);
    life.callAllocs = ts::hooks.allocs - before;
    life.failed = ts::hooks.failed;
    ts::hooks.failAt = -1;
    life.usable = row.stillUsable(c);
    if (row.cleanup) row.cleanup(c);
    if (c.stream) VLCloseStream(c.stream, c.l);
    if (c.conv) VLCloseConversion(c.conv);
    if (c.cat) VLCloseCatalog(c.cat);
    if (c.file) VLCloseFile(c.file, 0);
    if (c.l) VLReleaseLocale(c.l);
    if (c.other) VLReleaseLocale(c.other);
    while (vlglobals) VLTerm();
    life.live = ts::hooks.live;
    _exit(write(fds[1], &life, sizeof life) == sizeof life ? 0 : 4);
  }
  close(fds[1]);
  bool got = pid > 0 && read(fds[0], out, sizeof *out) == sizeof *out;
  close(fds[0]);
  int status = 0;
  if (pid > 0) waitpid(pid, &status, 0);
  return got && WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

TEST_P(FaultInjection, EachAllocationFailsInTurn) {
  const Row &row = GetParam();
  catalogDir(), noAliasDir();
  Life first;
  ASSERT_TRUE(oneLife(row, -1, &first)) << "the call did not finish";
  ASSERT_EQ(first.rc, 0u);
  EXPECT_TRUE(first.usable);
  EXPECT_EQ(first.live, 0);
  ASSERT_GT(first.callAllocs, 0) << "the call allocates nothing: drop the row";
  // Each failure named by the allocation that failed: "rc 0 @3", "leak 2 @5".
  std::vector<std::string> faults;
  for (long k = 1; k <= first.callAllocs && faults.size() < 12; ++k) {
    Life life;
    std::string at = " @" + std::to_string(k);
    if (!oneLife(row, k, &life)) {
      faults.push_back("crash" + at);
      continue;
    }
    if (!life.failed) faults.push_back("no failure" + at);
    if (std::find(row.codes.begin(), row.codes.end(), life.rc) == row.codes.end()) faults.push_back("rc " + std::to_string(life.rc) + at);
    if (!life.usable) faults.push_back("unusable" + at);
    if (life.live) faults.push_back("leak " + std::to_string(life.live) + at);
  }
  EXPECT_EQ(faults, std::vector<std::string>{}) << "of " << first.callAllocs << " allocations";
}

INSTANTIATE_TEST_SUITE_P(PublicCalls, FaultInjection, ::testing::ValuesIn(kRows),
                         [](const ::testing::TestParamInfo<Row> &info) {
                           std::string n;
                           for (const char *p = info.param.name; *p; ++p)
                             n += (std::isalnum(static_cast<unsigned char>(*p)) ? *p : '_');
                           return n;
                         });

}  // namespace
