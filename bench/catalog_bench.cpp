// Message lookup in a catalog of 10,000 messages (10 sets of 1,000): this library in file
// mode and in memory mode against the C library's catgets on a catalog its gencat compiled
// from the same source, in the same run. Every lookup goes to a pseudo-random message;
// VLGetMessage copies the text into the caller's buffer (converted, here UTF-8 to UTF-8),
// catgets hands out a pointer, as MCGetMsg does for a loaded catalog; each is also run
// the other way (catgets with a copy, MCGetMsg without).
#include <benchmark/benchmark.h>
#include <nl_types.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <random>
#include <string>
#include <vector>

#include "veltrin.h"

namespace {

constexpr int kSets = 10, kPerSet = 1000;

struct Fixture {
  std::string dir;
  std::vector<std::pair<int, int>> keys;
  bool ok = false;
  Fixture() {
    dir = (std::filesystem::temp_directory_path() / "vlcatbench").string();
    std::filesystem::create_directories(dir);
    std::ofstream src(dir + "/b.msg");
    for (int s = 1; s <= kSets; ++s) {
      src << "$set " << s << "\n";
      for (int m = 1; m <= kPerSet; ++m) src << m << " Message " << m << " of set " << s << ": something went wrong\n";
    }
    src.close();
    const std::string tlx = std::string(VL_TEST_DEFS_DIR) + "/../tlx";
    const std::string ours = tlx + " gencat --dir " + VL_TEST_DEFS_DIR + " --locale English_UnitedStates.UTF-8 " +
                             dir + "/ours.cat " + dir + "/b.msg";
    const std::string theirs = "gencat " + dir + "/theirs.cat " + dir + "/b.msg";
    std::filesystem::remove(dir + "/ours.cat");
    std::filesystem::remove(dir + "/theirs.cat");
    ok = std::system(ours.c_str()) == 0 && std::system(theirs.c_str()) == 0;
    std::mt19937 rng(15);
    for (int i = 0; i < 4096; ++i)
      keys.push_back({1 + static_cast<int>(rng() % kSets), 1 + static_cast<int>(rng() % kPerSet)});
  }
  ~Fixture() { std::filesystem::remove_all(dir); }
};
Fixture &fixture() {
  static Fixture f;
  return f;
}

// pointer: the pointer a loaded catalog hands out (MCGetSet, MCGetMsg), the same work as
// catgets; else VLGetMessage's copy into the caller's buffer.
void ours(benchmark::State &state, uint32_t mode, bool pointer) {
  Fixture &f = fixture();
  uint32_t rc;
  VLLocale *l = VLGetLocale("English_UnitedStates.UTF-8", 0, &rc);
  VLCatalog *c = f.ok && l ? VLOpenCatalog(l, nullptr, (f.dir + "/ours.cat").c_str(), mode) : nullptr;
  if (!c) {
    state.SkipWithError("catalog not built");
    if (l) VLReleaseLocale(l);
    return;
  }
  char buf[128];
  VLMcSet rec;
  size_t i = 0;
  for (auto _ : state) {
    const auto &k = f.keys[i++ & 4095];
    const auto set = static_cast<uint32_t>(k.first), msg = static_cast<uint32_t>(k.second);
    if (pointer) {
      VLMcSet *s = MCGetSet(c, set, &rec);
      benchmark::DoNotOptimize(s ? MCGetMsg(c, s, msg) : nullptr);
    } else {
      benchmark::DoNotOptimize(VLGetMessage(c, set, msg, buf, sizeof buf, nullptr, 0));
    }
  }
  state.SetItemsProcessed(static_cast<int64_t>(state.iterations()));
  VLCloseCatalog(c);
  VLReleaseLocale(l);
}

// copy: the text goes into a buffer as ours does, so both do the same work.
void catgetsLookup(benchmark::State &state, bool copy) {
  Fixture &f = fixture();
  nl_catd d = f.ok ? catopen((f.dir + "/theirs.cat").c_str(), 0) : reinterpret_cast<nl_catd>(-1);
  if (d == reinterpret_cast<nl_catd>(-1)) {
    state.SkipWithError("catalog not built");
    return;
  }
  size_t i = 0;
  char buf[128];
  for (auto _ : state) {
    const auto &k = f.keys[i++ & 4095];
    char *t = catgets(d, k.first, k.second, nullptr);
    if (copy && t) {
      size_t n = strnlen(t, sizeof buf - 1);
      std::memcpy(buf, t, n);
      buf[n] = 0;
      benchmark::DoNotOptimize(buf);
    }
    benchmark::DoNotOptimize(t);
  }
  state.SetItemsProcessed(static_cast<int64_t>(state.iterations()));
  catclose(d);
}

BENCHMARK_CAPTURE(ours, CatalogLookup/memory, VL_CAT_INMEMORY, false);
BENCHMARK_CAPTURE(ours, CatalogLookup/file, 0u, false);
BENCHMARK_CAPTURE(ours, CatalogLookup/memory+pointer, VL_CAT_INMEMORY, true);
BENCHMARK_CAPTURE(catgetsLookup, CatalogLookup/catgets, false);
BENCHMARK_CAPTURE(catgetsLookup, CatalogLookup/catgets+copy, true);

}  // namespace
