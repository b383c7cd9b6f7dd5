// The service layer's locale state and queries: one process block that starts the
// library, one block per thread holding that thread's handle, and the NLS1_ functions
// that build, install and query locales by id, by native name and by item.
#include <clocale>
#include <cstdio>

#include "store/store.h"
#include "locale/locale.h"
#include "locale/native.h"
#include "service/service.h"

VL_TRACE_MODULE("tlxnls1");

std::atomic<int32_t> tlxinflg{0};

namespace {

// ---- Process and thread blocks ---------------------------------------------------------

void InitProcess(void *block) {
  auto *result = static_cast<int32_t *>(block);
  const char *dir = OSL1_GetEnv("NLS1_LOCALEDIR");
  if (!dir) VL_TRACE(TRC1_SERVICE, "Unable to determine location of locale definitions\n");
  uint32_t rc = VLInit(dir, nullptr, nullptr, 0, 0);
  if (rc != VL_RC_OK && rc != VL_RC_DEFAULTS) {
    tlxinflg.store(-1);
    VL_ERR("Unable to initialize Veltrin, rc = %d", static_cast<int>(rc));
    *result = static_cast<int32_t>(rc);
    return;
  }
  tlxinflg.store(1);
  rc = VLSetLocale(nullptr, VL_LOCALE_USER | VL_LOCALE_FALLBACK);
  if (rc) VL_ERR("Unable to set global locale, rc = %d", static_cast<int>(rc));
  *result = static_cast<int32_t>(rc);
}

void TermProcess(void *) { VLTerm(); }

OSL1_Descriptor gProcess = {sizeof(int32_t), InitProcess, TermProcess, nullptr, {}, PTHREAD_ONCE_INIT, {0}};

// Builds the thread's handle once the library runs, whether or not the process default
// could be set; a slot left empty (memory ran out) is filled on a later use.
void fillThreadSlot(VLLocale **slot) {
  if (*slot || tlxinflg.load() <= 0) return;
  uint32_t rc = 0;
  *slot = VLGetLocale(nullptr, VL_LOCALE_USER | VL_LOCALE_FALLBACK, &rc);
  if (!*slot) VL_ERR("Unable to set thread locale, rc = %d", static_cast<int>(rc));
}

void InitThread(void *block) {
  auto *slot = static_cast<VLLocale **>(block);
  *slot = nullptr;
  if (OSL1_ResolveProcess(&gProcess, "tlxnls1", __LINE__)) fillThreadSlot(slot);
}

void TermThread(void *block) {
  auto *slot = static_cast<VLLocale **>(block);
  if (*slot) VLReleaseLocale(*slot);
  *slot = nullptr;
}

// The thread block holds a pointer, whatever the platform's pointer size.
OSL1_Descriptor gThread = {sizeof(VLLocale *), InitThread, TermThread, nullptr, {}, PTHREAD_ONCE_INIT, {0}};

VLObjManager *manager() { return vlglobals ? vlglobals->objManager : nullptr; }

// ---- Locale names from ids ----------------------------------------------------------------

// Appends sep and the name of object (type, id) to out; 30, 31 or 34 when there is none.
uint32_t appendObject(char *out, size_t size, int type, uint16_t id, const char *sep, uint32_t notFound,
                      const char *what) {
  uint32_t rc = 0;
  VLObjEntry *e = vl::store::objById(manager(), static_cast<uint16_t>(type), id, 1, &rc);
  if (!e) {
    VL_ERR("Invalid %s %d", what, static_cast<int>(id));
    return notFound;
  }
  size_t n = std::strlen(out);
  std::snprintf(out + n, size - n, "%s%.*s", sep, static_cast<int>(sizeof e->name), e->name);
  return 0;
}

uint32_t nameFromIds(uint32_t localeId, uint32_t codePageId, char *out, size_t size) {
  out[0] = 0;
  auto language = static_cast<uint16_t>(localeId & 0xFFFF), territory = static_cast<uint16_t>(localeId >> 16);
  uint32_t rc = 0;
  if (language) rc = appendObject(out, size, VL_OBJ_LANGUAGE, language, "", VL_RC_NOLANGUAGE, "Language");
  if (!rc && territory) rc = appendObject(out, size, VL_OBJ_TERRITORY, territory, "_", VL_RC_NOTERRITORY, "Territory");
  if (!rc && codePageId) {
    if (codePageId > 0xFFFF) {
      VL_ERR("Invalid Codepage %d", static_cast<int>(codePageId));
      return VL_RC_NOCODEPAGE;
    }
    rc = appendObject(out, size, VL_OBJ_CODEPAGE, static_cast<uint16_t>(codePageId), ".", VL_RC_NOCODEPAGE,
                      "Codepage");
  }
  return rc;
}

// Replaces the calling thread's handle; the old one goes only when the new one exists.
uint32_t replaceThreadLocale(VLLocale *l) {
  VLLocale **slot = vl::svc::threadSlot();
  if (!slot) {
    VLReleaseLocale(l);
    return VL_RC_NOMEM;
  }
  VLLocale *old = *slot;
  *slot = l;
  if (old) VLReleaseLocale(old);
  return 0;
}

uint32_t objectId(const char *name, int type, uint32_t *rcOut) {
  uint32_t dummy;
  uint32_t *rc = rcOut ? rcOut : &dummy;
  *rc = 0;
  if (!vl::svc::ready()) {
    *rc = VL_RC_OPEN;
    return 0;
  }
  if (!name) {
    *rc = VL_RC_BADARG;
    return 0;
  }
  if (type == VL_OBJ_CODEPAGE)
    if (const char *canonical = VLGetCodepageFromAlias(manager(), name)) name = canonical;
  VLObjEntry *e = VLGetObjFromName(manager(), static_cast<uint16_t>(type), name,
                                   static_cast<int32_t>(std::strlen(name)), 1, rc);
  // No entry and no error: "Binary" names binary order, whose sort id is 0.
  return e ? e->id : 0;
}

}  // namespace

bool vl::svc::ready() {
  OSL1_ResolveProcess(&gProcess, "tlxnls1", __LINE__);
  return tlxinflg.load() > 0;
}

VLLocale **vl::svc::threadSlot() {
  return static_cast<VLLocale **>(OSL1_ResolveThread(&gProcess, &gThread, "tlxnls1", __LINE__));
}

// ---- Process and thread state ---------------------------------------------------------------

int32_t NLS1_PrivateFunction_GetProcessLocale(void) {
  VL_FLOW("NLS1_PrivateFunction_GetProcessLocale");
  OSL1_ResolveProcess(&gProcess, "tlxnls1", __LINE__);
  VL_RET(0);
}

VLLocale *NLS1_PrivateFunction_GetThreadLocale(void) {
  VL_FLOW("NLS1_PrivateFunction_GetThreadLocale");
  VLLocale **slot = vl::svc::threadSlot();
  if (slot) fillThreadSlot(slot);
  VL_RET(slot ? *slot : static_cast<VLLocale *>(nullptr));
}

// ---- Locales by id ------------------------------------------------------------------------------

VLLocale *NLS1_GetLocale(uint32_t localeId, uint32_t codePageId, uint32_t options, uint32_t *rcOut) {
  VL_FLOW("NLS1_GetLocale");
  uint32_t dummy;
  uint32_t *rc = rcOut ? rcOut : &dummy;
  *rc = 0;
  if (!vl::svc::ready()) {
    *rc = VL_RC_OPEN;
    VL_RET(static_cast<VLLocale *>(nullptr));
  }
  char name[132];
  *rc = nameFromIds(localeId, codePageId, name, sizeof name);
  if (*rc) VL_RET(static_cast<VLLocale *>(nullptr));
  VL_RET(VLGetLocale(name, options, rc));
}

uint32_t NLS1_SetLocale(uint32_t localeId, uint32_t codePageId, uint32_t options) {
  VL_FLOW("NLS1_SetLocale");
  if (!vl::svc::ready()) VL_RET(VL_RC_OPEN);
  const uint32_t pass = options & (VL_LOCALE_USER | VL_LOCALE_FALLBACK);
  if (options & NLS1_SET_THREAD) {
    uint32_t rc = 0;
    VLLocale *l = NLS1_GetLocale(localeId, codePageId, pass, &rc);
    if (!l) VL_RET(rc);
    rc = replaceThreadLocale(l);
    if (rc || !(options & NLS1_SET_PROCESS)) VL_RET(rc);
  }
  char name[132];
  uint32_t rc = nameFromIds(localeId, codePageId, name, sizeof name);
  if (rc) VL_RET(rc);
  VL_RET(VLSetLocale(name, pass));
}

// ---- Locales by native name --------------------------------------------------------------------

uint32_t NLS1_SetLocaleFromNative(const char *native, uint32_t options) {
  VL_FLOW("NLS1_SetLocaleFromNative");
  if (!vl::svc::ready()) VL_RET(VL_RC_OPEN);
  if (!native) VL_RET(VL_RC_BADARG);
  const uint32_t pass = options & (VL_LOCALE_USER | VL_LOCALE_FALLBACK);
  if (options & NLS1_SET_THREAD) {
    uint32_t rc = 0;
    VLLocale *l = VLConvertNativeLocale(native, pass & VL_LOCALE_FALLBACK, &rc);
    if (!l) VL_RET(rc);
    rc = replaceThreadLocale(l);
    if (rc || !(options & NLS1_SET_PROCESS)) VL_RET(rc);
  }
  char name[132];
  VLMapNativeLocale(native, name, sizeof name);
  uint32_t rc = VLSetLocale(name, pass);
  if (!rc) VLMapNativeInfo(native, vlglocale, 0);
  VL_RET(rc);
}

uint32_t NLS1_SetNativeLocale(const char *native, uint32_t options) {
  VL_FLOW("NLS1_SetNativeLocale");
  VL_RET(NLS1_SetLocaleFromNative(native, options | NLS1_SET_THREAD | NLS1_SET_PROCESS));
}

uint32_t NLS1_SetNativeFromLocale(VLLocale *locale, int category) {
  VL_FLOW("NLS1_SetNativeFromLocale");
  if (!vl::svc::ready()) VL_RET(VL_RC_OPEN);
  VLLocale *l = vl::svc::orThread(locale);
  char native[64];
  if (!VLConvertLocale(l, native, sizeof native)) {
    VL_ERR("NLS1_ConvertLocale failed with rc = %d", static_cast<int>(VL_RC_NOTFOUND));
    VL_RET(vl::setRc(l, VL_RC_NOTFOUND));
  }
  // The library's own save/set/restore sequences hold this lock; so must a setting of ours.
  vl::LockGuard lock(vl::nat::platformLock());
  if (!std::setlocale(category, native)) {
    VL_ERR("setlocale failed to setlocale to %s", native);
    VL_RET(vl::setRc(l, VL_RC_OPEN));
  }
  VL_RET(vl::setRc(l, VL_RC_OK));
}

VLLocale *NLS1_ConvertNativeLocale(const char *native, uint32_t options, uint32_t *rcOut) {
  VL_FLOW("NLS1_ConvertNativeLocale");
  uint32_t dummy;
  uint32_t *rc = rcOut ? rcOut : &dummy;
  *rc = 0;
  if (!vl::svc::ready()) {
    *rc = VL_RC_OPEN;
    VL_RET(static_cast<VLLocale *>(nullptr));
  }
  VLLocale *l = VLConvertNativeLocale(native, options, rc);
  if (!l) VL_ERR("VLConvertNativeLocale failed for %s with rc %d", native ? native : "", static_cast<int>(*rc));
  VL_RET(l);
}

// ---- Information items ---------------------------------------------------------------------------

int32_t NLS1_GetLocaleNumInfo(VLLocale *locale, int32_t item, int32_t source) {
  VL_FLOW("NLS1_GetLocaleNumInfo");
  if (!vl::svc::ready()) VL_RET(-1);
  VLLocale *l = vl::svc::orThread(locale);
  // Item 14 as a number: the language's default code page id.
  if (item == 14) {
    VLLocale *h = vl::orDefault(l);
    if (!h || !h->language || !vl::loc::body(h->language)) VL_RET(-1);
    vl::setRc(h, VL_RC_OK);
    VL_RET(static_cast<int32_t>(vl::loc::word(h->language, 1)));
  }
  VL_RET(VLGetLocaleNumInfo(l, item, source));
}

int32_t NLS1_GetLocaleTextInfo(VLLocale *locale, int32_t item, char *buffer, int32_t size, uint32_t options) {
  VL_FLOW("NLS1_GetLocaleTextInfo");
  if (!vl::svc::ready()) VL_RET(-1);
  VL_RET(VLGetLocaleTextInfo(vl::svc::orThread(locale), item, buffer, size, options));
}

int32_t NLS1_GetLocaleTextInfoW(VLLocale *locale, int32_t item, VLWChar *buffer, int32_t size, uint32_t options) {
  VL_FLOW("NLS1_GetLocaleTextInfoW");
  if (!vl::svc::ready()) VL_RET(-1);
  VL_RET(VLGetLocaleTextInfoW(vl::svc::orThread(locale), item, buffer, size, options));
}

int32_t NLS1_GetLocaleTextInfoU(VLLocale *locale, int32_t item, VLUChar *buffer, int32_t size, uint32_t options) {
  VL_FLOW("NLS1_GetLocaleTextInfoU");
  if (!vl::svc::ready()) VL_RET(-1);
  VL_RET(VLGetLocaleTextInfoU(vl::svc::orThread(locale), item, buffer, size, options));
}

int32_t NLS1_GetLocaleTextInfoEx(VLLocale *locale, int32_t item, char *buffer, VLShiftState state, int32_t size,
                                 uint32_t options) {
  VL_FLOW("NLS1_GetLocaleTextInfoEx");
  if (!vl::svc::ready()) VL_RET(-1);
  VL_RET(VLGetLocaleTextInfoEx(vl::svc::orThread(locale), item, buffer, state, size, options));
}

int NLS1_SetLocaleNumInfo(VLLocale *locale, int32_t item, int32_t value, uint32_t reserved) {
  VL_FLOW("NLS1_SetLocaleNumInfo");
  if (!vl::svc::ready()) VL_RET(0);
  VLLocale *l = vl::svc::orThread(locale);
  if (item != 9) VL_RET(VLSetLocaleNumInfo(l, item, value, reserved));
  // The code page goes in by name, so that an alias-aware setter does the change.
  uint32_t rc = 0;
  VLObjEntry *cp = value > 0 && value <= 0xFFFF
                       ? vl::store::objById(manager(), VL_OBJ_CODEPAGE, static_cast<uint16_t>(value), 1, &rc)
                       : nullptr;
  if (!cp) {
    VL_ERR("Invalid Codepage %d", static_cast<int>(value));
    vl::setRc(vl::orDefault(l), VL_RC_NOTFOUND);
    VL_RET(0);
  }
  char name[sizeof cp->name + 1];
  std::memcpy(name, cp->name, sizeof cp->name);
  name[sizeof cp->name] = 0;
  VL_RET(VLSetLocaleTextInfo(l, 10, name, -1, 0));
}

int NLS1_SetLocaleTextInfo(VLLocale *locale, int32_t item, const char *data, int32_t length, uint32_t options) {
  VL_FLOW("NLS1_SetLocaleTextInfo");
  if (!vl::svc::ready()) VL_RET(0);
  VL_RET(VLSetLocaleTextInfo(vl::svc::orThread(locale), item, data, length, options));
}

int NLS1_SetLocaleTextInfoW(VLLocale *locale, int32_t item, const VLWChar *data, int32_t length, uint32_t options) {
  VL_FLOW("NLS1_SetLocaleTextInfoW");
  if (!vl::svc::ready()) VL_RET(0);
  VL_RET(VLSetLocaleTextInfoW(vl::svc::orThread(locale), item, data, length, options));
}

int NLS1_SetLocaleTextInfoU(VLLocale *locale, int32_t item, const VLUChar *data, int32_t length, uint32_t options) {
  VL_FLOW("NLS1_SetLocaleTextInfoU");
  if (!vl::svc::ready()) VL_RET(0);
  VL_RET(VLSetLocaleTextInfoU(vl::svc::orThread(locale), item, data, length, options));
}

int NLS1_SetLocaleTextInfoEx(VLLocale *locale, int32_t item, const char *data, VLShiftState state, int32_t length,
                             uint32_t options) {
  VL_FLOW("NLS1_SetLocaleTextInfoEx");
  if (!vl::svc::ready()) VL_RET(0);
  VL_RET(VLSetLocaleTextInfoEx(vl::svc::orThread(locale), item, data, state, length, options));
}

// ---- Ids and names of objects -------------------------------------------------------------------

uint32_t NLS1_GetCodepageId(const char *name, uint32_t *rc) {
  VL_FLOW("NLS1_GetCodepageId");
  VL_RET(objectId(name, VL_OBJ_CODEPAGE, rc));
}

uint32_t NLS1_GetLanguageId(const char *name, uint32_t *rc) {
  VL_FLOW("NLS1_GetLanguageId");
  VL_RET(objectId(name, VL_OBJ_LANGUAGE, rc));
}

uint32_t NLS1_GetTerritoryId(const char *name, uint32_t *rc) {
  VL_FLOW("NLS1_GetTerritoryId");
  VL_RET(objectId(name, VL_OBJ_TERRITORY, rc));
}

uint32_t NLS1_GetSortId(const char *name, uint32_t *rc) {
  VL_FLOW("NLS1_GetSortId");
  VL_RET(objectId(name, VL_OBJ_SORT, rc));
}

uint32_t NLS1_GetObjectName(uint32_t id, char *out, int32_t outSize, int type) {
  VL_FLOW("NLS1_GetObjectName");
  if (!vl::svc::ready()) VL_RET(VL_RC_OPEN);
  if (!out || outSize < 0 || type < 0 || type > 3 || id > 0xFFFF) VL_RET(VL_RC_BADARG);
  uint32_t rc = 0;
  VLObjEntry *e = vl::store::objById(manager(), static_cast<uint16_t>(type), static_cast<uint16_t>(id), 1, &rc);
  // Sort id 0 is binary order: no object, and the name its lookup by name takes.
  if (!e && (rc || type != VL_OBJ_SORT || id != 0)) VL_RET(rc ? rc : VL_RC_NOTFOUND);
  const char *name = e ? e->name : "Binary";
  size_t n = strnlen(name, sizeof e->name);
  if (n >= static_cast<size_t>(outSize)) {
    VL_ERR("Object name length (%d) for %.*s exceeds output buffer length (%d)", static_cast<int>(n),
           static_cast<int>(n), name, static_cast<int>(outSize));
    VL_RET(VL_RC_BUFFER);
  }
  std::memcpy(out, name, n);
  out[n] = 0;
  VL_RET(VL_RC_OK);
}

uint32_t NLS1_GetLanguageName(uint32_t localeId, char *out, int32_t outSize) {
  VL_FLOW("NLS1_GetLanguageName");
  VL_RET(NLS1_GetObjectName(localeId & 0xFFFF, out, outSize, VL_OBJ_LANGUAGE));
}

uint32_t NLS1_GetTerritoryName(uint32_t localeId, char *out, int32_t outSize) {
  VL_FLOW("NLS1_GetTerritoryName");
  VL_RET(NLS1_GetObjectName(localeId >> 16, out, outSize, VL_OBJ_TERRITORY));
}

uint32_t NLS1_GetCodepageName(uint32_t codePageId, char *out, int32_t outSize) {
  VL_FLOW("NLS1_GetCodepageName");
  VL_RET(NLS1_GetObjectName(codePageId, out, outSize, VL_OBJ_CODEPAGE));
}

uint32_t NLS1_GetSortName(uint32_t sortId, char *out, int32_t outSize) {
  VL_FLOW("NLS1_GetSortName");
  VL_RET(NLS1_GetObjectName(sortId, out, outSize, VL_OBJ_SORT));
}
