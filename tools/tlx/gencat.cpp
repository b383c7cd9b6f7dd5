// tlx gencat [--locale NAME] [--dir DIR] OUTPUT.cat SOURCE.msg...: compiles message
// sources into a catalog file. The sources are read in the code page of the named locale:
// the syntax characters are found through that code page, multi-byte characters are
// stepped whole and Shift-Out/Shift-In runs are followed, so no trail byte is taken for
// a backslash or a quote.
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <iostream>
#include <iterator>
#include <map>
#include <string>
#include <vector>

#include "codepage/cpbody.h"
#include "tools/tlx/catfile.h"
#include "tools/tlx/tlx.h"
#include "veltrin.h"

namespace {

void help(FILE *out) {
  std::fprintf(out,
               "usage: tlx gencat [--locale NAME] [--dir DIR] OUTPUT.cat SOURCE.msg...\n"
               "  Compiles message sources ($set n, $delset n, $quote c, $ comments, numbered or\n"
               "  symbolic messages, continuation lines, the escapes \\n \\t \\v \\b \\r \\f \\\\ \\ddd)\n"
               "  into a catalog. The sources are in the code page of locale NAME, whose name the\n"
               "  catalog records (default: the default locale). An existing OUTPUT is merged: the\n"
               "  sources replace its messages. A source '-' is standard input.\n"
               "  Exit status: 0 success, 1 a data error (named by file and line), 2 bad usage.\n");
}

// The code page bytes of the syntax characters, and how characters are stepped.
struct Syntax {
  const VLCodePage *cp;
  bool shift, single;
  uint8_t so, si, dbl;
  uint8_t ch[128];  // byte of each ASCII character, 0 when it has no single byte
  explicit Syntax(VLLocale *l) : cp(l->codePage) {
    using namespace vl::cp;
    shift = (l->flags & VL_LF_SHIFT) != 0;
    single = (l->flags & VL_LF_SINGLEBYTE) != 0;
    so = shiftOut(cp);
    si = shiftIn(cp);
    dbl = maxLen(cp) ? maxLen(cp) : 1;
    for (int u = 0; u < 128; ++u) {
      unsigned char b[8];
      ch[u] = VLCpUnicodeToChar(cp, static_cast<VLUChar>(u), b) == 1 ? b[0] : 0;
    }
    ch[0] = 0;
  }
  bool is(uint8_t b, char c) const { return ch[static_cast<unsigned char>(c)] == b && b; }
  int digit(uint8_t b, int base) const {
    for (int d = 0; d < base; ++d)
      if (is(b, static_cast<char>('0' + d))) return d;
    return -1;
  }
  bool blank(uint8_t b) const { return is(b, ' ') || is(b, '\t'); }
  bool letter(uint8_t b) const {
    for (int c = 'A'; c <= 'z'; ++c)
      if ((c <= 'Z' || c >= 'a' || c == '_') && is(b, static_cast<char>(c))) return true;
    return false;
  }
  uint32_t len(uint8_t lead) const {
    if (single || shift) return 1;
    uint8_t n = vl::cp::body(cp)[vl::cp::kLenTable + lead];
    return n ? n : 1;
  }
};

struct Where {
  std::string file;
  long line = 0;
};

class Compiler {
 public:
  Compiler(const Syntax &s, catfile::Catalog &cat) : syn_(s), cat_(cat) {}
  int errors = 0;

  void source(const std::string &name, const std::string &data) {
    where_.file = name;
    where_.line = 0;
    set_ = 1;
    quote_ = 0;
    lines_.clear();
    size_t at = 0;
    while (at < data.size()) {
      size_t end = at;
      uint32_t state = 0;
      // A line feed ends the line even inside a double-byte run: no double-byte
      // character holds one.
      while (end < data.size() && !syn_.is(static_cast<uint8_t>(data[end]), '\n')) {
        const auto b = static_cast<uint8_t>(data[end]);
        if (syn_.shift && (b == syn_.so || b == syn_.si)) state = b == syn_.so, ++end;
        else end += state ? syn_.dbl : syn_.len(b);
      }
      if (end > data.size()) end = data.size();
      lines_.push_back(data.substr(at, end - at));
      at = end + 1;
    }
    for (next_ = 0; next_ < lines_.size();) line(lines_[next_++]);
  }

 private:
  void error(const char *fmt, const std::string &arg = "") {
    std::fprintf(stderr, "tlx gencat: %s:%ld: ", where_.file.c_str(), where_.line);
    std::fprintf(stderr, fmt, arg.c_str());
    std::fputc('\n', stderr);
  }
  uint8_t at(const std::string &s, size_t i) const { return i < s.size() ? static_cast<uint8_t>(s[i]) : 0; }

  // A decimal number at s[i]; false when there is none or it does not fit.
  bool number(const std::string &s, size_t &i, uint32_t *v) {
    uint64_t n = 0;
    size_t start = i;
    for (int d; i < s.size() && (d = syn_.digit(at(s, i), 10)) >= 0; ++i) {
      n = n * 10 + static_cast<uint64_t>(d);
      if (n > 0x7FFFFFFF) return false;
    }
    *v = static_cast<uint32_t>(n);
    return i > start;
  }
  std::string symbol(const std::string &s, size_t &i) {
    std::string name;
    while (i < s.size() && (syn_.letter(at(s, i)) || syn_.digit(at(s, i), 10) >= 0)) name += s[i++];
    return name;
  }
  bool word(const std::string &s, size_t i, const char *w) {
    for (; *w; ++w, ++i)
      if (!syn_.is(at(s, i), *w)) return false;
    return i >= s.size() || syn_.blank(at(s, i));
  }

  void line(const std::string &s) {
    where_.line = static_cast<long>(next_);
    if (s.empty()) return;
    const uint8_t b0 = at(s, 0);
    if (syn_.is(b0, '$')) return directive(s);
    size_t i = 0;
    while (i < s.size() && syn_.blank(at(s, i))) ++i;
    if (i == s.size()) return;  // a blank line
    uint32_t n = 0;
    if (syn_.digit(b0, 10) >= 0) {
      if (!number(s, i, &n)) return ++errors, error("message number out of range");
    } else if (syn_.letter(b0)) {
      // A symbolic name numbers its message one past the highest of the set.
      std::string name = symbol(s, i);
      auto &set = cat_.sets[set_];
      auto known = symbols_[set_].find(name);
      n = known != symbols_[set_].end() ? known->second : set.empty() ? 1 : set.rbegin()->first + 1;
      symbols_[set_][name] = n;
    } else {
      return ++errors, error("malformed line");
    }
    if (i < s.size() && !syn_.blank(at(s, i))) return ++errors, error("malformed message number");
    if (i < s.size()) ++i;  // the one separator
    std::string text = message(s, i);
    if (n == 0) return error("message number 0 ignored");
    add(n, text);
  }

  void add(uint32_t n, const std::string &text) {
    auto &set = cat_.sets[set_];
    auto key = std::make_pair(set_, n);
    auto first = defined_.find(key);
    if (first != defined_.end() && !replaceable_.count(key)) {
      ++errors;
      error("duplicated message number");
      std::fprintf(stderr, "tlx gencat: %s:%ld: this is the first definition\n", first->second.file.c_str(),
                   first->second.line);
      return;
    }
    replaceable_.erase(key);
    defined_[key] = where_;
    set[n] = text;
  }

  void directive(const std::string &s) {
    if (s.size() == 1 || syn_.blank(at(s, 1))) return;  // a comment
    size_t i = 1;
    if (word(s, 1, "set") || word(s, 1, "delset")) {
      const bool del = syn_.is(at(s, 1), 'd');
      i += del ? 6 : 3;
      while (i < s.size() && syn_.blank(at(s, i))) ++i;
      uint32_t n = 0;
      if (!del && syn_.letter(at(s, i))) {  // a symbolic set: one past the last set named
        std::string name = symbol(s, i);
        auto known = setSymbols_.find(name);
        n = known != setSymbols_.end() ? known->second : lastSet_ + 1;
        setSymbols_[name] = n;
      } else if (!number(s, i, &n) || n == 0) {
        return ++errors, error("invalid set number");
      }
      if (!del) {
        set_ = lastSet_ = n;
        cat_.sets[n];
        return;
      }
      cat_.sets.erase(n);
      for (auto it = defined_.begin(); it != defined_.end();)
        it = it->first.first == n ? defined_.erase(it) : std::next(it);
      return;
    }
    if (word(s, 1, "quote")) {
      i = 6;
      while (i < s.size() && syn_.blank(at(s, i))) ++i;
      quote_ = i < s.size() ? at(s, i) : 0;
      return;
    }
    std::string w;
    for (i = 1; i < s.size() && !syn_.blank(at(s, i)); ++i) w += s[i];
    error("unknown directive '%s': line ignored", w);
  }

  // The text of a message from s[i]: escapes resolved, continuation lines joined, a
  // double-byte run left open at the end closed.
  std::string message(std::string s, size_t i) {
    std::string out;
    uint32_t state = 0;
    bool quoted = quote_ && at(s, i) == quote_;
    if (quoted) ++i;
    for (;;) {
      if (i >= s.size()) {
        if (quoted) ++errors, error("unterminated message");
        break;
      }
      const uint8_t b = at(s, i);
      if (syn_.shift && (b == syn_.so || b == syn_.si)) {
        state = b == syn_.so;
        out += s[i++];
        continue;
      }
      if (state) {
        out.append(s, i, syn_.dbl);
        i += syn_.dbl;
        continue;
      }
      if (quote_ && b == quote_) break;  // the closing quote; what follows is ignored
      if (!syn_.is(b, '\\')) {
        uint32_t n = syn_.len(b);
        out.append(s, i, n);
        i += n;
        continue;
      }
      ++i;
      if (i >= s.size()) {  // continued on the next line
        if (next_ >= lines_.size()) break;
        s = lines_[next_++];
        i = 0;
        continue;
      }
      const uint8_t e = at(s, i);
      int d = syn_.digit(e, 8);
      if (d >= 0) {
        unsigned v = 0;
        while (i < s.size() && (d = syn_.digit(at(s, i), 8)) >= 0 && v * 8 + static_cast<unsigned>(d) <= 0xFF)
          v = v * 8 + static_cast<unsigned>(d), ++i;
        out += static_cast<char>(v);
        continue;
      }
      static const char kEsc[] = "n\nt\tv\vb\br\rf\f";
      char c = 0;
      for (const char *p = kEsc; *p; p += 2)
        if (syn_.is(e, p[0])) c = static_cast<char>(syn_.ch[static_cast<unsigned char>(p[1])]);
      if (c) out += c;
      else out.append(s, i, syn_.len(e));  // any other character stands for itself
      i += c ? 1 : syn_.len(e);
    }
    if (state) out += static_cast<char>(syn_.si);
    return out;
  }

  const Syntax &syn_;
  catfile::Catalog &cat_;
  Where where_;
  uint32_t set_ = 1;
  uint8_t quote_ = 0;
  std::vector<std::string> lines_;
  size_t next_ = 0;
  std::map<std::pair<uint32_t, uint32_t>, Where> defined_;
  std::map<std::pair<uint32_t, uint32_t>, bool> replaceable_;
  std::map<uint32_t, std::map<std::string, uint32_t>> symbols_;
  std::map<std::string, uint32_t> setSymbols_;
  uint32_t lastSet_ = 0;

 public:
  // Messages of an existing catalog: the sources may replace them without complaint.
  void existing() {
    for (auto &[set, msgs] : cat_.sets)
      for (auto &m : msgs) replaceable_[{set, m.first}] = true, defined_[{set, m.first}] = Where{};
  }
};

bool readAll(const char *path, std::string *out) {
  if (!std::strcmp(path, "-")) {
    out->assign(std::istreambuf_iterator<char>(std::cin), {});
    return true;
  }
  std::ifstream in(path, std::ios::binary);
  if (!in) return false;
  out->assign(std::istreambuf_iterator<char>(in), {});
  return !in.bad();
}

}  // namespace

int cmdGencat(int argc, char **argv) {
  const char *localeName = "", *dir = nullptr;
  std::vector<const char *> files;
  for (int i = 1; i < argc; ++i) {
    const char *a = argv[i];
    if (!std::strcmp(a, "--help") || !std::strcmp(a, "-h")) return help(stdout), 0;
    if (!std::strcmp(a, "--locale") && i + 1 < argc) localeName = argv[++i];
    else if (!std::strcmp(a, "--dir") && i + 1 < argc) dir = argv[++i];
    else if (a[0] == '-' && a[1] == '-') return help(stderr), 2;
    else files.push_back(a);
  }
  if (files.size() < 2) return help(stderr), 2;
  if (std::strlen(localeName) >= VL_CAT_LOCALENAME) {
    std::fprintf(stderr, "tlx gencat: locale name too long: %s\n", localeName);
    return 2;
  }
  if (VLInit(defsDir(dir), nullptr, nullptr, 0, 0) >= VL_RC_NOMEM) {
    std::fprintf(stderr, "tlx gencat: the library could not start\n");
    return 1;
  }
  uint32_t rc = 0;
  VLLocale *l = VLGetLocale(localeName, *localeName ? 0 : VL_LOCALE_FALLBACK, &rc);
  if (!l || !l->codePage || !l->codePage->section[0]) {
    std::fprintf(stderr, "tlx gencat: unknown locale '%s' (rc %u)\n", localeName, rc);
    VLTerm();
    return 2;
  }
  catfile::Catalog cat;
  cat.locale = localeName;
  int status = 0;
  std::string data, err;
  if (readAll(files[0], &data) && !catfile::parse(data, &cat, &err)) {
    std::fprintf(stderr, "tlx gencat: %s: %s; not overwritten\n", files[0], err.c_str());
    status = 1;
  } else {
    cat.locale = localeName;
    Syntax syn(l);
    Compiler c(syn, cat);
    c.existing();
    for (size_t k = 1; k < files.size(); ++k) {
      if (!readAll(files[k], &data)) {
        std::fprintf(stderr, "tlx gencat: %s: %s\n", files[k], std::strerror(errno));
        status = 1;
        continue;
      }
      c.source(files[k], data);
    }
    if (c.errors) status = 1;
    std::ofstream out(files[0], std::ios::binary | std::ios::trunc);
    std::string bytes = catfile::write(cat);
    if (!out.write(bytes.data(), static_cast<std::streamsize>(bytes.size()))) {
      std::fprintf(stderr, "tlx gencat: %s: cannot write\n", files[0]);
      status = 1;
    }
  }
  VLReleaseLocale(l);
  VLTerm();
  return status;
}
