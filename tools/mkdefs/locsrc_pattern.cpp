// Rewrites strftime-style patterns into the directive set the time formatter accepts:
// %a %A %b %B %c %d %H %I %j %m %M %p %S %U %w %W %x %X %y %Y %% and the "#" modifier
// (no leading zeros). The mapping is documented in README; keep the two in step.
#include "locsrc_pattern.h"

namespace mkdefs::locsrc {
namespace {

const std::u32string kAmPmDefault = U"%I:%M:%S %p";

bool isOneOf(char32_t c, const char32_t *set) {
  for (; *set; ++set)
    if (*set == c) return true;
  return false;
}

void collapseBlanks(std::u32string &s) {
  std::u32string out;
  for (char32_t c : s) {
    if (c == U' ' && (out.empty() || out.back() == U' ')) continue;
    out += c;
  }
  while (!out.empty() && out.back() == U' ') out.pop_back();
  s = std::move(out);
}

std::u32string translate(const std::u32string &src, const TimeFormats &f, int depth) {
  std::u32string out;
  bool dropped = false;
  for (size_t i = 0; i < src.size();) {
    if (src[i] != U'%') {
      out += src[i++];
      continue;
    }
    size_t j = i + 1;
    bool unpadded = false;
    for (; j < src.size() && isOneOf(src[j], U"-_0^#"); ++j) unpadded = unpadded || src[j] == U'-' || src[j] == U'_';
    while (j < src.size() && src[j] >= U'0' && src[j] <= U'9') ++j;
    char32_t mod = 0;
    if (j < src.size() && (src[j] == U'E' || src[j] == U'O')) mod = src[j++];
    if (j >= src.size()) {  // a lone trailing percent sign stays literal
      out += U"%%";
      break;
    }
    char32_t conv = src[j];
    i = j + 1;
    auto sub = [&](const std::u32string &pattern) {
      if (depth < 4) out += translate(pattern, f, depth + 1);
      else dropped = true;
    };
    switch (conv) {
      case U'a': case U'A': case U'b': case U'B': case U'j': case U'p':
      case U'U': case U'w': case U'W': case U'Y':
        out += U'%';
        out += conv;
        break;
      case U'd': case U'H': case U'I': case U'm': case U'M': case U'S':
        out += unpadded ? U"%#" : U"%";
        out += conv;
        break;
      case U'y': out += mod == U'E' ? U"%Y" : U"%y"; break;
      case U'e': out += U"%#d"; break;
      case U'k': out += U"%#H"; break;
      case U'l': out += U"%#I"; break;
      case U'h': out += U"%b"; break;
      case U'P': out += U"%p"; break;
      case U'D': out += U"%m/%d/%y"; break;
      case U'F': out += U"%Y-%m-%d"; break;
      case U'T': out += U"%H:%M:%S"; break;
      case U'R': out += U"%H:%M"; break;
      case U'g': out += U"%y"; break;
      case U'G': out += U"%Y"; break;
      case U'V': out += U"%W"; break;
      case U'u': out += U"%w"; break;
      case U'n': out += U'\n'; break;
      case U't': out += U'\t'; break;
      case U'%': out += U"%%"; break;
      case U'r': sub(f.tFmtAmPm.empty() ? kAmPmDefault : f.tFmtAmPm); break;
      case U'x': sub(f.dFmt); break;
      case U'X': sub(f.tFmt); break;
      case U'c': sub(f.dtFmt); break;
      case U'C':
        // Century followed by the year in century reads as the full year.
        if (mod == 0 && src.compare(i, 2, U"%y") == 0) {
          out += U"%Y";
          i += 2;
        } else {
          dropped = true;
        }
        break;
      default:  // %Z %z %s, era names and anything unknown
        dropped = true;
        break;
    }
  }
  if (dropped) collapseBlanks(out);
  return out;
}

// Splits a translated pattern into directives ("%X", "%#X") and single literal characters.
template <typename F>
void forEachToken(const std::u32string &p, F fn) {
  for (size_t i = 0; i < p.size();) {
    size_t len = 1;
    if (p[i] == U'%' && i + 1 < p.size()) len = (p[i + 1] == U'#' && i + 2 < p.size()) ? 3 : 2;
    fn(p.substr(i, len));
    i += len;
  }
}

bool isDirective(const std::u32string &tok, const char32_t *letters) {
  return tok.size() >= 2 && tok[0] == U'%' && tok[1] != U'%' && isOneOf(tok.back(), letters);
}

const char32_t *kTimeLetters = U"HIMSp";
const char32_t *kDateLetters = U"aAbBdjmUwWyY";

// Keeps the blank-separated words without time directives; a word that starts with date
// directives and then turns to time ("%d-%H") keeps its date part.
std::u32string dateOnly(const std::u32string &pattern) {
  std::u32string out, word;
  auto flushWord = [&] {
    std::u32string kept;
    bool date = false;
    bool time = false;
    forEachToken(word, [&](const std::u32string &tok) {
      if (time) return;
      if (isDirective(tok, kTimeLetters)) {
        time = true;
        return;
      }
      date = date || isDirective(tok, kDateLetters);
      kept += tok;
    });
    if (!time || date) {
      if (!out.empty() && !kept.empty()) out += U' ';
      out += kept;
    }
    word.clear();
  };
  forEachToken(pattern, [&](const std::u32string &tok) {
    if (tok == U" ") flushWord();
    else word += tok;
  });
  flushWord();
  return out;
}

bool hasDate(const std::u32string &p) {
  bool found = false;
  forEachToken(p, [&](const std::u32string &tok) { found = found || isDirective(tok, kDateLetters); });
  return found;
}

std::u32string fullNames(const std::u32string &p) {
  std::u32string out;
  forEachToken(p, [&](const std::u32string &tok) {
    if (tok == U"%a") out += U"%A";
    else if (tok == U"%b") out += U"%B";
    else out += tok;
  });
  return out;
}

}  // namespace

std::u32string translatePattern(const std::u32string &src, const TimeFormats &fmts) {
  return translate(src, fmts, 0);
}

std::u32string longDatePattern(const TimeFormats &fmts) {
  for (const std::u32string *src : {&fmts.dateFmt, &fmts.dtFmt}) {
    std::u32string d = dateOnly(translate(*src, fmts, 0));
    // Punctuation that led to the time part goes with it ("%Y, %H:%M" keeps "%Y").
    while (!d.empty() && isOneOf(d.back(), U" ,\u00A0\u2009\u202F")) d.pop_back();
    if (hasDate(d)) return fullNames(d);
  }
  return fullNames(translate(fmts.dFmt, fmts, 0));
}

char32_t firstLiteral(const std::u32string &pattern) {
  char32_t found = 0;
  forEachToken(pattern, [&](const std::u32string &tok) {
    if (found == 0 && tok[0] != U'%' && tok[0] != U' ') found = tok[0];
  });
  return found != 0 ? found : U'/';
}

}  // namespace mkdefs::locsrc
