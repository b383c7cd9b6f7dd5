// tlx convert -f FROM -t TO [FILE...]: converts text between code pages, in fixed-size
// chunks through the streaming engine, like iconv.
//
// UTF-16 is not a code page of the definitions: on that side the text goes through the
// UTF-8 code page, whose characters are exactly UTF-16 units.
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

enum class Utf16 { No, Le, Be, Bom };

struct Side {
  const char *name = nullptr;
  Utf16 utf16 = Utf16::No;
  VLLocale locale{};
};

void help(FILE *out) {
  std::fprintf(out,
               "usage: tlx convert -f FROM -t TO [--dir DIR] [FILE...]\n"
               "  Converts FILEs (or standard input, also for '-') from code page FROM to TO and\n"
               "  writes the result to standard output. A code page is named by its name, an alias\n"
               "  or its number; UTF-16LE, UTF-16BE and UTF-16 name UTF-16; UTF-16 is written\n"
               "  little-endian behind a byte order mark and read by its mark (big-endian without).\n"
               "  Characters without a mapping become the target's substitution character.\n"
               "  Exit status: 0 done, 1 conversion error or unknown code page, %d bad usage.\n",
               kUsage);
}

Utf16 utf16Name(const char *n) {
  if (!strcasecmp(n, "UTF-16LE") || !strcasecmp(n, "UTF16LE") || !strcasecmp(n, "UCS-2LE")) return Utf16::Le;
  if (!strcasecmp(n, "UTF-16BE") || !strcasecmp(n, "UTF16BE") || !strcasecmp(n, "UCS-2BE")) return Utf16::Be;
  if (!strcasecmp(n, "UTF-16") || !strcasecmp(n, "UTF16") || !strcasecmp(n, "UCS-2") || !strcasecmp(n, "1200"))
    return Utf16::Bom;
  return Utf16::No;
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

bool setUp(Side &s) {
  s.utf16 = utf16Name(s.name);
  VLObjEntry *e = findCodePage(s.utf16 == Utf16::No ? s.name : "57352");
  if (!e || !e->section[0]) {
    if (s.utf16 != Utf16::No)
      std::fprintf(stderr, "tlx convert: UTF-16 needs the UTF-8 code page, which the definitions lack\n");
    else
      std::fprintf(stderr, "tlx convert: unknown code page '%s'\n", s.name);
    return false;
  }
  s.locale.codePage = e;
  if (vl::cp::maxLen(e) == 1) s.locale.flags |= VL_LF_SINGLEBYTE;
  if (vl::cp::isShift(e)) s.locale.flags |= VL_LF_SHIFT;
  s.locale.flags |= VL_LF_BINARY;
  return true;
}

// UTF-16 in: units to the library's UTF-8 (three bytes at most, surrogates included).
struct Utf16Reader {
  Utf16 order;
  bool first = true;
  uint8_t odd = 0;
  bool hasOdd = false;
  void feed(const uint8_t *p, size_t n, std::vector<uint8_t> &out) {
    out.clear();
    size_t i = 0;
    auto unit = [&](uint8_t a, uint8_t b) {
      unsigned u = order == Utf16::Le ? (a | (b << 8)) : ((a << 8) | b);
      if (first) {
        first = false;
        if (order == Utf16::Bom && u == 0xFFFE) {
          order = Utf16::Le;
          return;
        }
        if (order == Utf16::Bom) order = Utf16::Be;
        if (u == 0xFEFF) return;
      }
      if (u < 0x80) {
        out.push_back(static_cast<uint8_t>(u));
      } else if (u < 0x800) {
        out.push_back(static_cast<uint8_t>(0xC0 | (u >> 6)));
        out.push_back(static_cast<uint8_t>(0x80 | (u & 0x3F)));
      } else {
        out.push_back(static_cast<uint8_t>(0xE0 | (u >> 12)));
        out.push_back(static_cast<uint8_t>(0x80 | ((u >> 6) & 0x3F)));
        out.push_back(static_cast<uint8_t>(0x80 | (u & 0x3F)));
      }
    };
    if (hasOdd && n) {
      unit(odd, p[0]);
      hasOdd = false;
      i = 1;
    }
    for (; i + 1 < n; i += 2) unit(p[i], p[i + 1]);
    if (i < n) {
      odd = p[i];
      hasOdd = true;
    }
  }
};

// UTF-16 out: the library's UTF-8 back to units.
struct Utf16Writer {
  Utf16 order;
  bool first = true;
  std::vector<uint8_t> carry;
  void feed(const uint8_t *p, size_t n, std::vector<uint8_t> &out) {
    out.clear();
    if (first) {
      first = false;
      if (order == Utf16::Bom) {
        out.push_back(0xFF);
        out.push_back(0xFE);
        order = Utf16::Le;
      }
    }
    carry.insert(carry.end(), p, p + n);
    size_t i = 0;
    while (i < carry.size()) {
      uint8_t b = carry[i];
      size_t len = b < 0xC0 ? 1 : b > 0xDF ? 3 : 2;
      if (i + len > carry.size()) break;
      unsigned u = len == 1 ? b : len == 2 ? ((b & 0x1F) << 6) | (carry[i + 1] & 0x3F)
                                           : ((b & 0x0F) << 12) | ((carry[i + 1] & 0x3F) << 6) | (carry[i + 2] & 0x3F);
      if (len == 1 && b >= 0x80) u = 0xFFFD;
      if (order == Utf16::Le) {
        out.push_back(static_cast<uint8_t>(u));
        out.push_back(static_cast<uint8_t>(u >> 8));
      } else {
        out.push_back(static_cast<uint8_t>(u >> 8));
        out.push_back(static_cast<uint8_t>(u));
      }
      i += len;
    }
    carry.erase(carry.begin(), carry.begin() + static_cast<long>(i));
  }
};

class Converter {
 public:
  Converter(Side &from, Side &to) : from_(from), to_(to), in16_{from.utf16, true, 0, false}, out16_{to.utf16, true, {}} {
    h_ = VLOpenConversion(&to.locale, &from.locale);
    out_.resize(kChunk * 4 + 16);
  }
  ~Converter() {
    if (h_) VLCloseConversion(h_);
  }
  bool ok() const { return h_ != nullptr; }

  // Converts one chunk; false on a write error.
  bool feed(const uint8_t *p, size_t n) {
    if (from_.utf16 != Utf16::No) {
      in16_.feed(p, n, wide_);
      p = wide_.data();
      n = wide_.size();
    }
    const unsigned char *in = p;
    uint32_t inLeft = static_cast<uint32_t>(n);
    for (;;) {
      unsigned char *o = out_.data();
      uint32_t outLeft = static_cast<uint32_t>(out_.size());
      last_ = VLConvertBuffer(h_, &o, &outLeft, &in, &inLeft, 0);
      if (!emit(out_.data(), static_cast<size_t>(o - out_.data()))) return false;
      if (last_ != VL_RC_CNV_FULL) break;
    }
    return true;
  }
  // True when the input ended on a character boundary.
  bool complete() const { return last_ != VL_RC_CNV_PARTIAL && !(from_.utf16 != Utf16::No && in16_.hasOdd); }
  // The engine leaves a double-byte run open for the next call; the end of a file closes it.
  bool finish() {
    if (!h_->targetState || !(to_.locale.flags & VL_LF_SHIFT)) return true;
    uint8_t si = vl::cp::shiftIn(to_.locale.codePage);
    h_->targetState = 0;
    return emit(&si, 1);
  }
  // Input bytes of the character left incomplete.
  unsigned held() const {
    if (from_.utf16 != Utf16::No) return in16_.hasOdd ? 1u : 0u;
    return h_->pendingInCount;
  }

 private:
  bool emit(const uint8_t *p, size_t n) {
    if (to_.utf16 != Utf16::No) {
      out16_.feed(p, n, narrow_);
      p = narrow_.data();
      n = narrow_.size();
    }
    return std::fwrite(p, 1, n, stdout) == n;
  }

  Side &from_, &to_;
  VLConversion *h_ = nullptr;
  uint32_t last_ = 0;
  Utf16Reader in16_;
  Utf16Writer out16_;
  std::vector<uint8_t> out_, wide_, narrow_;
};

// Converts one input; the status iconv would give.
int convertFile(Side &from, Side &to, const char *path) {
  Input in("convert", path);
  if (!in.f) return 1;
  FILE *f = in.f;
  const char *shown = in.shown;
  Converter c(from, to);
  if (!c.ok()) {
    std::fprintf(stderr, "tlx convert: no memory for the conversion\n");
    return 1;
  }
  std::vector<uint8_t> buf(kChunk);
  uint64_t offset = 0;
  int status = 0;
  for (;;) {
    size_t n = std::fread(buf.data(), 1, buf.size(), f);
    if (n && !c.feed(buf.data(), n)) {
      std::fprintf(stderr, "tlx convert: cannot write output: %s\n", std::strerror(errno));
      status = 1;
      break;
    }
    offset += n;
    if (n < buf.size()) {
      if (std::ferror(f)) {
        std::fprintf(stderr, "tlx convert: cannot read '%s': %s\n", shown, std::strerror(errno));
        status = 1;
      }
      break;
    }
  }
  if (!status && !c.finish()) {
    std::fprintf(stderr, "tlx convert: cannot write output: %s\n", std::strerror(errno));
    status = 1;
  }
  if (!status && !c.complete()) {
    std::fprintf(stderr, "tlx convert: incomplete character or shift sequence at end of '%s' (byte offset %llu)\n",
                 shown, static_cast<unsigned long long>(offset - c.held()));
    status = 1;
  }
  return status;
}

}  // namespace

int cmdConvert(int argc, char **argv) {
  Side from, to;
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
    if (const char *v = value("-f", "--from-code")) {
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
  uint32_t irc = VLInit(defsDir(dir), nullptr, nullptr, 0, 0);
  if (irc != VL_RC_OK && irc != VL_RC_DEFAULTS) {
    std::fprintf(stderr, "tlx convert: the library did not start (rc %u)\n", irc);
    return 1;
  }
  int status = 1;
  if (setUp(from) && setUp(to)) {
    status = 0;
    if (files.empty()) files.push_back(nullptr);
    for (const char *f : files)
      if (convertFile(from, to, f)) status = 1;
  }
  if (std::fflush(stdout)) status = 1;
  VLTerm();
  return status;
}
