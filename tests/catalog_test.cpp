// Catalogs: sources compiled by tlx gencat and read back in both modes in four code pages,
// the same sources through the C library's gencat and catgets, the bounded search over
// dense and sparse numbers, damaged files, allocation failure at every step, paths.
#include <gtest/gtest.h>
#include <iconv.h>
#include <nl_types.h>

#include <cstdlib>
#include <algorithm>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <map>
#include <random>
#include <string>
#include <vector>

#include "support/defdir.h"
#include "support/hooks.h"

namespace {

using Bytes = std::string;
using Messages = std::map<std::pair<uint32_t, uint32_t>, Bytes>;

bool haveDefs() { return std::filesystem::exists(std::string(VL_TEST_DEFS_DIR) + "/control.nls"); }

Bytes iconvTo(const char *to, const Bytes &utf8, const char *from = "UTF-8") {
  iconv_t cd = iconv_open(to, from);
  if (cd == reinterpret_cast<iconv_t>(-1)) return "";
  Bytes out(utf8.size() * 4 + 16, '\0');
  char *ip = const_cast<char *>(utf8.data()), *op = out.data();
  size_t il = utf8.size(), ol = out.size();
  iconv(cd, &ip, &il, &op, &ol);
  iconv(cd, nullptr, nullptr, &op, &ol);
  iconv_close(cd);
  out.resize(out.size() - ol);
  return out;
}

void writeFile(const std::string &path, const Bytes &b) { std::ofstream(path, std::ios::binary) << b; }

int gencat(const std::string &args) {
  std::string cmd = std::string(VL_TEST_TLX) + " gencat --dir " + VL_TEST_DEFS_DIR + " " + args + " 2>/dev/null";
  int st = std::system(cmd.c_str());
  return WIFEXITED(st) ? WEXITSTATUS(st) : -1;
}

// Every directive; texts in UTF-8, converted into each catalog's code page.
Bytes source(const Bytes &word) {
  return "$ a comment line\n"
         "1 plain " + word + "\n"
         "2 joined \\\n" "across lines\n"
         "3 tab\\there\\nnewline\n"
         "4\n"
         "$set 7 second set\n"
         "$quote \"\n"
         "1 \"quoted \\\" " + word + "\" ignored\n"
         "5 unquoted " + word + "\n"
         "$quote\n"
         "9 \"kept quotes\"\n"
         "$set 3\n"
         "2 doomed\n"
         "$delset 3\n"
         "$set 12\n"
         "2 " + word + word + "\n";
}
Messages expected(const Bytes &word) {
  return {{{1, 1}, "plain " + word},
          {{1, 2}, "joined across lines"},
          {{1, 3}, "tab\there\nnewline"},
          {{1, 4}, ""},
          {{7, 1}, "quoted \" " + word},
          {{7, 5}, "unquoted " + word},
          {{7, 9}, "\"kept quotes\""},
          {{12, 2}, word + word}};
}

class Catalog : public ::testing::Test {
 protected:
  void SetUp() override {
    if (!haveDefs()) GTEST_SKIP() << "no generated definitions";
    ts::resetHooks();
    ASSERT_EQ(VLInit(VL_TEST_DEFS_DIR, ts::countingAlloc, ts::countingFree, 0, VL_OPT_NOBUILTIN), 0u);
  }
  void TearDown() override {
    if (!haveDefs()) return;
    VLTerm();
    EXPECT_EQ(ts::hooks.live, 0);
  }
  VLLocale *locale(const char *name) {
    uint32_t rc;
    VLLocale *l = VLGetLocale(name, 0, &rc);
    EXPECT_NE(l, nullptr) << name;
    return l;
  }
  ts::TempDir dir;
};

struct PageCase {
  const char *name;
  const char *iconvName;
  const char *localeName;
  Bytes word;  // UTF-8
};
const PageCase kPages[] = {
    {"MS1252", "CP1252", "English_UnitedStates.MS1252", "caf\xC3\xA9"},
    {"MS932", "CP932", "Japanese_Japan.MS932", "\xE6\x97\xA5\xE6\x9C\xAC"},
    {"UTF-8", "UTF-8", "English_UnitedStates.UTF-8", "\xE6\x97\xA5\xC3\xA9"},
    {"IBM930", "IBM930", "Japanese_Japan.IBM930", "\xE6\x97\xA5\xE6\x9C\xAC"},
};

TEST_F(Catalog, EveryDirectiveReadBackInBothModesIntoOtherCodePages) {
  VLLocale *utf8 = locale("English_UnitedStates.UTF-8");
  for (const PageCase &p : kPages) {
    const std::string src = dir.file(std::string(p.name) + ".msg"), cat = dir.file(std::string(p.name) + ".cat");
    writeFile(src, iconvTo(p.iconvName, source(p.word)));
    ASSERT_EQ(gencat("--locale " + std::string(p.localeName) + " " + cat + " " + src), 0) << p.name;
    for (uint32_t mode : {0u, VL_CAT_INMEMORY}) {
      VLCatalog *c = VLOpenCatalog(utf8, dir.path.c_str(), cat.c_str(), mode);
      ASSERT_NE(c, nullptr) << p.name << " rc " << VLGetError(utf8);
      for (const auto &[key, text] : expected(p.word)) {
        char buf[128];
        EXPECT_EQ(VLGetMessage(c, key.first, key.second, buf, sizeof buf, nullptr, 0), 0u);
        EXPECT_EQ(Bytes(buf), text) << p.name << " mode " << mode << " message " << key.first << "." << key.second;
        VLUChar u[64];
        EXPECT_EQ(VLGetMessageU(c, key.first, key.second, u, 64, nullptr, 0), 0u);
        size_t n = 0;
        while (u[n]) ++n;
        EXPECT_EQ(iconvTo("UTF-8", Bytes(reinterpret_cast<char *>(u), 2 * n), "UTF-16LE"), text) << p.name;
      }
      // The Japanese catalogs read by a caller in the other Japanese code page.
      const char *other = std::string(p.name) == "MS932" ? "Japanese_Japan.IBM930"
                          : std::string(p.name) == "IBM930" ? "Japanese_Japan.MS932" : nullptr;
      if (other) {
        VLLocale *o = locale(other);
        VLCatalog *oc = VLOpenCatalog(o, dir.path.c_str(), cat.c_str(), mode);
        ASSERT_NE(oc, nullptr);
        for (const auto &[key, text] : expected(p.word)) {
          VLUChar u[64];
          EXPECT_EQ(VLGetMessageU(oc, key.first, key.second, u, 64, nullptr, 0), 0u);
          size_t n = 0;
          while (u[n]) ++n;
          EXPECT_EQ(iconvTo("UTF-8", Bytes(reinterpret_cast<char *>(u), 2 * n), "UTF-16LE"), text) << p.name << " via " << other;
        }
        char b5[5];
        EXPECT_EQ(VLGetMessage(oc, 1, 5, b5, 5, "\x0E\x45\x41\x45\x42\x0F", 0), 0u);
        if (o->flags & VL_LF_SHIFT) {
          EXPECT_EQ(Bytes(b5), "\x0E\x45\x41\x0F") << "a cut default closes its double-byte run";
        }
        VLCloseCatalog(oc);
        VLReleaseLocale(o);
      }
      char buf[16];
      EXPECT_EQ(VLGetMessage(c, 3, 2, buf, sizeof buf, nullptr, 0), 72u) << "deleted set";
      EXPECT_EQ(VLGetMessage(c, 1, 5, buf, sizeof buf, "fallback", 0), 0u);
      EXPECT_STREQ(buf, "fallback");
      EXPECT_EQ(VLGetMessage(c, 1, 5, buf, 4, "fallback", 0), 0u);
      EXPECT_STREQ(buf, "fal") << "a default cut to the buffer";
      EXPECT_EQ(VLGetMessage(c, 1, 1, buf, 0, nullptr, 0), 0u);
      EXPECT_EQ(buf[0], 0) << "no room still leaves an empty string";
      EXPECT_EQ(VLCloseCatalog(c), 0u);
    }
  }
  VLReleaseLocale(utf8);
}

TEST_F(Catalog, AgreesWithTheCLibrarysGencatAndCatgets) {
  const Bytes src = source("plain") + "$set 2\n10 ten\n1 one\nSYM symbolic\n5 \\0101\\400x\\q \\\\ \\101\\102\n"
                    "$set 12\n$set NAMED\n1 in a symbolic set\n";
  writeFile(dir.file("o.msg"), src);
  const std::string ours = dir.file("ours.cat"), theirs = dir.file("theirs.cat");
  ASSERT_EQ(gencat("--locale English_UnitedStates.UTF-8 " + ours + " " + dir.file("o.msg")), 0);
  ASSERT_EQ(std::system(("gencat " + theirs + " " + dir.file("o.msg") + " 2>/dev/null").c_str()), 0);
  VLLocale *utf8 = locale("English_UnitedStates.UTF-8");
  VLCatalog *c = VLOpenCatalog(utf8, nullptr, ours.c_str(), VL_CAT_INMEMORY);
  nl_catd d = catopen(theirs.c_str(), 0);
  ASSERT_NE(c, nullptr);
  ASSERT_NE(d, reinterpret_cast<nl_catd>(-1));
  for (int s = 1; s <= 13; ++s)
    for (int m = 1; m <= 12; ++m) {
      if (s == 3) continue;  // intended: $delset deletes set 3 here; the C library's gencat keeps it
      char buf[128];
      VLGetMessage(c, s, m, buf, sizeof buf, "<none>", 0);
      EXPECT_STREQ(buf, catgets(d, s, m, "<none>")) << s << "." << m;
    }
  catclose(d);
  VLCloseCatalog(c);
  VLReleaseLocale(utf8);
}

// A catalog file built by hand, so that every field can be damaged.
struct Built {
  Bytes file;
  std::vector<size_t> setAt;     // offset of each set record
  std::vector<size_t> indexAt;   // offset of each index
};
void put32(Bytes &b, size_t at, uint32_t v) { std::memcpy(&b[at], &v, 4); }
Built build(const std::map<uint32_t, std::vector<uint32_t>> &sets) {
  Built b;
  b.file.assign(152, '\0');
  put32(b.file, 0, VL_CAT_MAGIC);
  put32(b.file, 4, VL_CAT_VERSION);
  put32(b.file, 8, static_cast<uint32_t>(VLMcGetByteOrder()));
  put32(b.file, 12, static_cast<uint32_t>(sets.size()));
  put32(b.file, 16, 152);
  std::memcpy(&b.file[20], "English_UnitedStates.UTF-8", 26);
  size_t k = 0;
  for (const auto &[set, msgs] : sets) {
    size_t rec = b.file.size(), index = rec + 28, text = index + 12 * msgs.size();
    b.setAt.push_back(rec);
    b.indexAt.push_back(index);
    b.file.resize(text);
    Bytes block;
    for (size_t i = 0; i < msgs.size(); ++i) {
      Bytes t = std::to_string(set) + "." + std::to_string(msgs[i]);
      put32(b.file, index + 12 * i, msgs[i]);
      put32(b.file, index + 12 * i + 4, static_cast<uint32_t>(t.size()));
      put32(b.file, index + 12 * i + 8, static_cast<uint32_t>(block.size()));
      block += t + '\0';
    }
    b.file += block;
    uint32_t fields[] = {set, ++k < sets.size() ? static_cast<uint32_t>(b.file.size()) : 0u,
                         static_cast<uint32_t>(msgs.size()), static_cast<uint32_t>(index),
                         static_cast<uint32_t>(text), static_cast<uint32_t>(block.size()), 0};
    for (int f = 0; f < 7; ++f) put32(b.file, rec + 4 * f, fields[f]);
  }
  return b;
}

TEST_F(Catalog, BoundedSearchFindsEveryNumberAndNothingBetween) {
  std::vector<uint32_t> dense, sparse = {2, 3, 50, 51, 52, 1000, 70000, 70001, 4000000000u};
  for (uint32_t i = 1; i <= 300; ++i) dense.push_back(i);
  for (uint32_t i = 1; i <= 120; ++i) sparse.push_back(70001 + 7 * i);
  std::sort(sparse.begin(), sparse.end());
  std::map<uint32_t, std::vector<uint32_t>> sets = {{1, dense}, {4, sparse}, {9, {1}}, {70, {5, 6}}};
  writeFile(dir.file("s.cat"), build(sets).file);
  VLLocale *utf8 = locale("English_UnitedStates.UTF-8");
  for (uint32_t mode : {0u, VL_CAT_INMEMORY}) {
    VLCatalog *c = VLOpenCatalog(utf8, nullptr, dir.file("s.cat").c_str(), mode);
    ASSERT_NE(c, nullptr);
    for (uint32_t s = 0; s <= 71; ++s) {
      VLMcSet rec;
      VLMcSet *found = MCGetSet(c, s, &rec);
      ASSERT_EQ(found != nullptr, sets.count(s) == 1) << "set " << s;
      if (!found) continue;
      const auto &msgs = sets[s];
      std::vector<uint32_t> probes = {0, 1, msgs.back() + 1, 0xFFFFFFFFu};
      for (uint32_t m : msgs)
        for (uint32_t d : {0u, 1u}) probes.push_back(m + d), probes.push_back(m - d);
      for (uint32_t m : probes) {
        const bool in = std::binary_search(msgs.begin(), msgs.end(), m);
        char *t = MCGetMsg(c, found, m);
        ASSERT_EQ(t != nullptr, in) << "set " << s << " message " << m << " mode " << mode;
        if (t) {
          EXPECT_EQ(Bytes(t), std::to_string(s) + "." + std::to_string(m));
        }
        if (t && !mode) VLMcFree(t);
      }
    }
    VLCloseCatalog(c);
  }
  VLReleaseLocale(utf8);
}

struct Damage {
  const char *name;
  void (*apply)(Built &);
  bool fileModeSees;  // file mode checks what it reads, not the order of an index
};
const Damage kDamage[] = {
    {"a file cut inside the header", [](Built &b) { b.file.resize(100); }, true},
    {"a file cut inside a text block", [](Built &b) { b.file.resize(b.file.size() - 3); }, true},
    {"a wrong magic number", [](Built &b) { put32(b.file, 0, 0x476cf464); }, true},
    {"a wrong version", [](Built &b) { put32(b.file, 4, 0x20000000); }, true},
    {"the other byte order", [](Built &b) { put32(b.file, 8, VLMcGetByteOrder() == 1 ? 2u : 1u); }, true},
    {"no sets", [](Built &b) { put32(b.file, 12, 0); }, true},
    {"an unknown header locale", [](Built &b) { std::memcpy(&b.file[20], "Klingon", 8); }, true},
    {"a set chain that loops", [](Built &b) { put32(b.file, b.setAt[1] + 4, static_cast<uint32_t>(b.setAt[0])); }, true},
    {"a set record outside the file", [](Built &b) { put32(b.file, b.setAt[0] + 4, 1u << 30); }, true},
    {"an index outside the file", [](Built &b) { put32(b.file, b.setAt[1] + 12, 1u << 30); }, true},
    {"messages out of order", [](Built &b) { put32(b.file, b.indexAt[1], 9); }, false},
    {"a text offset past its block", [](Built &b) { put32(b.file, b.indexAt[1] + 12 + 8, 4000); }, true},
    {"sets out of order", [](Built &b) { put32(b.file, b.setAt[1], 1); }, false},
};

TEST_F(Catalog, DamagedFilesAreRefusedWith71) {
  VLLocale *utf8 = locale("English_UnitedStates.UTF-8");
  for (const Damage &d : kDamage) {
    Built b = build({{1, {1, 2}}, {2, {1, 2, 3}}});
    d.apply(b);
    writeFile(dir.file("d.cat"), b.file);
    EXPECT_EQ(VLOpenCatalog(utf8, nullptr, dir.file("d.cat").c_str(), VL_CAT_INMEMORY), nullptr) << d.name;
    EXPECT_EQ(VLGetError(utf8), 71) << d.name;
    if (!d.fileModeSees) continue;
    VLCatalog *c = VLOpenCatalog(utf8, nullptr, dir.file("d.cat").c_str(), 0);
    ASSERT_NE(c, nullptr) << d.name;
    char buf[32];
    bool refused = false;
    for (uint32_t s = 1; s <= 3; ++s)  // set 3 is missing: the whole chain is walked
      for (uint32_t m = 1; m <= 3; ++m) refused |= VLGetMessage(c, s, m, buf, sizeof buf, nullptr, 0) == 71;
    EXPECT_TRUE(refused) << d.name;
    VLCloseCatalog(c);
  }
  VLReleaseLocale(utf8);
}

TEST_F(Catalog, RandomlyDamagedFilesNeverCrash) {
  const Built good = build({{1, {1, 2, 5}}, {2, {1, 2, 3}}, {8, {4}}});
  VLLocale *utf8 = locale("English_UnitedStates.UTF-8");
  std::mt19937 rng(71);
  for (int round = 0; round < 250; ++round) {
    Bytes f = good.file;
    for (int k = 1 + static_cast<int>(rng() % 4); k > 0; --k) {
      size_t at = 152 + rng() % (f.size() - 152);
      f[at] = static_cast<char>(rng() % 3 == 0 ? 0xFF : rng());
    }
    if (rng() % 5 == 0) f.resize(rng() % f.size());
    writeFile(dir.file("r.cat"), f);
    for (uint32_t mode : {0u, VL_CAT_INMEMORY}) {
      VLCatalog *c = VLOpenCatalog(utf8, nullptr, dir.file("r.cat").c_str(), mode);
      if (!c) continue;
      char buf[64];
      for (uint32_t s = 1; s <= 9; ++s)
        for (uint32_t m = 1; m <= 6; ++m) {
          uint32_t rc = VLGetMessage(c, s, m, buf, sizeof buf, nullptr, 0);
          EXPECT_TRUE(rc == 0 || rc == 71 || rc == 72) << rc;
        }
      VLCloseCatalog(c);
    }
  }
  VLReleaseLocale(utf8);
}

TEST_F(Catalog, AllocationFailureAtEveryStepGives20AndLeaksNothing) {
  writeFile(dir.file("a.cat"), build({{1, {1, 2}}, {2, {1, 2, 3}}}).file);
  VLLocale *utf8 = locale("English_UnitedStates.UTF-8");
  for (uint32_t mode : {0u, VL_CAT_INMEMORY})
    for (long k = 1; k < 60; ++k) {
      const long live = ts::hooks.live;
      ts::hooks.failAt = ts::hooks.allocs + k;
      ts::hooks.failed = false;
      VLCatalog *c = VLOpenCatalog(utf8, "%N", dir.file("a.cat").c_str(), mode);
      char buf[32] = "x";
      uint32_t rc = c ? VLGetMessage(c, 2, 3, buf, sizeof buf, nullptr, 0) : static_cast<uint32_t>(VLGetError(utf8));
      if (c) VLCloseCatalog(c);
      ts::hooks.failAt = -1;
      EXPECT_EQ(ts::hooks.live, live) << "failing allocation " << k << " mode " << mode;
      if (!ts::hooks.failed) {
        EXPECT_EQ(rc, 0u);
        EXPECT_STREQ(buf, "2.3");
        break;
      }
      EXPECT_TRUE(rc == 20 || (rc == 0 && Bytes(buf) == "2.3")) << "failing allocation " << k << ": rc " << rc;
    }
  VLReleaseLocale(utf8);
}

TEST_F(Catalog, PathTemplatesAndTheEnvironment) {
  writeFile(dir.file("en_US.cat"), build({{1, {1}}}).file);
  VLLocale *l = locale("English_UnitedStates.UTF-8");
  char lang[8] = {0}, terr[8] = {0};
  VLGetLocaleTextInfo(l, 3, lang, 7, 0);
  VLGetLocaleTextInfo(l, 7, terr, 7, 0);
  ASSERT_STREQ((std::string(lang) + "_" + terr).c_str(), "en_US");
  struct {
    const char *tmpl, *env, *name;
    bool found;
  } cases[] = {
      {"/nowhere/%N;%%DIR%%/%L.cat", nullptr, "x", true},
      {"%%DIR%%/%l_%t.cat", nullptr, "x", true},
      {"%%DIR%%/%N", nullptr, "en_US.cat", true},
      {nullptr, "/nowhere;%%DIR%%/%L.cat", "x", true},
      {"%%DIR%%/%q%L.cat", nullptr, "x", false},
      {"", nullptr, "missing.cat", false},
  };
  for (auto &c : cases) {
    auto fill = [&](const char *s) {
      std::string out = s ? s : "";
      for (size_t at; (at = out.find("%%DIR%%")) != std::string::npos;) out.replace(at, 7, dir.path);
      return out;
    };
    std::string tmpl = fill(c.tmpl), env = fill(c.env);
    if (c.env) setenv("VL_NLSPATH", env.c_str(), 1);
    VLCatalog *cat = VLOpenCatalog(l, c.tmpl ? tmpl.c_str() : nullptr, c.name, VL_CAT_ONEPASS);
    unsetenv("VL_NLSPATH");
    EXPECT_EQ(cat != nullptr, c.found) << (c.tmpl ? c.tmpl : c.env);
    if (!cat) {
      EXPECT_EQ(VLGetError(l), 71);
    }
    VLCloseCatalog(cat);
  }
  // A second pass substitutes the default locale's codes, unless one pass is asked for.
  uint32_t rc;
  VLLocale *def = VLGetLocale("", VL_LOCALE_FALLBACK, &rc);
  ASSERT_NE(def, nullptr);
  VLGetLocaleTextInfo(def, 3, lang, 7, 0);
  VLGetLocaleTextInfo(def, 7, terr, 7, 0);
  VLReleaseLocale(def);
  VLLocale *ja = locale("Japanese_Japan.MS932");
  const std::string defName = std::string(lang) + "_" + terr;
  if (defName != "ja_JP") {
    writeFile(dir.file(defName + ".msgs"), build({{1, {1}}}).file);
    const std::string tmpl = dir.path + "/%L.msgs";
    EXPECT_EQ(VLOpenCatalog(ja, tmpl.c_str(), "x", VL_CAT_ONEPASS), nullptr);
    VLCatalog *two = VLOpenCatalog(ja, tmpl.c_str(), "x", 0);
    EXPECT_NE(two, nullptr) << "second pass with " << defName;
    VLCloseCatalog(two);
  }
  VLReleaseLocale(ja);
  EXPECT_EQ(VLOpenCatalog(l, nullptr, "", 0), nullptr);
  EXPECT_EQ(VLGetError(l), 2);
  EXPECT_EQ(VLOpenCatalog(l, nullptr, "x", 0x80000062u), nullptr);
  EXPECT_EQ(VLGetError(l), 2);
  EXPECT_EQ(VLCloseCatalog(nullptr), 70u);
  VLReleaseLocale(l);
}

std::string run(const std::string &cmd, int *status) {
  std::string out;
  FILE *p = popen((cmd + " 2>&1").c_str(), "r");
  char buf[512];
  for (size_t n; (n = fread(buf, 1, sizeof buf, p)) > 0;) out.append(buf, n);
  int st = pclose(p);
  *status = WIFEXITED(st) ? WEXITSTATUS(st) : -1;
  return out;
}

TEST(GencatTool, MergesNamesErrorsAndListsWhatCompilesBack) {
  if (!haveDefs()) GTEST_SKIP();
  ts::TempDir dir;
  const std::string tlx = std::string(VL_TEST_TLX), defs = std::string(" --dir ") + VL_TEST_DEFS_DIR;
  const std::string gen = tlx + " gencat" + defs + " --locale English_UnitedStates.UTF-8 ";
  writeFile(dir.file("a.msg"), "1 one\n$set 2\n1 two-one\n$unknown x\n");
  writeFile(dir.file("b.msg"), "$set 2\n1 again\n7 seven\n");
  writeFile(dir.file("c.msg"), "$set 2\n1 replaced\n$set 9\n3 \"\\\\ back\\nslash\\001\n");
  const std::string cat = dir.file("o.cat");
  int st;
  std::string err = run(gen + cat + " " + dir.file("a.msg") + " " + dir.file("b.msg"), &st);
  EXPECT_EQ(st, 1) << "a message defined twice is a data error";
  EXPECT_NE(err.find("b.msg:2: duplicated message number"), std::string::npos) << err;
  EXPECT_NE(err.find("a.msg:3: this is the first definition"), std::string::npos) << err;
  EXPECT_NE(err.find("a.msg:4: unknown directive"), std::string::npos) << err;
  // The existing catalog is merged; a later source replaces its messages quietly.
  err = run(gen + cat + " " + dir.file("c.msg"), &st);
  EXPECT_EQ(st, 0) << err;
  const std::string listing = run(tlx + " catalog" + defs + " " + cat, &st);
  EXPECT_EQ(st, 0);
  EXPECT_EQ(listing, "$set 1\n1 one\n$set 2\n1 replaced\n7 seven\n$set 9\n3 \"\\\\ back\\nslash\\001\n");
  writeFile(dir.file("listed.msg"), listing);
  run(gen + dir.file("again.cat") + " " + dir.file("listed.msg"), &st);
  EXPECT_EQ(st, 0);
  EXPECT_EQ(run(tlx + " catalog" + defs + " " + dir.file("again.cat"), &st), listing) << "the listing compiles back";
  writeFile(dir.file("not.cat"), "junk");
  err = run(gen + dir.file("not.cat") + " " + dir.file("a.msg"), &st);
  EXPECT_EQ(st, 1);
  EXPECT_NE(err.find("not overwritten"), std::string::npos) << err;
  const auto kept = ts::readFile(dir.file("not.cat"));
  EXPECT_EQ(std::string(kept.begin(), kept.end()), "junk");
}

}  // namespace
