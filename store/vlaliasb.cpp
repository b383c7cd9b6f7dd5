// Reads "alias.txt" into the manager's alias list.
#include <cctype>
#include <cerrno>
#include <cstdio>

#include "store/store.h"

VL_TRACE_MODULE("vlaliasb");

namespace {

constexpr size_t kLine = 32767;
constexpr size_t kNameMax = 32, kAliasMax = 64;

bool isBlank(char c) { return c == ' ' || c == '\t' || c == '\n'; }
bool isSpace(char c) { return c == ' ' || c == '\t' || c == '\n' || c == '\v' || c == '\f' || c == '\r'; }

// Next token of blanks, tabs and newlines; null at the end of the line.
const char *token(const char *&p, size_t *len) {
  while (*p && isBlank(*p)) ++p;
  if (!*p) return nullptr;
  const char *s = p;
  while (*p && !isBlank(*p)) ++p;
  *len = static_cast<size_t>(p - s);
  return s;
}

int addAlias(VLObjManager *m, VLAlias **tail, const char *cp, const char *a, size_t n) {
  char shown[kAliasMax + 1];
  std::memcpy(shown, a, n > kAliasMax ? kAliasMax : n);
  shown[n > kAliasMax ? kAliasMax : n] = 0;
  if (n > kAliasMax) {
    VL_ERR("Alias name length (%d) for %s exceeds maximum of %d", static_cast<int>(n), cp, 32);
    return 1;
  }
  VL_DETAIL("Processing alias '%s'", shown);
  auto *r = static_cast<VLAlias *>(vl::alloc(sizeof(VLAlias)));
  if (!r) {
    VL_ERR("Unable to allocate %d bytes for codepage %s, alias %s", static_cast<int>(sizeof(VLAlias)), cp, shown);
    return 1;
  }
  std::memset(r, 0, sizeof *r);
  std::memcpy(r->codePage, cp, std::strlen(cp) + 1);
  for (size_t i = 0; i < n; ++i) r->alias[i] = static_cast<char>(std::toupper(static_cast<unsigned char>(a[i])));
  VL_DETAIL("Saved alias %s, length = %d", r->alias, static_cast<int>(n));
  if (*tail)
    (*tail)->next = r;
  else
    m->aliases = r;
  *tail = r;
  return 0;
}

}  // namespace

int VLBuildAliasList(VLObjManager *m) {
  VL_FLOW("VLBuildAliasList");
  // A missing alias file is an error only for a process that traces errors.
  const int failure = vl_trc.on(TRC1_ERROR) ? 1 : 0;
  char name[256];
  if (!m || !VLGetAliasFileName(m->directory, name, sizeof name)) {
    VL_ERR("Unable to generate alias file name");
    VL_RET(failure);
  }
  FILE *f = std::fopen(name, "r");
  if (!f) {
    VL_ERR("Open of %s failed, err = %d", name, errno);
    VL_RET(failure);
  }
  vl::Block<char> line(kLine + 1);
  if (!line) {
    std::fclose(f);
    VL_RET(1);
  }
  VLAlias *tail = m->aliases;
  while (tail && tail->next) tail = tail->next;
  char current[kNameMax + 1] = "";
  bool haveEntry = false;
  int rc = 0;
  while (rc == 0 && std::fgets(line.get(), static_cast<int>(kLine), f)) {
    const char *p = line.get();
    if (*p == '#') continue;
    bool blankLine = true;
    for (const char *q = p; *q; ++q)
      if (!isBlank(*q)) blankLine = false;
    if (blankLine) continue;
    size_t n;
    if (!isSpace(*p)) {
      const char *cp = token(p, &n);
      if (n > kNameMax) {
        line.get()[cp - line.get() + n] = 0;  // the line is read no further
        VL_ERR("codepage name length (%d) for %s exceeds maximum of %d", static_cast<int>(n), cp, 32);
        rc = 1;
        break;
      }
      std::memcpy(current, cp, n);
      current[n] = 0;
      haveEntry = true;
      VL_DETAIL("Processing codepage '%s'", current);
    } else if (!haveEntry) {
      const char *t = token(p, &n);
      char shown[kAliasMax + 1];
      size_t k = n > kAliasMax ? kAliasMax : n;
      std::memcpy(shown, t, k);
      shown[k] = 0;
      VL_ERR("Codepage name %s does not start in column 1", shown);
      rc = 1;
      break;
    }
    const char *a;
    while (rc == 0 && (a = token(p, &n))) rc = addAlias(m, &tail, current, a, n);
  }
  std::fclose(f);
  VL_RET(rc);
}
