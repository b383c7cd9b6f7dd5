// The user's locale name: "VL_LANG" as given, else the platform's locale mapped.
#include "locale/native.h"

VL_TRACE_MODULE("vlusrloc");

int VLGetUserLocale(char *out, int32_t outSize) {
  VL_FLOW("VLGetUserLocale");
  if (!out || outSize <= 0) VL_RET(0);
  out[0] = 0;
  if (const char *env = OSL1_GetEnv("VL_LANG")) {
    vl::nat::copyTrunc(out, static_cast<size_t>(outSize), env);
    VL_RET(1);
  }
  vl::LockGuard lock(vl::nat::platformLock());
  char saved[vl::nat::kSaveMax];
  size_t len = 0;
  if (!vl::nat::savePlatform(saved, &len)) {
    VL_ERR("Unable to save current locale to restore. len %d > %d '%s'", static_cast<int>(len),
           static_cast<int>(vl::nat::kSaveMax), std::setlocale(LC_ALL, nullptr));
    VL_RET(0);
  }
  const char *native = std::setlocale(LC_ALL, "");
  if (native) native = std::setlocale(LC_ALL, nullptr);
  if (!native || !*native) native = OSL1_GetEnv("LC_ALL");
  if (!native || !*native) native = OSL1_GetEnv("LANG");
  if (!native || !*native) native = "C";
  VLMapNativeLocale(native, out, outSize);
  std::setlocale(LC_ALL, saved);
  VL_STATE("Restored locale: [%d/%d] %s", static_cast<int>(len), static_cast<int>(vl::nat::kSaveMax), saved);
  VL_STATE("User locale: %s", out);
  VL_RET(2);
}
