// Trace facility over stdio, configured from the environment.
#include <cinttypes>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "frame/host.h"

std::atomic<uint32_t> TRC1_generation{1};

namespace {

// The configuration is small and fixed-size so that tracing never allocates.
constexpr int kMaxRules = 16;
struct Rule {
  char module[24];
  uint32_t flags;
};
struct Config {
  Rule rules[kMaxRules];
  int count = 0;
  uint32_t all = 0;
  FILE *out = nullptr;
  bool ownOut = false;
};

pthread_mutex_t g_mutex = PTHREAD_MUTEX_INITIALIZER;
Config g_config;
bool g_loaded = false;

void parseFlags(Config &c, const char *text) {
  c.count = 0;
  c.all = 0;
  if (!text) return;
  const char *p = text;
  while (*p) {
    const char *end = std::strchr(p, ',');
    size_t n = end ? static_cast<size_t>(end - p) : std::strlen(p);
    char item[64];
    if (n < sizeof item) {
      std::memcpy(item, p, n);
      item[n] = 0;
      char *eq = std::strchr(item, '=');
      if (eq) {
        *eq = 0;
        if (c.count < kMaxRules && std::strlen(item) < sizeof c.rules[0].module) {
          std::strcpy(c.rules[c.count].module, item);
          c.rules[c.count].flags = static_cast<uint32_t>(std::strtoul(eq + 1, nullptr, 0));
          ++c.count;
        }
      } else {
        c.all = static_cast<uint32_t>(std::strtoul(item, nullptr, 0));
      }
    }
    p += n;
    if (*p == ',') ++p;
  }
}

void load(const char *flags, const char *file) {
  if (g_config.ownOut && g_config.out) std::fclose(g_config.out);
  g_config.out = nullptr;
  g_config.ownOut = false;
  parseFlags(g_config, flags);
  if (file && *file) {
    g_config.out = std::fopen(file, "a");
    g_config.ownOut = g_config.out != nullptr;
  }
  g_loaded = true;
}

FILE *sink() { return g_config.out ? g_config.out : stderr; }

}  // namespace

void TRC1_Configure(const char *flags, const char *file) {
  pthread_mutex_lock(&g_mutex);
  load(flags ? flags : std::getenv("TRC1_FLAGS"), file ? file : std::getenv("TRC1_FILE"));
  TRC1_generation.fetch_add(1, std::memory_order_release);
  pthread_mutex_unlock(&g_mutex);
}

void TRC1_Sync(TRC1_Record *r) {
  pthread_mutex_lock(&g_mutex);
  if (!g_loaded) load(std::getenv("TRC1_FLAGS"), std::getenv("TRC1_FILE"));
  uint32_t f = g_config.all;
  for (int i = 0; i < g_config.count; ++i)
    if (std::strcmp(g_config.rules[i].module, r->module) == 0) f = g_config.rules[i].flags;
  r->flags.store(f, std::memory_order_relaxed);
  r->generation.store(TRC1_generation.load(std::memory_order_acquire), std::memory_order_release);
  pthread_mutex_unlock(&g_mutex);
}

void TRC1_Event(TRC1_Record *r, int kind, int line, const char *function, long value) {
  pthread_mutex_lock(&g_mutex);
  FILE *o = sink();
  if (kind == 0)
    std::fprintf(o, "%s %s: > %s (line %d)\n", r->component, r->module, function, line);
  else if (kind == 1)
    std::fprintf(o, "%s %s: < %s = %ld (line %d)\n", r->component, r->module, function, value, line);
  else
    std::fprintf(o, "%s %s: < %s (line %d)\n", r->component, r->module, function, line);
  std::fflush(o);
  pthread_mutex_unlock(&g_mutex);
}

void TRC1_Printf(TRC1_Record *r, const char *format, ...) {
  pthread_mutex_lock(&g_mutex);
  FILE *o = sink();
  std::fprintf(o, "%s %s: ", r->component, r->module);
  va_list ap;
  va_start(ap, format);
  std::vfprintf(o, format, ap);
  va_end(ap);
  size_t n = std::strlen(format);
  if (n == 0 || format[n - 1] != '\n') std::fputc('\n', o);
  std::fflush(o);
  pthread_mutex_unlock(&g_mutex);
}

void TRC1_Dump(TRC1_Record *r, const char *title, const void *data, size_t length) {
  pthread_mutex_lock(&g_mutex);
  FILE *o = sink();
  std::fprintf(o, "%s %s: %s (%zu bytes)\n", r->component, r->module, title, length);
  const unsigned char *p = static_cast<const unsigned char *>(data);
  for (size_t i = 0; i < length; i += 16) {
    std::fprintf(o, "  %04zx:", i);
    for (size_t j = i; j < i + 16 && j < length; ++j) std::fprintf(o, " %02x", p[j]);
    std::fputc('\n', o);
  }
  std::fflush(o);
  pthread_mutex_unlock(&g_mutex);
}
