// A native locale name, simple or composite, to a library locale name.
#include <cstdio>

#include "locale/native.h"

VL_TRACE_MODULE("vlmapnat");

namespace {

constexpr const char *kUnknown = "Unknown";

// The row of the value after "key" in a composite name, up to the next ";".
const vl::nat::Row *categoryRow(const char *composite, const char *key) {
  const char *p = std::strstr(composite, key);
  if (!p) return nullptr;
  p += std::strlen(key);
  return vl::nat::findRow(p, std::strcspn(p, ";"));
}

}  // namespace

char *VLMapNativeLocale(const char *native, char *out, int32_t outSize) {
  VL_FLOW("VLMapNativeLocale");
  if (!out || outSize <= 0) VL_RET(out);
  if (!native) native = "";
  if (!std::strchr(native, ';')) {
    VL_DETAIL("Searching for %s", native);
    const vl::nat::Row *r = vl::nat::findRow(native, std::strlen(native));
    if (!r)
      vl::nat::copyTrunc(out, static_cast<size_t>(outSize), kUnknown);
    else
      std::snprintf(out, static_cast<size_t>(outSize), "%s_%s.%s@%s", r->language, r->territory, r->codePage,
                    r->sort);
    VL_RET(out);
  }
  // One locale per category: the time category names the language, the numeric one the
  // territory, the character one the code page, and collation the sort.
  const vl::nat::Row *time = categoryRow(native, "LC_TIME=");
  const vl::nat::Row *num = categoryRow(native, "LC_NUMERIC=");
  const vl::nat::Row *ctype = categoryRow(native, "LC_CTYPE=");
  const vl::nat::Row *coll = categoryRow(native, "LC_COLLATE=");
  std::snprintf(out, static_cast<size_t>(outSize), "%s_%s.%s@%s", time ? time->language : kUnknown,
                num ? num->territory : kUnknown, ctype ? ctype->codePage : kUnknown, coll ? coll->sort : kUnknown);
  VL_RET(out);
}
