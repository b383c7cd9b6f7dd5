// The service layer: translation against iconv and by its padding, truncation and shift
// rules; queries by id; the process and thread locales; many threads at once.
//
// The service layer starts the library once per process and keeps it until the process
// ends, so every case runs in a child process of its own (this binary again, with its
// environment set up), whose tests exist only there.
#include <gtest/gtest.h>
#include <iconv.h>
#include <spawn.h>
#include <sys/wait.h>

#include <atomic>
#include <clocale>
#include <cstring>
#include <filesystem>
#include <map>
#include <string>
#include <thread>
#include <vector>

#include "nls1.h"
#include "support/defdir.h"

extern char **environ;

namespace {

namespace fs = std::filesystem;
const char *kChildVar = "VL_SERVICE_CHILD";

bool haveDefs() { return fs::exists(fs::path(VL_TEST_DEFS_DIR) / "control.nls"); }

// Runs the child suite `name` with the given variables (an empty value unsets one).
int runChild(const std::string &name, const std::map<std::string, std::string> &vars) {
  std::map<std::string, std::string> env;
  for (char **e = environ; *e; ++e) {
    std::string kv = *e;
    size_t eq = kv.find('=');
    if (eq != std::string::npos) env[kv.substr(0, eq)] = kv.substr(eq + 1);
  }
  for (const char *v : {"NLS1_LOCALEDIR", "VL_LOCALEDIR", "VL_LANG", "LC_ALL", "LANG"}) env.erase(v);
  env[kChildVar] = name;
  for (const auto &[k, v] : vars)
    if (v.empty())
      env.erase(k);
    else
      env[k] = v;
  std::vector<std::string> flat;
  for (const auto &[k, v] : env) flat.push_back(k + "=" + v);
  std::vector<char *> envp;
  for (auto &s : flat) envp.push_back(s.data());
  envp.push_back(nullptr);
  std::string filter = "--gtest_filter=ServiceChild." + name + "*";
  std::string exe = fs::read_symlink("/proc/self/exe");
  char brief[] = "--gtest_brief=1";
  std::vector<char *> argv = {exe.data(), filter.data(), brief, nullptr};
  pid_t pid;
  if (posix_spawn(&pid, exe.c_str(), nullptr, nullptr, argv.data(), envp.data()) != 0) return -1;
  int status = 0;
  if (waitpid(pid, &status, 0) != pid) return -1;
  return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}

// ---- iconv as the oracle ------------------------------------------------------------------

bool iconvTo(const std::string &in, const char *from, const char *to, std::string *out) {
  iconv_t cd = iconv_open(to, from);
  if (cd == reinterpret_cast<iconv_t>(-1)) return false;
  std::string buf(in.size() * 4 + 16, '\0');
  char *ip = const_cast<char *>(in.data()), *op = buf.data();
  size_t il = in.size(), ol = buf.size();
  bool ok = iconv(cd, &ip, &il, &op, &ol) != static_cast<size_t>(-1) && iconv(cd, nullptr, nullptr, &op, &ol) == 0;
  iconv_close(cd);
  if (ok) out->assign(buf.data(), static_cast<size_t>(op - buf.data()));
  return ok;
}

struct Page {
  uint32_t id;
  const char *iconvName;
};
static_assert(__BYTE_ORDER__ == __ORDER_LITTLE_ENDIAN__, "1200 is UTF-16 in machine order");
const Page kPages[] = {{819, "ISO-8859-1"}, {1252, "CP1252"}, {37, "IBM037"},    {932, "CP932"},
                       {954, "EUC-JP"},     {930, "IBM930"}, {57352, "UTF-8"}, {1200, "UTF-16LE"}};

struct Result {
  std::string out;
  int32_t ret, count;
  uint32_t rc;
};

Result translate(uint32_t to, uint32_t from, const std::string &src, int32_t length, int32_t size,
                 uint32_t options) {
  std::string buf(static_cast<size_t>(size) * 4 + 8, '\x7f');
  Result r{};
  r.rc = 99;
  r.ret = NLS1_TranslateString(to, buf.data(), size, from, src.data(), length, &r.count, options, &r.rc);
  // Bytes written: up to the last one that changed (the buffer was filled with 0x7F).
  size_t n = buf.size();
  while (n > 0 && buf[n - 1] == '\x7f') --n;
  r.out = buf.substr(0, n);
  return r;
}

std::string u16(std::u16string s) { return std::string(reinterpret_cast<const char *>(s.data()), s.size() * 2); }
std::string sjis(const char *utf8) {
  std::string s;
  iconvTo(utf8, "UTF-8", "CP932", &s);
  return s;
}

// ---- Child suites -------------------------------------------------------------------------

void TranslateAgreesWithIconv() {
  std::vector<std::string> texts = {"Hello, World 123", "Gr\xC3\xBC\xC3\x9F" "e aus K\xC3\xB6ln",
                                    "\xE6\x97\xA5\xE6\x9C\xAC\xE8\xAA\x9E ABC \xEF\xBD\xB1\xEF\xBD\xB2",
                                    "\xEF\xBC\xA1\xEF\xBC\xA2 mixed a\xE3\x81\x82" "b"};
  // Long enough for the bulk loop, then cut at half the output: the cut must be what
  // iconv gives for the source bytes the call reports as read.
  for (size_t k = 0; k < 4; ++k) {
    std::string t;
    for (int i = 0; i < 12; ++i) t += texts[k];
    texts.push_back(t);
  }
  int compared = 0;
  for (const std::string &t : texts)
    for (const Page &s : kPages)
      for (const Page &d : kPages) {
        // iconv may substitute on the way into the source page; the oracle is iconv's own
        // conversion of the source bytes.
        std::string src, want;
        if (!iconvTo(t, "UTF-8", s.iconvName, &src) || !iconvTo(src, s.iconvName, d.iconvName, &want)) continue;
        Result r = translate(d.id, s.id, src, static_cast<int32_t>(src.size()), static_cast<int32_t>(want.size()), 0);
        EXPECT_EQ(r.rc, 0u) << s.id << "->" << d.id << " " << t;
        EXPECT_EQ(r.out, want) << s.id << "->" << d.id << " " << t;
        EXPECT_EQ(r.ret, static_cast<int32_t>(want.size())) << s.id << "->" << d.id;
        EXPECT_EQ(r.count, static_cast<int32_t>(src.size())) << s.id << "->" << d.id;
        ++compared;
        if (t.size() < 100) continue;
        for (int32_t half : {static_cast<int32_t>(want.size() / 2), static_cast<int32_t>(want.size() / 2 + 1)}) {
          Result cut = translate(d.id, s.id, src, static_cast<int32_t>(src.size()), half, 0);
          std::string head;
          ASSERT_TRUE(iconvTo(src.substr(0, static_cast<size_t>(cut.count)), s.iconvName, d.iconvName, &head));
          EXPECT_EQ(cut.rc, VL_RC_BUFFER) << s.id << "->" << d.id << " cut at " << half;
          EXPECT_EQ(cut.out, head) << s.id << "->" << d.id << " cut at " << half;
          EXPECT_GE(cut.ret + 5, half) << s.id << "->" << d.id << " cut at " << half;
        }
      }
  EXPECT_GT(compared, 100);
}

void TranslateRules() {
  const std::string nihon = sjis("\xE6\x97\xA5\xE6\x9C\xAC");  // two double-byte characters
  std::string ebcdicNihon;  // SO, the two characters, SI
  iconvTo("\xE6\x97\xA5\xE6\x9C\xAC", "UTF-8", "IBM930", &ebcdicNihon);
  ASSERT_EQ(ebcdicNihon.size(), 6u);
  const std::string dbcs = ebcdicNihon.substr(1, 4);
  struct Case {
    const char *what;
    uint32_t from, to;
    std::string src;
    int32_t length, size;
    uint32_t options;
    std::string out;
    int32_t ret, count;
    uint32_t rc;
  } cases[] = {
      {"lenient cut of spaces", 819, 819, "ABC   ", 6, 3, NLS1_OPT_LENIENT, "ABC", 3, 3, 0},
      {"cut of spaces", 819, 819, "ABC   ", 6, 3, 0, "ABC", 3, 3, VL_RC_BUFFER},
      {"lenient cut of text", 819, 819, "ABC  D", 6, 3, NLS1_OPT_LENIENT, "ABC", 3, 3, VL_RC_BUFFER},
      {"empty, terminated", 819, 819, "", 0, 1, NLS1_OPT_NULLTERM, std::string(1, '\0'), 1, 0, 0},
      {"empty, no room", 819, 819, "", 0, 0, NLS1_OPT_NULLTERM, "", 0, 0, 0},
      {"no output", 819, 819, "AB", 2, 0, 0, "", 0, 0, 0},
      {"padded", 819, 819, "AB", 2, 5, NLS1_OPT_PAD, "AB   ", 5, 2, 0},
      {"padded, terminated", 819, 819, "AB", 2, 5, NLS1_OPT_PAD | NLS1_OPT_NULLTERM, std::string("AB  \0", 5), 5, 2, 0},
      {"padded EBCDIC", 819, 37, "AB", 2, 4, NLS1_OPT_PAD, "\xC1\xC2\x40\x40", 4, 2, 0},
      {"padded UTF-16", 819, 1200, "A", 1, 7, NLS1_OPT_PAD, u16(u"A  "), 6, 1, 0},
      {"measured", 819, 819, "AB", -1, 5, 0, std::string("AB\0", 3), 3, 2, 0},
      {"measured, no room for 0", 819, 819, "AB", -1, 2, 0, "AB", 2, 2, 0},
      {"measured, cut", 819, 819, "ABC", -1, 2, 0, "AB", 2, 2, VL_RC_BUFFER},
      {"terminated, cut", 819, 819, "ABC", 3, 3, NLS1_OPT_NULLTERM, std::string("AB\0", 3), 3, 2, VL_RC_BUFFER},
      {"UTF-16 copy", 1200, 1200, u16(u"AB\u00e9"), 6, 6, 0, u16(u"AB\u00e9"), 6, 6, 0},
      {"UTF-16 measured", 1200, 1200, u16(u"AB") + std::string(2, '\0'), -1, 8, 0, u16(u"AB") + std::string(2, '\0'), 6, 4, 0},
      {"UTF-16 terminated", 819, 1200, "AB", 2, 6, NLS1_OPT_NULLTERM, u16(u"AB") + std::string(2, '\0'), 6, 2, 0},
      {"UTF-16 target too small", 819, 1200, "AB", 2, 1, 0, "", -1, 0, VL_RC_BUFFER},
      {"odd UTF-16 source", 1200, 819, u16(u"AB") + "C", 5, 8, 0, "AB", 2, 4, 0},
      {"split double-byte source", 932, 1200, nihon + "\x93", 5, 8, 0, u16(u"\u65e5\u672c"), 4, 4, 0},
      {"characters", 932, 1200, nihon + "A", 3, 10, NLS1_OPT_CHARLEN, u16(u"\u65e5\u672cA"), 3, 3, 0},
      {"characters, cut", 932, 932, nihon + "A", 3, 2, NLS1_OPT_CHARLEN, nihon, 2, 2, VL_RC_BUFFER},
      {"characters, terminated", 932, 932, nihon, 2, 3, NLS1_OPT_CHARLEN | NLS1_OPT_NULLTERM, nihon + '\0', 3, 3, 0},
      {"shift target", 1200, 930, u16(u"A\u65e5\u672cB"), 8, 16, 0, "\xC1" + ebcdicNihon + "\xC2", 8, 8, 0},
      {"shift target ends single", 1200, 930, u16(u"\u65e5\u672c"), 4, 16, 0, ebcdicNihon, 6, 4, 0},
      {"shift target keeps room for SI", 1200, 930, u16(u"A\u65e5"), 4, 4, 0, "\xC1", 1, 2, VL_RC_BUFFER},
      {"shift target exactly full", 1200, 930, u16(u"A\u65e5"), 4, 5, 0, "\xC1" + ebcdicNihon.substr(0, 3) + "\x0F", 5, 4, 0},
      {"shift source", 930, 1200, "\xC1" + ebcdicNihon, 7, 16, 0, u16(u"A\u65e5\u672c"), 6, 7, 0},
      {"shift to shift", 930, 930, ebcdicNihon + "\xC1", 7, 16, 0, ebcdicNihon + "\xC1", 7, 7, 0},
      {"bad option", 819, 819, "AB", 2, 4, 0x1, "", -1, 0, VL_RC_BADARG},
      {"unknown code page", 4711, 819, "AB", 2, 4, 0, "", -1, 0, VL_RC_NOTFOUND},
      {"unknown target", 819, 70000, "AB", 2, 4, 0, "", -1, 0, VL_RC_NOTFOUND},
  };
  (void)dbcs;
  for (const Case &c : cases) {
    Result r = translate(c.to, c.from, c.src, c.length, c.size, c.options);
    EXPECT_EQ(r.rc, c.rc) << c.what;
    EXPECT_EQ(r.ret, c.ret) << c.what;
    EXPECT_EQ(r.count, c.count) << c.what;
    EXPECT_EQ(r.out, c.out) << c.what;
  }
}

void MissingFileUsesBuiltin() {
  Result r = translate(1200, 437, "ABC", 3, 8, 0);
  EXPECT_EQ(r.rc, VL_RC_FILE_MISSING);
  EXPECT_EQ(r.ret, 6);
  EXPECT_EQ(r.out, u16(u"ABC"));
  // The code comes with the call that found the file missing; the object then stays loaded.
  r = translate(437, 819, "AB", 2, 8, 0);
  EXPECT_EQ(r.rc, 0u);
  EXPECT_EQ(r.out, "AB");
}

std::string nameOf(const VLLocale *l) {
  return std::string(l->language->name) + "_" + l->territory->name + "." + l->codePage->name;
}

void Queries() {
  uint32_t rc = 99;
  const uint32_t german = NLS1_GetLanguageId("German", &rc);
  ASSERT_EQ(rc, 0u);
  EXPECT_EQ(NLS1_GetTerritoryId("Germany", &rc), 276u);
  EXPECT_EQ(NLS1_GetCodepageId("SJIS", &rc), 932u);  // through an alias
  EXPECT_EQ(rc, 0u);
  EXPECT_EQ(NLS1_GetCodepageId("EBCDIC-X", &rc), 0u);
  EXPECT_EQ(rc, VL_RC_NOTFOUND);
  // Binary order has id 0 and the name "Binary" both ways, without an error.
  EXPECT_EQ(NLS1_GetSortId("Binary", &rc), 0u);
  EXPECT_EQ(rc, 0u);
  EXPECT_EQ(NLS1_GetSortId("NoSuchOrder", &rc), 0u);
  EXPECT_EQ(rc, VL_RC_NOTFOUND);
  char sortName[8];
  EXPECT_EQ(NLS1_GetSortName(0, sortName, sizeof sortName), 0u);
  EXPECT_STREQ(sortName, "Binary");
  EXPECT_EQ(NLS1_GetSortName(0, sortName, 6), VL_RC_BUFFER);

  struct Case {
    uint32_t localeId, codePage, rc;
    const char *name;
  } cases[] = {
      {0, 0, 0, "English_UnitedStates.US-ASCII"},
      {NLS1_LOCALE_ID(german, 276), 0, 0, "German_Germany.Latin1"},
      {NLS1_LOCALE_ID(german, 840), 932, 0, "German_UnitedStates.MS932"},
      {NLS1_LOCALE_ID(0, 276), 0, 0, "English_Germany.US-ASCII"},
      {NLS1_LOCALE_ID(german, 999), 0, VL_RC_NOTERRITORY, nullptr},
      {NLS1_LOCALE_ID(999, 276), 0, VL_RC_NOLANGUAGE, nullptr},
      {NLS1_LOCALE_ID(german, 0), 4711, VL_RC_NOCODEPAGE, nullptr},
  };
  for (const Case &c : cases) {
    VLLocale *l = NLS1_GetLocale(c.localeId, c.codePage, 0, &rc);
    EXPECT_EQ(rc, c.rc) << c.localeId;
    ASSERT_EQ(l != nullptr, c.name != nullptr) << c.localeId;
    if (!l) continue;
    EXPECT_EQ(nameOf(l), c.name);
    // Item 14 as a number is the language's default code page id.
    VLLocale *def = NLS1_GetLocale(c.localeId & 0xFFFF, 0, 0, &rc);
    EXPECT_EQ(NLS1_GetLocaleNumInfo(l, 14, 0), static_cast<int32_t>(def->codePage->id));
    VLReleaseLocale(def);
    VLReleaseLocale(l);
  }

  char name[16];
  EXPECT_EQ(NLS1_GetLanguageName(NLS1_LOCALE_ID(german, 276), name, sizeof name), 0u);
  EXPECT_STREQ(name, "German");
  EXPECT_EQ(NLS1_GetTerritoryName(NLS1_LOCALE_ID(german, 276), name, 8), 0u);
  EXPECT_STREQ(name, "Germany");
  EXPECT_EQ(NLS1_GetTerritoryName(NLS1_LOCALE_ID(german, 276), name, 7), VL_RC_BUFFER);  // no room for the 0
  EXPECT_EQ(NLS1_GetCodepageName(932, name, sizeof name), 0u);
  EXPECT_STREQ(name, "MS932");
  EXPECT_EQ(NLS1_GetCodepageName(4711, name, sizeof name), VL_RC_NOTFOUND);
}

void ThreadAndProcessLocales() {
  uint32_t rc = 0;
  const uint32_t german = NLS1_GetLanguageId("German", &rc);
  VLLocale *mine = NLS1_PrivateFunction_GetThreadLocale();
  ASSERT_NE(mine, nullptr);
  EXPECT_EQ(nameOf(mine), "English_UnitedStates.US-ASCII");  // VL_LANG
  ASSERT_NE(vlglocale, nullptr);

  // The thread's own handle only.
  EXPECT_EQ(NLS1_SetLocale(NLS1_LOCALE_ID(german, 276), 0, NLS1_SET_THREAD), 0u);
  EXPECT_EQ(nameOf(NLS1_PrivateFunction_GetThreadLocale()), "German_Germany.Latin1");
  EXPECT_EQ(nameOf(vlglocale), "English_UnitedStates.US-ASCII");
  char text[64];
  EXPECT_GT(NLS1_GetLocaleTextInfo(nullptr, VL_ITEM_LOCALE, text, sizeof text, 0), 0);
  EXPECT_STREQ(text, "German_Germany.Latin1@Default");
  // Another thread is not disturbed.
  std::thread([] { EXPECT_EQ(nameOf(NLS1_PrivateFunction_GetThreadLocale()), "English_UnitedStates.US-ASCII"); })
      .join();
  // Both, then the process alone.
  EXPECT_EQ(NLS1_SetLocale(NLS1_LOCALE_ID(german, 840), 0, NLS1_SET_THREAD | NLS1_SET_PROCESS), 0u);
  EXPECT_EQ(nameOf(NLS1_PrivateFunction_GetThreadLocale()), "German_UnitedStates.Latin1");
  EXPECT_EQ(nameOf(vlglocale), "German_UnitedStates.Latin1");
  EXPECT_EQ(NLS1_SetLocale(0, 932, 0), 0u);
  EXPECT_EQ(nameOf(vlglocale), "English_UnitedStates.MS932");
  EXPECT_EQ(nameOf(NLS1_PrivateFunction_GetThreadLocale()), "German_UnitedStates.Latin1");
  // A failure keeps what was there.
  EXPECT_EQ(NLS1_SetLocale(NLS1_LOCALE_ID(german, 999), 0, NLS1_SET_THREAD), VL_RC_NOTERRITORY);
  EXPECT_EQ(nameOf(NLS1_PrivateFunction_GetThreadLocale()), "German_UnitedStates.Latin1");

  // Items through the thread's handle; the code page goes in by id.
  EXPECT_EQ(NLS1_SetLocaleNumInfo(nullptr, 9, 1252, 0), 1);
  EXPECT_STREQ(NLS1_PrivateFunction_GetThreadLocale()->codePage->name, "MS1252");
  EXPECT_EQ(NLS1_SetLocaleNumInfo(nullptr, 9, 4711, 0), 0);
  EXPECT_EQ(VLGetError(NLS1_PrivateFunction_GetThreadLocale()), static_cast<int32_t>(VL_RC_NOTFOUND));
  EXPECT_EQ(NLS1_SetLocaleNumInfo(nullptr, 69, 3, 0), 1);
  EXPECT_EQ(NLS1_GetLocaleNumInfo(nullptr, 69, 0), 3);

  // Native names.
  EXPECT_EQ(NLS1_SetLocaleFromNative("de_DE.utf8", NLS1_SET_THREAD | VL_LOCALE_FALLBACK), 0u);
  EXPECT_EQ(nameOf(NLS1_PrivateFunction_GetThreadLocale()), "German_Germany.UTF-8");
  EXPECT_EQ(nameOf(vlglocale), "English_UnitedStates.MS932");
  EXPECT_EQ(NLS1_SetNativeLocale("C", 0), 0u);
  EXPECT_EQ(nameOf(NLS1_PrivateFunction_GetThreadLocale()), "English_UnitedStates.US-ASCII");
  EXPECT_EQ(nameOf(vlglocale), "English_UnitedStates.US-ASCII");
  EXPECT_EQ(NLS1_SetLocaleFromNative("xx_XX", NLS1_SET_THREAD), VL_RC_NOLANGUAGE);
  VLLocale *c = NLS1_ConvertNativeLocale("POSIX", 0, &rc);
  ASSERT_NE(c, nullptr);
  EXPECT_EQ(NLS1_SetNativeFromLocale(c, LC_NUMERIC), 0u);
  EXPECT_STREQ(std::setlocale(LC_NUMERIC, nullptr), "C");
  VLReleaseLocale(c);
  c = NLS1_GetLocale(NLS1_LOCALE_ID(german, 840), 932, 0, &rc);
  EXPECT_EQ(NLS1_SetNativeFromLocale(c, LC_NUMERIC), VL_RC_NOTFOUND);  // no native name for it
  VLReleaseLocale(c);
}

void FallbackWithoutDefinitions() {
  VLLocale *l = NLS1_PrivateFunction_GetThreadLocale();
  ASSERT_NE(l, nullptr);
  EXPECT_EQ(nameOf(l), "English_UnitedStates.US-ASCII");
  ASSERT_NE(vlglocale, nullptr);
  EXPECT_EQ(nameOf(vlglocale), "English_UnitedStates.US-ASCII");
  std::thread([] {
    VLLocale *t = NLS1_PrivateFunction_GetThreadLocale();
    ASSERT_NE(t, nullptr);
    EXPECT_EQ(nameOf(t), "English_UnitedStates.US-ASCII");
  }).join();
  Result r = translate(1200, l->codePage->id, "Hi", 2, 8, 0);
  EXPECT_EQ(r.rc, 0u);
  EXPECT_EQ(r.out, u16(u"Hi"));
}

// ---- Many threads ---------------------------------------------------------------------------

std::atomic<long> gLive{0};
void *countAlloc(uint32_t c, size_t n) {
  void *p = VLDefAlloc(c, n);
  if (p) gLive.fetch_add(1);
  return p;
}
int countFree(uint32_t c, void *p) {
  if (p) gLive.fetch_sub(1);
  return VLDefFree(c, p);
}

void ManyThreads() {
  uint32_t rc = 0;
  const uint32_t german = NLS1_GetLanguageId("German", &rc);
  struct Target {
    uint32_t localeId, codePage;
    std::string name;
  };
  const std::vector<Target> targets = {
      {NLS1_LOCALE_ID(german, 276), 0, "German_Germany.Latin1@Default"},
      {NLS1_LOCALE_ID(german, 840), 932, "German_UnitedStates.MS932@Default"},
      {NLS1_LOCALE_ID(1, 840), 0, "English_UnitedStates.US-ASCII@Default"},
      {NLS1_LOCALE_ID(1, 276), 57352, "English_Germany.UTF-8@Default"},
  };
  const std::string text = "\xE6\x97\xA5\xE6\x9C\xAC\xE8\xAA\x9E ABC \xEF\xBD\xB1";
  std::string sj, eb, u;
  ASSERT_TRUE(iconvTo(text, "UTF-8", "CP932", &sj) && iconvTo(text, "UTF-8", "IBM930", &eb) &&
              iconvTo(text, "UTF-8", "UTF-16LE", &u));
  // Warm up: every object the threads use is loaded before counting starts.
  for (const Target &t : targets) VLReleaseLocale(NLS1_GetLocale(t.localeId, t.codePage, 0, &rc));
  translate(930, 932, sj, static_cast<int32_t>(sj.size()), 64, 0);
  translate(1200, 930, eb, static_cast<int32_t>(eb.size()), 64, 0);

  vlalloc_cbk = countAlloc;
  vlfree_cbk = countFree;
  std::atomic<int> failures{0};
  auto work = [&](int seed) {
    for (int i = 0; i < 60; ++i) {
      const Target &t = targets[static_cast<size_t>(seed + i) % targets.size()];
      if (NLS1_SetLocale(t.localeId, t.codePage, NLS1_SET_THREAD) != 0) ++failures;
      Result a = translate(930, 932, sj, static_cast<int32_t>(sj.size()), 64, 0);
      Result b = translate(1200, 930, eb, static_cast<int32_t>(eb.size()), 64, 0);
      if (a.rc || a.out != eb || b.rc || b.out != u) ++failures;
      char name[64];
      if (NLS1_GetLocaleTextInfo(nullptr, VL_ITEM_LOCALE, name, sizeof name, 0) <= 0 || t.name != name) ++failures;
      if (NLS1_GetLocaleNumInfo(nullptr, 5, 0) != static_cast<int32_t>(t.localeId >> 16)) ++failures;
      if (NLS1_SetLocaleNumInfo(nullptr, 69, i % 5, 0) != 1 || NLS1_GetLocaleNumInfo(nullptr, 69, 0) != i % 5)
        ++failures;
    }
  };
  for (int wave = 0; wave < 3; ++wave) {
    std::vector<std::thread> threads;
    for (int k = 0; k < 12; ++k) threads.emplace_back(work, k + wave);
    for (auto &th : threads) th.join();
  }
  vlalloc_cbk = VLDefAlloc;
  vlfree_cbk = VLDefFree;
  EXPECT_EQ(failures.load(), 0);
  EXPECT_EQ(gLive.load(), 0) << "blocks left behind by ended threads";
}

// Threads that make their first translation and set their first Japanese locale at the
// same moment each see what one thread sees once everything is loaded.
void FirstUse() {
  const std::string text = "\xE4\xB8\xAD\xE6\x96\x87 GBK \xE6\xB1\x89\xE5\xAD\x97 \xEF\xBF\xA5";
  std::string gbk, want;
  ASSERT_TRUE(iconvTo(text, "UTF-8", "CP936", &gbk) && iconvTo(text, "UTF-8", "UTF-16LE", &want));
  uint32_t rc = 0;
  const uint32_t japanese = NLS1_LOCALE_ID(NLS1_GetLanguageId("Japanese", &rc), NLS1_GetTerritoryId("Japan", &rc));
  ASSERT_EQ(rc, 0u);
  auto items = [] {
    std::string all;
    char buf[128];
    for (int item = 1; item <= VL_ITEM_LAST; ++item) {
      int32_t n = NLS1_GetLocaleTextInfo(nullptr, item, buf, sizeof buf, 0);
      all += std::string(buf, static_cast<size_t>(n > 0 ? n : 0)) + "|";
    }
    return all;
  };
  constexpr size_t kThreads = 16;
  std::atomic<size_t> waiting{kThreads};
  std::vector<Result> got(kThreads);
  std::vector<std::string> seen(kThreads);
  std::vector<std::thread> threads;
  for (size_t k = 0; k < kThreads; ++k)
    threads.emplace_back([&, k] {
      waiting.fetch_sub(1);
      while (waiting.load()) {
      }
      got[k] = translate(1200, 936, gbk, static_cast<int32_t>(gbk.size()), 64, 0);
      if (NLS1_SetLocale(japanese, 954, NLS1_SET_THREAD) == 0) seen[k] = items();
    });
  for (auto &th : threads) th.join();
  ASSERT_EQ(NLS1_SetLocale(japanese, 954, NLS1_SET_THREAD), 0u);
  const std::string one = items();
  for (size_t k = 0; k < kThreads; ++k) {
    EXPECT_EQ(got[k].rc, 0u) << k;
    EXPECT_EQ(got[k].out, want) << k;
    EXPECT_EQ(seen[k], one) << k;
  }
}

// The child suites exist only in the child that runs them.
struct ChildCase {
  const char *name;
  void (*body)();
};
const ChildCase kChildCases[] = {
    {"Translate", TranslateAgreesWithIconv}, {"TranslateRules", TranslateRules},
    {"Missing", MissingFileUsesBuiltin},     {"Queries", Queries},
    {"Locales", ThreadAndProcessLocales},    {"Fallback", FallbackWithoutDefinitions},
    {"Threads", ManyThreads},                {"FirstUse", FirstUse},
};

class ChildTest : public ::testing::Test {
 public:
  explicit ChildTest(void (*body)()) : body_(body) {}
  void TestBody() override { body_(); }

 private:
  void (*body_)();
};

const bool kRegistered = [] {
  const char *child = std::getenv(kChildVar);
  if (!child) return false;
  for (const ChildCase &c : kChildCases) {
    void (*body)() = c.body;
    ::testing::RegisterTest("ServiceChild", c.name, nullptr, nullptr, __FILE__, __LINE__,
                            [body]() -> ::testing::Test * { return new ChildTest(body); });
  }
  return true;
}();

// ---- The cases, each in a child ---------------------------------------------------------------

class Service : public ::testing::Test {
 protected:
  void SetUp() override {
    if (std::getenv(kChildVar)) GTEST_SKIP() << "inside a child";
  }
};

TEST_F(Service, TranslateAgainstIconvAndByTheRules) {
  if (!haveDefs()) GTEST_SKIP() << "no generated definitions";
  EXPECT_EQ(runChild("Translate", {{"NLS1_LOCALEDIR", VL_TEST_DEFS_DIR}, {"VL_LANG", "English"}}), 0);
}

TEST_F(Service, MissingCodePageFileIsReplacedByTheBuiltIn) {
  if (!haveDefs()) GTEST_SKIP() << "no generated definitions";
  ts::TempDir copy;
  fs::copy(VL_TEST_DEFS_DIR, copy.path, fs::copy_options::recursive);
  fs::remove(fs::path(copy.path) / "cp_00437.nls");
  EXPECT_EQ(runChild("Missing", {{"NLS1_LOCALEDIR", copy.path}, {"VL_LANG", "English"}}), 0);
}

TEST_F(Service, QueriesAndLocales) {
  if (!haveDefs()) GTEST_SKIP() << "no generated definitions";
  EXPECT_EQ(runChild("Queries", {{"NLS1_LOCALEDIR", VL_TEST_DEFS_DIR}, {"VL_LANG", "English"}}), 0);
  EXPECT_EQ(runChild("Locales", {{"NLS1_LOCALEDIR", VL_TEST_DEFS_DIR}, {"VL_LANG", "English"}}), 0);
}

TEST_F(Service, UnknownUserLanguageWithoutDefinitionsFallsBackToEnglish) {
  ts::TempDir empty;
  EXPECT_EQ(runChild("Fallback", {{"VL_LOCALEDIR", empty.path}, {"VL_LANG", "Klingon_Qonos"}}), 0);
}

TEST(ServiceThreads, ManyThreadsTranslateAndChangeTheirOwnLocales) {
  if (std::getenv(kChildVar)) GTEST_SKIP() << "inside a child";
  if (!haveDefs()) GTEST_SKIP() << "no generated definitions";
  EXPECT_EQ(runChild("Threads", {{"NLS1_LOCALEDIR", VL_TEST_DEFS_DIR}, {"VL_LANG", "English"}}), 0);
}

TEST(ServiceThreads, FirstUseFromManyThreadsAtOnce) {
  if (std::getenv(kChildVar)) GTEST_SKIP() << "inside a child";
  if (!haveDefs()) GTEST_SKIP() << "no generated definitions";
  EXPECT_EQ(runChild("FirstUse", {{"NLS1_LOCALEDIR", VL_TEST_DEFS_DIR}, {"VL_LANG", "English"}}), 0);
}

}  // namespace
