// Generated sorts against the C library: every pair of a word list of the language is
// ordered by VLStrcoll and by strcoll_l of the same locale built with localedef, and
// VLStrxfrm keys compared byte-wise give exactly VLStrcoll's order.
#include <gtest/gtest.h>
#include <iconv.h>
#include <locale.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "support/defdir.h"
#include "support/hooks.h"
#include "veltrin.h"

namespace {

namespace fs = std::filesystem;

// Words every list shares: case pairs, punctuation, digits, spaces.
const std::vector<std::string> kCommon = {
    "apple",  "Apple",  "APPLE", "apples", "apple pie", "apple-pie", "applepie", "a",     "A",   "b",
    "B",      "zebra",  "Zebra", "co-op",  "coop",      "co op",     "e-mail",   "email", "1st", "2nd",
    "10",     "9",      "100",   "x1",     "x10",       "x2",        "ab.cd",    "abcd",  "ab,c", "O'Brien",
    "Obrien", "resume", "naive", "role",   "cafe",      "Zurich",    "zoo",      "yacht", "year", "young",
};

struct Lang {
  const char *sort;     // generated sort
  const char *native;   // C library locale source
  const char *locale;   // library locale name
  double minimum;       // share of pairs ordered alike this sort reaches
  std::vector<std::string> words;
};

const std::vector<Lang> kLangs = {
    {"Default", "en_US", "English_UnitedStates.UTF-8", 99.68,
     {"résumé", "resumé", "naïve", "rôle", "café", "Café", "cafés", "façade", "facade", "über", "Zürich", "coöperate",
      "élan", "Élan", "elan", "déjà", "deja", "piñata", "pinata", "æon", "aeon", "straße", "strasse"}},
    {"Swedish", "sv_SE", "Swedish_Sweden.UTF-8", 99.69,
     {"år", "Åre", "ärlig", "Ärla", "öga", "Öland", "ost", "oxe", "zebra", "ände", "åska", "yxa", "über", "vägg",
      "wagon", "väder", "ödla", "ålder", "älg", "öl", "ära", "Västerås", "Malmö", "Göteborg"}},
    {"Danish", "da_DK", "Danish_Denmark.UTF-8", 99.65,
     {"æble", "Æble", "øl", "Øresund", "år", "Aarhus", "aarhus", "Aalborg", "ål", "ørn", "zoo", "ærlig", "yngre",
      "åben", "ønske", "Ålborg", "vej", "bøger", "blå", "bæk"}},
    {"Norwegian", "nb_NO", "Norwegian_Norway.UTF-8", 99.61,
     {"æble", "øy", "Østfold", "år", "Aasen", "ål", "ørn", "zoo", "ærlig", "yngre", "åpen", "ønske", "Ålesund",
      "vei", "bøker", "blå", "bær"}},
    {"Finnish", "fi_FI", "Finnish_Finland.UTF-8", 99.63,
     {"äiti", "Äänekoski", "öljy", "Öljy", "yö", "vaara", "waara", "zeta", "åbo", "ääni", "öisin", "yksi", "Vaasa",
      "Wasa", "työ", "tyyni", "sää", "saari"}},
    {"Spanish", "es_ES", "Spanish_Spain.UTF-8", 99.78,
     {"ñandú", "Ñandú", "nube", "nuez", "ñu", "oso", "niño", "nino", "canción", "cancion", "llama", "lluvia",
      "luz", "chico", "cigarro", "cuna", "pañuelo", "panuelo", "año", "anzuelo", "árbol", "arbol"}},
    {"Czech", "cs_CZ", "Czech_CzechRepublic.UTF-8", 99.68,
     {"chléb", "Chrudim", "hrad", "ihned", "čas", "Čech", "cena", "dům", "řeka", "Řím", "rak", "šest", "sestra",
      "žena", "zima", "ďábel", "ťava", "úterý", "ucho", "ůl", "kůň", "Chomutov", "cihla"}},
    {"Slovak", "sk_SK", "Slovak_Slovakia.UTF-8", 99.66,
     {"chlieb", "hrad", "ihla", "čas", "cena", "ďakujem", "dom", "ľad", "lano", "ňaňa", "ôsmy", "osem", "šesť",
      "sestra", "žena", "zima", "ťava", "Chorvátsko", "ruža", "ŕba", "äno"}},
    {"Polish", "pl_PL", "Polish_Poland.UTF-8", 99.78,
     {"ąb", "ab", "ćma", "cma", "ęka", "ekran", "łza", "lza", "ńo", "nos", "ósmy", "osa", "śnieg", "sen", "źdźbło",
      "żaba", "zaba", "Łódź", "Lodz", "Żółw", "Źródło", "zebra"}},
    {"Hungarian", "hu_HU", "Hungarian_Hungary.UTF-8", 99.69,
     {"cukor", "csak", "Csaba", "dzéta", "dzsungel", "gyár", "gazda", "lyuk", "lakás", "nyár", "nap", "szép",
      "sas", "tyúk", "tál", "zsák", "zaj", "öröm", "őz", "ül", "űr", "ujj", "ötlet", "ősz"}},
    {"Croatian", "hr_HR", "Croatian_Croatia.UTF-8", 99.63,
     {"čaj", "ćevapi", "cesta", "dah", "džep", "đak", "Đakovo", "ljubav", "lopta", "njiva", "nos", "šuma", "sunce",
      "žaba", "zima", "Dubrovnik", "Džakarta", "Ljubljana"}},
    {"Lithuanian", "lt_LT", "Lithuanian_Lithuania.UTF-8", 99.65,
     {"ąžuolas", "arklys", "čia", "ciklas", "ęsti", "ėjo", "eglė", "įėjimas", "yra", "ilgas", "jūra", "šuo", "saulė",
      "ūkis", "ųsas", "uola", "žuvis", "zuikis", "Vilnius", "Kaunas"}},
    {"Estonian", "et_EE", "Estonian_Estonia.UTF-8", 99.61,
     {"šokolaad", "sõber", "saag", "zooloog", "žürii", "tee", "õun", "ära", "öö", "üks", "wagun", "vesi", "Tallinn",
      "Tartu", "Pärnu", "Võru", "Türi"}},
    {"Latvian", "lv_LV", "Latvian_Latvia.UTF-8", 99.65,
     {"čaula", "cena", "ģimene", "gads", "ķirsis", "kaķis", "ļoti", "lapa", "ņaudēt", "nauda", "šis", "sala",
      "žurka", "zeme", "āboli", "ēst", "īss", "ūdens", "Rīga", "Liepāja"}},
    {"Ukrainian", "uk_UA", "Ukrainian_Ukraine.UTF-8", 99.66,
     {"гай", "ґава", "Ґанок", "дім", "єнот", "Європа", "жук", "іній", "їжак", "йод", "ирій", "киян", "ь", "юнак",
      "яма", "Київ", "Львів", "ялинка", "щука", "шапка", "ёлка"}},
    {"Turkish", "tr_TR", "Turkish_Turkey.UTF-8", 99.64,
     {"ılık", "Irmak", "ikiz", "İstanbul", "çay", "cam", "Çanakkale", "ğ", "gül", "öğle", "ocak", "şeker", "su",
      "üzüm", "uzun", "Izmir", "İzmir", "kız", "kiz"}},
    {"Icelandic", "is_IS", "Icelandic_Iceland.UTF-8", 99.67,
     {"á", "ás", "að", "ðe", "dagur", "é", "eldur", "í", "ís", "ó", "ós", "ú", "út", "ý", "ýsa", "þú", "þorn",
      "æ", "ævi", "ö", "örn", "zebra"}},
    {"Slovenian", "sl_SI", "Slovenian_Slovenia.UTF-8", 99.55,
     {"čaj", "cesta", "šola", "sonce", "žaba", "zima", "ćevapčiči", "dan", "đak", "Ljubljana", "Maribor",
      "Celje", "Čatež"}},
};

std::string oracleDir() { return (fs::path(VL_TEST_DEFS_DIR).parent_path() / "coll-oracle").string(); }

// Builds the C library locale once per build tree; localedef is slow on the full table.
bool buildOracle(const std::string &native) {
  const std::string dir = oracleDir();
  fs::create_directories(dir);
  const std::string target = dir + "/" + native + ".UTF-8";
  if (fs::exists(target + "/LC_COLLATE")) return true;
  const std::string cmd = "localedef -c -i " + native + " -f UTF-8 " + target + " >/dev/null 2>&1";
  return std::system(cmd.c_str()) >= 0 && fs::exists(target + "/LC_COLLATE");
}

int sign(int v) { return (v > 0) - (v < 0); }

class CollateOracle : public ::testing::TestWithParam<Lang> {};

TEST_P(CollateOracle, AgreesWithTheCLibrary) {
  const Lang &lang = GetParam();
  if (!fs::exists(fs::path(VL_TEST_DEFS_DIR) / "control.nls")) GTEST_SKIP() << "no generated definitions";
  if (!buildOracle(lang.native)) GTEST_SKIP() << "localedef could not build " << lang.native;
  setenv("LOCPATH", oracleDir().c_str(), 1);
  locale_t c = newlocale(LC_COLLATE_MASK, (std::string(lang.native) + ".UTF-8").c_str(), nullptr);
  unsetenv("LOCPATH");
  ASSERT_NE(c, nullptr);
  ts::Library lib(VL_TEST_DEFS_DIR);
  uint32_t rc;
  std::string name = lang.locale;
  if (name.find('@') == std::string::npos) name += std::string("@") + lang.sort;
  VLLocale *l = VLGetLocale(name.c_str(), 0, &rc);
  ASSERT_NE(l, nullptr) << name << " rc " << rc;
  ASSERT_NE(l->sort, nullptr);

  std::vector<std::string> words = kCommon;
  words.insert(words.end(), lang.words.begin(), lang.words.end());
  std::vector<std::string> keys;
  for (const std::string &w : words) {
    const int32_t n = VLStrxfrm(l, nullptr, 0, w.c_str(), -1, 0);
    ASSERT_GT(n, 0) << w;
    std::string k(static_cast<size_t>(n), '\0');
    ASSERT_EQ(VLStrxfrm(l, k.data(), n, w.c_str(), -1, 0), n);
    keys.push_back(k);
  }
  size_t pairs = 0, alike = 0;
  std::string differ;
  for (size_t i = 0; i < words.size(); ++i) {
    for (size_t j = i + 1; j < words.size(); ++j) {
      const int ours = sign(VLStrcoll(l, words[i].c_str(), -1, words[j].c_str(), -1, 0));
      const int theirs = sign(strcoll_l(words[i].c_str(), words[j].c_str(), c));
      EXPECT_EQ(sign(keys[i].compare(keys[j])), ours) << words[i] << " / " << words[j];
      ++pairs;
      if (ours == theirs) ++alike;
      else if (differ.size() < 400) differ += " [" + words[i] + " " + words[j] + "]";
    }
  }
  // Random pairs over the list's characters, sharing a beginning: the comparison orders
  // them as their keys do.
  std::vector<std::string> chars;
  for (const std::string &w : words)
    for (size_t i = 0; i < w.size();) {
      const size_t n = (w[i] & 0x80) == 0 ? 1 : (w[i] & 0xE0) == 0xC0 ? 2 : 3;
      chars.push_back(w.substr(i, n));
      i += n;
    }
  std::mt19937 rng(5);
  auto random = [&](size_t max) {
    std::string s;
    for (size_t n = rng() % (max + 1); n--;) s += chars[rng() % chars.size()];
    return s;
  };
  auto key = [&](const std::string &w) {
    std::string k(512, '\0');
    k.resize(static_cast<size_t>(VLStrxfrm(l, k.data(), 512, w.data(), static_cast<int32_t>(w.size()), 0)));
    return k;
  };
  for (int i = 0; i < 1500; ++i) {
    const std::string head = random(4), a = head + random(5), b = head + random(5);
    ASSERT_EQ(sign(VLStrcoll(l, a.data(), static_cast<int32_t>(a.size()), b.data(), static_cast<int32_t>(b.size()), 0)),
              sign(key(a).compare(key(b))))
        << a << " / " << b;
  }
  const double share = 100.0 * static_cast<double>(alike) / static_cast<double>(pairs);
  std::printf("%-10s %5zu pairs, %6.2f%% ordered alike\n", lang.sort, pairs, share);
  RecordProperty("agreement", std::to_string(share));
  EXPECT_GE(share, lang.minimum) << "differ:" << differ;
  VLReleaseLocale(l);
  freelocale(c);
}

INSTANTIATE_TEST_SUITE_P(Sorts, CollateOracle, ::testing::ValuesIn(kLangs),
                         [](const auto &info) { return std::string(info.param.sort); });

std::string encode(const std::string &utf8, const char *charset) {
  iconv_t cd = iconv_open(charset, "UTF-8");
  if (cd == reinterpret_cast<iconv_t>(-1)) return {};
  std::string in = utf8, out(utf8.size() * 4, '\0');
  char *ip = in.data(), *op = out.data();
  size_t il = in.size(), ol = out.size();
  const bool ok = iconv(cd, &ip, &il, &op, &ol) != static_cast<size_t>(-1);
  iconv_close(cd);
  return ok ? out.substr(0, out.size() - ol) : std::string();
}

// A locale name without "@sort" collates by its language's sort in the language's own
// code page, in the C library's order for the same words.
TEST(CollateLanguageDefault, OrdersWordsAsTheLanguage) {
  struct Case {
    const char *locale, *charset, *sort, *native;
    std::vector<std::string> ordered;
  };
  const Case cases[] = {
      {"Lithuanian_Lithuania.MS1257", "CP1257", "Lithuanian", "lt_LT",
       {"ilgas", "Ilgas", "įėjimas", "yra", "jūra", "saulė", "šuo", "uola", "ųsas", "ūkis", "zuikis", "žuvis"}},
      {"Estonian_Estonia.MS1257", "CP1257", "Estonian", "et_EE",
       {"saag", "šokolaad", "zooloog", "žürii", "tee", "vesi", "wagun", "õun", "ära", "öö", "üks", "xenon"}},
      {"Latvian_Latvia.ISO-8859-13", "ISO-8859-13", "Latvian", "lv_LV",
       {"cena", "čaula", "gads", "ģimene", "kaķis", "ķirsis", "sala", "šis", "zeme", "žurka"}},
      {"Ukrainian_Ukraine.KOI8-U", "KOI8-U", "Ukrainian", "uk_UA",
       {"гай", "ґава", "дім", "єнот", "жук", "ирій", "іній", "їжак", "йод", "юнак", "яма"}},
      {"Catalan_Spain.Latin1", "ISO-8859-1", "Spanish", "ca_ES", {"nube", "nuez", "ñu", "oso"}},
  };
  if (!fs::exists(fs::path(VL_TEST_DEFS_DIR) / "control.nls")) GTEST_SKIP() << "no generated definitions";
  ts::Library lib(VL_TEST_DEFS_DIR);
  for (const Case &c : cases) {
    uint32_t rc;
    VLLocale *l = VLGetLocale(c.locale, 0, &rc);
    ASSERT_NE(l, nullptr) << c.locale << " rc " << rc;
    ASSERT_NE(l->sort, nullptr) << c.locale;
    EXPECT_STREQ(l->sort->name, c.sort) << c.locale;
    locale_t oracle = nullptr;
    if (buildOracle(c.native)) {
      setenv("LOCPATH", oracleDir().c_str(), 1);
      oracle = newlocale(LC_COLLATE_MASK, (std::string(c.native) + ".UTF-8").c_str(), nullptr);
      unsetenv("LOCPATH");
    }
    for (size_t i = 0; i + 1 < c.ordered.size(); ++i) {
      const std::string a = encode(c.ordered[i], c.charset), b = encode(c.ordered[i + 1], c.charset);
      ASSERT_FALSE(a.empty() || b.empty()) << c.ordered[i];
      EXPECT_LT(VLStrcoll(l, a.c_str(), -1, b.c_str(), -1, 0), 0)
          << c.locale << ": " << c.ordered[i] << " before " << c.ordered[i + 1];
      if (oracle) {
        EXPECT_LT(strcoll_l(c.ordered[i].c_str(), c.ordered[i + 1].c_str(), oracle), 0)
            << c.native << ": " << c.ordered[i] << " before " << c.ordered[i + 1];
      }
    }
    if (oracle) freelocale(oracle);
    VLReleaseLocale(l);
  }
}

}  // namespace

namespace {

// Full-width blanks: bit 0x01 drops them from byte strings as truncation does; the W form
// drops them on 0x00200000 when width-blind.
TEST(CollateBlanks, FullWidthBlanksInEachForm) {
  if (!fs::exists(fs::path(VL_TEST_DEFS_DIR) / "control.nls")) GTEST_SKIP() << "no generated definitions";
  ts::Library lib(VL_TEST_DEFS_DIR);
  uint32_t rc;
  VLLocale *mb = VLGetLocale("German_Germany.MS932@Default", 0, &rc), *sh = VLGetLocale("Japanese_Japan.IBM930@Default", 0, &rc);
  ASSERT_TRUE(mb && sh && mb->sort && sh->sort);
  const VLWChar wa[] = {'a', 'b', 0x8140, ' '}, wb[] = {'A', 'B'};
  struct Case {
    const char *why;
    int got, order;
  } cases[] = {
      {"0x01 drops a full-width blank", VLStrcoll(mb, "ab\x81\x40 ", -1, "ab", -1, 0x01), 0},
      {"which counts without it", VLStrcoll(mb, "ab\x81\x40 ", -1, "ab", -1, 0), 1},
      {"and in the double-byte state", VLStrcollEx(sh, "\x81\x0E\x40\x40\x0F", 0, -1, "\x81", 0, -1, 0x01), 0},
      {"W drops it on 0x00200000 when width-blind", VLWcscoll(mb, wa, 4, wb, 2, 0x80200041), 0},
      {"W keeps it when only case-blind", VLWcscoll(mb, wa, 4, wb, 2, 0x80200040), 1},
  };
  for (const Case &c : cases) EXPECT_EQ(sign(c.got), c.order) << c.why;
  VLReleaseLocale(mb);
  VLReleaseLocale(sh);
}

// tlx sort: the order of a Swedish list, the options, and the status of bad input.
TEST(TlxSort, SortsLinesByCollation) {
  if (!fs::exists(fs::path(VL_TEST_DEFS_DIR) / "control.nls")) GTEST_SKIP() << "no generated definitions";
  ts::TempDir d;
  {
    FILE *f = std::fopen(d.file("in.txt").c_str(), "w");
    std::fputs("\xc3\x96l\nzebra\nApple\n\xc3\xa5sna\napple\n\xc3\x84pple\nazur\n", f);  // Öl åsna Äpple
    std::fclose(f);
  }
  struct Case {
    const char *args, *out;
    int status;
  } cases[] = {
      {"--locale Swedish_Sweden.UTF-8", "apple Apple azur zebra \xc3\xa5sna \xc3\x84pple \xc3\x96l ", 0},
      {"--locale Swedish_Sweden.UTF-8 --reverse", "\xc3\x96l \xc3\x84pple \xc3\xa5sna zebra azur Apple apple ", 0},
      {"--locale Swedish_Sweden.UTF-8 --ignore-case --unique", "Apple azur zebra \xc3\xa5sna \xc3\x84pple \xc3\x96l ", 0},
      {"--locale English_UnitedStates.UTF-8", "apple Apple \xc3\x84pple \xc3\xa5sna azur \xc3\x96l zebra ", 0},
      {"--locale Nowhere", "", 2},
      {"--bogus", "", 2},
  };
  for (const Case &c : cases) {
    const std::string cmd = std::string(VL_TEST_TLX) + " sort --dir " + VL_TEST_DEFS_DIR + " " + c.args + " " +
                            d.file("in.txt") + " 2>/dev/null";
    FILE *p = popen(cmd.c_str(), "r");
    ASSERT_NE(p, nullptr);
    char buf[512];
    std::string out;
    while (std::fgets(buf, sizeof buf, p)) out += buf;
    std::replace(out.begin(), out.end(), '\n', ' ');
    const int st = pclose(p);
    EXPECT_EQ(out, c.out) << c.args;
    EXPECT_EQ(WEXITSTATUS(st), c.status) << c.args;
  }
}

}  // namespace
