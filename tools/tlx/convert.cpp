// tlx convert -f FROM -t TO [-c] [--substitute] [FILE...]: converts text between code
// pages with iconv's habits: exactly, or with an error that names the byte offset.
//
// Every character goes through its Unicode scalar value. UTF-8 and UTF-16 are decoded and
// encoded here, supplementary characters included (four bytes, or a surrogate pair); a code
// page of the definitions goes through the library's character primitives. A target
// character counts only when it reads back as the same character, so valid text never
// turns into different valid text.
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <strings.h>
#include <vector>

#include "codepage/cpbody.h"
#include "tools/tlx/tlx.h"
#include "veltrin.h"

namespace {

constexpr size_t kChunk = 64 * 1024;
constexpr int kUsage = 64;  // iconv's status for a bad command line

enum class Form { Utf8, Utf16Le, Utf16Be, Utf16Bom, Page };
// What happens to invalid input and to characters the target cannot hold.
enum class Policy { Stop, Drop, Substitute };

struct Side {
  const char *name = nullptr;
  Form form = Form::Page;
  const VLCodePage *cp = nullptr;
};

void help(FILE *out) {
  std::fprintf(out,
               "usage: tlx convert -f FROM -t TO [-c] [--substitute] [--dir DIR] [FILE...]\n"
               "  Converts FILEs (or standard input, also for '-') from code page FROM to TO and\n"
               "  writes the result to standard output. A code page is named by its name, an alias\n"
               "  or its number; UTF-8 and UTF-16 carry every character, supplementary ones too.\n"
               "  UTF-16LE and UTF-16BE name the byte orders; UTF-16 is written little-endian behind\n"
               "  a byte order mark and read by its mark (big-endian without).\n"
               "  Invalid input, or a character TO cannot hold, stops the conversion with its byte\n"
               "  offset.\n"
               "  -c            drop such characters and go on (the exit status is still 1)\n"
               "  --substitute  write TO's substitution character for them instead\n"
               "  Exit status: 0 done, 1 conversion error or unknown code page, %d bad usage.\n",
               kUsage);
}

Form unicodeForm(const char *n) {
  if (!strcasecmp(n, "UTF-8") || !strcasecmp(n, "UTF8")) return Form::Utf8;
  if (!strcasecmp(n, "UTF-16LE") || !strcasecmp(n, "UTF16LE") || !strcasecmp(n, "UCS-2LE")) return Form::Utf16Le;
  if (!strcasecmp(n, "UTF-16BE") || !strcasecmp(n, "UTF16BE") || !strcasecmp(n, "UCS-2BE") || !strcmp(n, "1201"))
    return Form::Utf16Be;
  if (!strcasecmp(n, "UTF-16") || !strcasecmp(n, "UTF16") || !strcasecmp(n, "UCS-2") || !strcmp(n, "1200"))
    return Form::Utf16Bom;
  return Form::Page;
}

// The code page object by number, alias or name; null when there is none.
VLObjEntry *findCodePage(const char *name) {
  VLObjManager *m = vlglobals ? vlglobals->objManager : nullptr;
  if (!m) return nullptr;
  uint32_t rc = 0;
  char *end = nullptr;
  long id = std::strtol(name, &end, 10);
  if (*name && !*end && id > 0 && id < 65536)
    if (VLObjEntry *e = VLGetObjFromID(m, VL_OBJ_CODEPAGE, static_cast<uint16_t>(id), 0, &rc)) return e;
  auto byName = [&](const char *n) {
    return VLGetObjFromName(m, VL_OBJ_CODEPAGE, n, static_cast<int32_t>(std::strlen(n)), 0, &rc);
  };
  if (VLObjEntry *e = byName(name)) return e;
  if (const char *canon = VLGetCodepageFromAlias(m, name)) return byName(canon);
  return nullptr;
}

bool setUp(Side &s, const char *looked, bool noDefs) {
  s.form = unicodeForm(s.name);
  if (s.form != Form::Page) return true;
  VLObjEntry *e = findCodePage(s.name);
  if (!e || !e->section[0]) {
    if (noDefs)
      std::fprintf(stderr,
                   "tlx convert: no definitions found (looked in '%s', $VL_LOCALEDIR and the built-in "
                   "location): code page '%s' is unknown\n",
                   looked ? looked : "", s.name);
    else
      std::fprintf(stderr, "tlx convert: unknown code page '%s'\n", s.name);
    return false;
  }
  // The UTF-8 page holds only what one UTF-16 unit can: the tool does UTF-8 itself.
  if (vl::cp::isUtf8(e))
    s.form = Form::Utf8;
  else
    s.cp = e;
  return true;
}

bool isSurrogate(char32_t c) { return c >= 0xD800 && c < 0xE000; }

enum class Read { Char, Skip, Bad, Short };  // Short: the bytes end inside a character

// Reads characters of one side; *used receives the bytes taken (for Bad, the bytes that
// form no character).
struct Decoder {
  const Side &side;
  Form form;
  bool db = false;  // in the double-byte state of a shift-sensitive page
  explicit Decoder(const Side &s) : side(s), form(s.form) {}

  Read next(const uint8_t *p, size_t n, char32_t *c, size_t *used) {
    switch (form) {
      case Form::Utf8:
        return utf8(p, n, c, used);
      case Form::Page:
        return page(p, n, c, used);
      default:
        return utf16(p, n, c, used);
    }
  }

  // Well-formed UTF-8 only: no overlong forms, surrogates or values past U+10FFFF. A bad
  // sequence is its longest valid beginning, or its first byte.
  static Read utf8(const uint8_t *p, size_t n, char32_t *c, size_t *used) {
    uint8_t b = p[0];
    *used = 1;
    if (b < 0x80) {
      *c = b;
      return Read::Char;
    }
    unsigned len = b >= 0xF0 ? 4 : b >= 0xE0 ? 3 : 2;
    if (b < 0xC2 || b > 0xF4) return Read::Bad;
    // The second byte's range carries the overlong, surrogate and range rules.
    uint8_t lo = b == 0xE0 ? 0xA0 : b == 0xF0 ? 0x90 : 0x80;
    uint8_t hi = b == 0xED ? 0x9F : b == 0xF4 ? 0x8F : 0xBF;
    char32_t v = b & (0x7F >> len);
    for (unsigned k = 1; k < len; ++k) {
      if (k == n) return Read::Short;
      uint8_t t = p[k];
      if (k == 1 ? (t < lo || t > hi) : (t & 0xC0) != 0x80) {
        *used = k;
        return Read::Bad;
      }
      v = (v << 6) | (t & 0x3F);
    }
    *c = v;
    *used = len;
    return Read::Char;
  }

  Read utf16(const uint8_t *p, size_t n, char32_t *c, size_t *used) {
    if (n < 2) return Read::Short;
    auto unit = [&](const uint8_t *q) -> char32_t {
      return form == Form::Utf16Le ? (q[0] | (q[1] << 8)) : ((q[0] << 8) | q[1]);
    };
    *used = 2;
    if (form == Form::Utf16Bom) {
      unsigned mark = (p[0] << 8) | p[1];
      form = mark == 0xFFFE ? Form::Utf16Le : Form::Utf16Be;
      if (mark == 0xFFFE || mark == 0xFEFF) return Read::Skip;
    }
    char32_t u = unit(p);
    if (u >= 0xDC00 && u < 0xE000) return Read::Bad;
    if (u >= 0xD800 && u < 0xDC00) {
      if (n < 4) return Read::Short;
      char32_t l = unit(p + 2);
      if (l < 0xDC00 || l >= 0xE000) return Read::Bad;
      u = 0x10000 + ((u - 0xD800) << 10) + (l - 0xDC00);
      *used = 4;
    }
    *c = u;
    return Read::Char;
  }

  Read page(const uint8_t *p, size_t n, char32_t *c, size_t *used) {
    const VLCodePage *cp = side.cp;
    size_t len = 1;
    if (vl::cp::isShift(cp)) {
      if (p[0] == vl::cp::shiftOut(cp) || p[0] == vl::cp::shiftIn(cp)) {
        db = p[0] == vl::cp::shiftOut(cp);
        *used = 1;
        return Read::Skip;
      }
      if (db) len = vl::cp::maxLen(cp);
    } else {
      len = vl::cp::charLen(cp, p[0]);
    }
    if (n < len) return Read::Short;
    VLUChar u = len == 1 ? vl::cp::sbcsUni(cp, p[0]) : VLCpMbToUnicode(cp, p);
    // A double-byte unit of a shift-sensitive page is skipped whole; elsewhere the next
    // byte may start a character of its own.
    *used = db ? len : 1;
    if (u == 0xFFFD) return Read::Bad;
    *used = len;
    *c = u;
    return Read::Char;
  }
};

struct Encoder {
  const Side &side;
  Form form;
  bool db = false;
  std::vector<uint8_t> out;
  explicit Encoder(const Side &s) : side(s), form(s.form) {}

  void unit16(char32_t u) {
    if (form == Form::Utf16Be) {
      out.push_back(static_cast<uint8_t>(u >> 8));
      out.push_back(static_cast<uint8_t>(u));
    } else {
      out.push_back(static_cast<uint8_t>(u));
      out.push_back(static_cast<uint8_t>(u >> 8));
    }
  }

  // Appends c; false when the target cannot hold it exactly.
  bool put(char32_t c) {
    if (isSurrogate(c) || c > 0x10FFFF) return false;
    switch (form) {
      case Form::Utf8:
        if (c < 0x80) {
          out.push_back(static_cast<uint8_t>(c));
        } else if (c < 0x800) {
          out.push_back(static_cast<uint8_t>(0xC0 | (c >> 6)));
          out.push_back(static_cast<uint8_t>(0x80 | (c & 0x3F)));
        } else if (c < 0x10000) {
          out.push_back(static_cast<uint8_t>(0xE0 | (c >> 12)));
          out.push_back(static_cast<uint8_t>(0x80 | ((c >> 6) & 0x3F)));
          out.push_back(static_cast<uint8_t>(0x80 | (c & 0x3F)));
        } else {
          out.push_back(static_cast<uint8_t>(0xF0 | (c >> 18)));
          out.push_back(static_cast<uint8_t>(0x80 | ((c >> 12) & 0x3F)));
          out.push_back(static_cast<uint8_t>(0x80 | ((c >> 6) & 0x3F)));
          out.push_back(static_cast<uint8_t>(0x80 | (c & 0x3F)));
        }
        return true;
      case Form::Page:
        return page(c);
      default:
        if (form == Form::Utf16Bom) {
          form = Form::Utf16Le;
          unit16(0xFEFF);
        }
        if (c >= 0x10000) {
          unit16(0xD800 + ((c - 0x10000) >> 10));
          unit16(0xDC00 + ((c - 0x10000) & 0x3FF));
        } else {
          unit16(c);
        }
        return true;
    }
  }

  bool page(char32_t c) {
    const VLCodePage *cp = side.cp;
    if (c > 0xFFFF) return false;
    unsigned char b[8];
    int k = VLCpUnicodeToChar(cp, static_cast<VLUChar>(c), b);
    if (k < 1 || k > 4) return false;
    VLUChar back = k == 1 ? vl::cp::sbcsUni(cp, b[0]) : VLCpMbToUnicode(cp, b);
    if (back != c) return false;  // unmapped (the substitution byte) or a one-way mapping
    bytes(b, static_cast<size_t>(k));
    return true;
  }

  void bytes(const unsigned char *b, size_t k) {
    const VLCodePage *cp = side.cp;
    if (vl::cp::isShift(cp) && (k > 1) != db) {
      db = k > 1;
      out.push_back(db ? vl::cp::shiftOut(cp) : vl::cp::shiftIn(cp));
    }
    out.insert(out.end(), b, b + k);
  }

  void substitute() {
    if (form != Form::Page) {
      put(0xFFFD);
      return;
    }
    unsigned char b = vl::cp::subst(side.cp);
    bytes(&b, 1);
  }

  // Ends the output of one input in the single-byte state.
  void finish() {
    if (form == Form::Page && db) {
      out.push_back(vl::cp::shiftIn(side.cp));
      db = false;
    }
  }
};

struct Job {
  const Side &from, &to;
  Policy policy;
  bool dropped = false;
};

bool flush(Encoder &e) {
  bool ok = e.out.empty() || std::fwrite(e.out.data(), 1, e.out.size(), stdout) == e.out.size();
  e.out.clear();
  if (!ok) std::fprintf(stderr, "tlx convert: cannot write output: %s\n", std::strerror(errno));
  return ok;
}

// Converts one input: 0 done, 1 stopped (the message is out).
int convertFile(Job &job, const char *path) {
  Input in("convert", path);
  if (!in.f) return 1;
  FILE *f = in.f;
  const char *shown = in.shown;
  Decoder dec(job.from);
  Encoder enc(job.to);
  std::vector<uint8_t> pend;  // bytes read and not yet converted
  uint64_t base = 0;          // input offset of pend[0]
  int status = 0;
  // A problem at input offset `at`: `what` is wrong with the input, or empty when the
  // target cannot hold c. False when the conversion stops there.
  auto problem = [&](uint64_t at, const char *what, char32_t c) {
    if (job.policy == Policy::Drop) {
      job.dropped = true;
      return true;
    }
    if (job.policy == Policy::Substitute) {
      enc.substitute();
      return true;
    }
    if (!flush(enc)) return false;
    if (!*what)
      std::fprintf(stderr, "tlx convert: cannot convert U+%04X to %s at byte offset %llu of '%s'\n",
                   static_cast<unsigned>(c), job.to.name, static_cast<unsigned long long>(at), shown);
    else
      std::fprintf(stderr, "tlx convert: %s at byte offset %llu of '%s'\n", what, static_cast<unsigned long long>(at),
                   shown);
    return false;
  };
  std::vector<uint8_t> buf(kChunk);
  for (bool end = false; !end && !status;) {
    size_t n = std::fread(buf.data(), 1, buf.size(), f);
    if (n < buf.size()) {
      end = true;
      if (std::ferror(f)) {
        std::fprintf(stderr, "tlx convert: cannot read '%s': %s\n", shown, std::strerror(errno));
        status = 1;
        break;
      }
    }
    pend.insert(pend.end(), buf.begin(), buf.begin() + static_cast<long>(n));
    size_t i = 0;
    while (i < pend.size()) {
      char32_t c = 0;
      size_t used = 0;
      Read r = dec.next(pend.data() + i, pend.size() - i, &c, &used);
      if (r == Read::Short) {
        if (!end) break;
        // The input ends inside a character: what is left is one incomplete character.
        if (!problem(base + i, "incomplete character or shift sequence at end of input", 0)) status = 1;
        i = pend.size();
        break;
      }
      if ((r == Read::Bad && !problem(base + i, "invalid input sequence", 0)) ||
          (r == Read::Char && !enc.put(c) && !problem(base + i, "", c))) {
        status = 1;
        break;
      }
      i += used;
    }
    pend.erase(pend.begin(), pend.begin() + static_cast<long>(i));
    base += i;
    if (!status && enc.out.size() >= kChunk && !flush(enc)) status = 1;
  }
  if (!status) {
    enc.finish();
    if (!flush(enc)) status = 1;
  }
  return status;
}

}  // namespace

int cmdConvert(int argc, char **argv) {
  Side from, to;
  Policy policy = Policy::Stop;
  const char *dir = nullptr;
  std::vector<const char *> files;
  for (int i = 1; i < argc; ++i) {
    const char *a = argv[i];
    auto value = [&](const char *shortName, const char *longName) -> const char * {
      size_t l = std::strlen(longName);
      if (!std::strncmp(a, longName, l) && a[l] == '=') return a + l + 1;
      if ((!std::strcmp(a, shortName) || !std::strcmp(a, longName)) && i + 1 < argc) return argv[++i];
      if (!std::strncmp(a, shortName, 2) && a[2] && a[1] != '-') return a + 2;
      return nullptr;
    };
    if (!std::strcmp(a, "--help") || !std::strcmp(a, "-h")) {
      help(stdout);
      return 0;
    }
    if (!std::strcmp(a, "-c")) {
      policy = Policy::Drop;
    } else if (!std::strcmp(a, "--substitute")) {
      policy = Policy::Substitute;
    } else if (const char *v = value("-f", "--from-code")) {
      from.name = v;
    } else if (const char *v = value("-t", "--to-code")) {
      to.name = v;
    } else if (!std::strcmp(a, "--dir") && i + 1 < argc) {
      dir = argv[++i];
    } else if (a[0] == '-' && a[1]) {
      std::fprintf(stderr, "tlx convert: unknown option '%s'\n", a);
      help(stderr);
      return kUsage;
    } else {
      files.push_back(a);
    }
  }
  if (!from.name || !to.name) {
    help(stderr);
    return kUsage;
  }
  const char *looked = defsDir(dir);
  uint32_t irc = VLInit(looked, nullptr, nullptr, 0, 0);
  if (irc != VL_RC_OK && irc != VL_RC_DEFAULTS) {
    std::fprintf(stderr, "tlx convert: the library did not start (rc %u)\n", irc);
    return 1;
  }
  int status = 1;
  bool noDefs = irc == VL_RC_DEFAULTS;
  if (setUp(from, looked, noDefs) && setUp(to, looked, noDefs)) {
    Job job{from, to, policy};
    status = 0;
    if (files.empty()) files.push_back(nullptr);
    for (const char *f : files)
      if (convertFile(job, f)) {
        status = 1;
        break;  // as iconv: the first error ends the run
      }
    // Dropped characters change the text: the run says so, as iconv -c does.
    if (job.dropped) status = 1;
  }
  if (std::fflush(stdout)) status = 1;
  VLTerm();
  return status;
}
