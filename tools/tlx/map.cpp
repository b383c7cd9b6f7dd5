// tlx map (--lower|--upper|--full-width|--half-width|--digits) [FILE...]: maps text in
// a locale's code page and writes it in the same code page, like tr, in fixed-size chunks.
//
// A chunk ends behind its last line feed, so that no two-character special-casing key is
// split and a shift-sensitive page is in its single-byte state there; a chunk without a
// line feed ends before its last character.
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <vector>

#include "codepage/cpbody.h"
#include "tools/tlx/tlx.h"
#include "veltrin.h"

namespace {

constexpr size_t kChunk = 64 * 1024;
// Worst growth of one byte: a one-byte character becoming two three-byte characters, or
// a shifted character with both shift bytes.
constexpr size_t kGrowth = 6;

void help(FILE *out) {
  std::fprintf(out,
               "usage: tlx map MAPPING [--simple] [--locale NAME] [--dir DIR] [FILE...]\n"
               "  Maps FILEs (or standard input, also for '-') in the code page of the locale and\n"
               "  writes the result in the same code page to standard output. MAPPING is one of\n"
               "  --lower, --upper (with the language's special casing unless --simple),\n"
               "  --full-width, --half-width, --digits (decimal digits of any script to 0-9).\n"
               "  NAME is a locale (language_territory.codepage) or a platform name such as\n"
               "  de_DE.UTF-8; without it the user's locale (VL_LANG, else the platform's).\n"
               "  Exit status: 0 done, 1 unknown locale, unreadable input or an incomplete\n"
               "  character at the end of an input, 2 bad usage.\n");
}

class Mapper {
 public:
  Mapper(VLLocale *l, uint32_t selector) : l_(l), sel_(selector), out_(kChunk * kGrowth + 16) {
    const VLCodePage *cp = l->codePage;
    shift_ = (l->flags & VL_LF_SHIFT) != 0;
    so_ = vl::cp::shiftOut(cp);
    si_ = vl::cp::shiftIn(cp);
    lf_ = vl::cp::body(cp)[vl::cp::kLf];
  }

  // Maps what whole characters buf holds (all of them at the end of the input); returns
  // how many bytes were taken, false on a write error.
  bool feed(const char *buf, size_t n, bool last, size_t *taken) {
    size_t cut = last ? wholeEnd(buf, n) : boundary(buf, n);
    *taken = cut;
    if (!cut) return true;
    // Bring the output into the state the input is in where this piece starts.
    if (shift_ && outState_ != inState_) {
      const char b = static_cast<char>(inState_ ? so_ : si_);
      if (std::fwrite(&b, 1, 1, stdout) != 1) return false;
      outState_ = inState_;
    }
    int32_t m = VLMapStringEx(l_, out_.data(), static_cast<int32_t>(out_.size()), buf, inState_,
                              static_cast<int32_t>(cut), sel_);
    if (m < 0) return false;
    if (shift_) {
      for (int32_t i = 0; i < m; ++i) {
        const auto b = static_cast<uint8_t>(out_[static_cast<size_t>(i)]);
        if (b == so_ || b == si_) outState_ = b == so_;
      }
      inState_ = stateAfter(buf, cut, inState_);
    }
    return std::fwrite(out_.data(), 1, static_cast<size_t>(m), stdout) == static_cast<size_t>(m);
  }

 private:
  size_t step(const char *p, uint32_t state) const {
    const auto b = static_cast<uint8_t>(*p);
    if (!shift_) return (l_->flags & VL_LF_SINGLEBYTE) ? 1 : vl::cp::charLen(l_->codePage, b);
    return b == so_ || b == si_ ? 1 : state ? vl::cp::maxLen(l_->codePage) : 1;
  }
  uint32_t next(uint8_t b, uint32_t state) const {
    if (shift_ && (b == so_ || b == si_)) return b == so_;
    return state;
  }
  uint32_t stateAfter(const char *p, size_t n, uint32_t st) const {
    for (size_t i = 0; i < n; ++i) st = next(static_cast<uint8_t>(p[i]), st);  // shift bytes only
    return st;
  }
  // End of the last whole character.
  size_t wholeEnd(const char *p, size_t n) const {
    size_t pos = 0;
    uint32_t st = inState_;
    while (pos < n) {
      size_t len = step(p + pos, st);
      if (len > n - pos) break;
      st = next(static_cast<uint8_t>(p[pos]), st);
      pos += len;
    }
    return pos;
  }
  // Behind the last line feed of the single-byte state (no special-casing key spans a line
  // end), else at the start of the last whole character.
  size_t boundary(const char *p, size_t n) const {
    size_t pos = 0, lastStart = 0, afterLf = 0;
    uint32_t st = inState_;
    while (pos < n) {
      size_t len = step(p + pos, st);
      if (len > n - pos) break;
      lastStart = pos;
      if (!st && static_cast<uint8_t>(p[pos]) == lf_ && pos + 1 < n) afterLf = pos + 1;
      st = next(static_cast<uint8_t>(p[pos]), st);
      pos += len;
    }
    return afterLf ? afterLf : lastStart;
  }

  VLLocale *l_;
  uint32_t sel_;
  bool shift_ = false;
  uint8_t so_ = 0, si_ = 0, lf_ = 0;
  uint32_t inState_ = 0, outState_ = 0;
  std::vector<char> out_;
};

int mapFile(VLLocale *l, uint32_t selector, const char *path) {
  Input in("map", path);
  if (!in.f) return 1;
  FILE *f = in.f;
  const char *shown = in.shown;
  Mapper m(l, selector);
  std::vector<char> buf(kChunk + 16);
  size_t have = 0;
  uint64_t offset = 0;  // of buf[0] in the input
  int status = 0;
  for (bool eof = false; !eof;) {
    size_t n = std::fread(buf.data() + have, 1, kChunk - have, f);
    if (n < kChunk - have) {
      if (std::ferror(f)) {
        std::fprintf(stderr, "tlx map: cannot read '%s': %s\n", shown, std::strerror(errno));
        status = 1;
        break;
      }
      eof = true;
    }
    have += n;
    size_t taken = 0;
    if (!m.feed(buf.data(), have, eof, &taken)) {
      std::fprintf(stderr, "tlx map: cannot write output: %s\n", std::strerror(errno));
      status = 1;
      break;
    }
    std::memmove(buf.data(), buf.data() + taken, have - taken);
    have -= taken;
    offset += taken;
    if (eof && have) {
      std::fprintf(stderr, "tlx map: incomplete character at end of '%s' (byte offset %llu)\n", shown,
                   static_cast<unsigned long long>(offset));
      status = 1;
    }
  }
  return status;
}

}  // namespace

int cmdMap(int argc, char **argv) {
  const char *name = nullptr, *dir = nullptr;
  uint32_t selector = 0;
  bool simple = false;
  std::vector<const char *> files;
  const struct {
    const char *option;
    uint32_t selector;
  } kMappings[] = {{"--lower", VL_MAP_LOWER},
                   {"--upper", VL_MAP_UPPER},
                   {"--full-width", VL_MAP_FULLWIDTH},
                   {"--half-width", VL_MAP_HALFWIDTH},
                   {"--digits", VL_MAP_DIGITS}};
  for (int i = 1; i < argc; ++i) {
    const char *a = argv[i];
    bool known = false;
    for (const auto &m : kMappings)
      if (!std::strcmp(a, m.option)) {
        if (selector && selector != m.selector) {
          std::fprintf(stderr, "tlx map: give one mapping\n");
          return 2;
        }
        selector = m.selector;
        known = true;
      }
    if (known) continue;
    if (!std::strcmp(a, "--help") || !std::strcmp(a, "-h")) {
      help(stdout);
      return 0;
    } else if (!std::strcmp(a, "--simple")) {
      simple = true;
    } else if (!std::strncmp(a, "--locale=", 9)) {
      name = a + 9;
    } else if (!std::strcmp(a, "--locale") && i + 1 < argc) {
      name = argv[++i];
    } else if (!std::strcmp(a, "--dir") && i + 1 < argc) {
      dir = argv[++i];
    } else if (a[0] == '-' && a[1]) {
      std::fprintf(stderr, "tlx map: unknown option '%s'\n", a);
      help(stderr);
      return 2;
    } else {
      files.push_back(a);
    }
  }
  if (!selector) {
    help(stderr);
    return 2;
  }
  if (simple) {
    if (selector != VL_MAP_LOWER && selector != VL_MAP_UPPER) {
      std::fprintf(stderr, "tlx map: --simple goes with --lower or --upper\n");
      return 2;
    }
    selector |= VL_MAP_NOSPECIAL;
  }
  uint32_t irc = VLInit(defsDir(dir), nullptr, nullptr, 0, 0);
  if (irc != VL_RC_OK && irc != VL_RC_DEFAULTS) {
    std::fprintf(stderr, "tlx map: the library did not start (rc %u)\n", irc);
    return 1;
  }
  uint32_t rc = 0;
  VLLocale *l = name ? VLGetLocale(name, 0, &rc) : VLGetLocale("", VL_LOCALE_USER, &rc);
  if (!l && name) l = VLConvertNativeLocale(name, 0, &rc);
  int status = 1;
  if (!l) {
    std::fprintf(stderr, "tlx map: no locale '%s' (rc %u)\n", name ? name : "(the user's)", rc);
  } else {
    status = 0;
    if (files.empty()) files.push_back(nullptr);
    for (const char *f : files)
      if (mapFile(l, selector, f)) status = 1;
    VLReleaseLocale(l);
  }
  if (std::fflush(stdout)) status = 1;
  VLTerm();
  return status;
}
