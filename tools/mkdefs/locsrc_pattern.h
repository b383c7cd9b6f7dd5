// Time and date patterns of the locale sources rewritten into the library's directives.
#pragma once
#include <string>

namespace mkdefs::locsrc {

// The patterns of one LC_TIME category, as the sources write them.
struct TimeFormats {
  std::u32string dFmt, tFmt, dtFmt, tFmtAmPm, dateFmt;
};

// One source pattern in the library's directive set (the table in README); %c, %x,
// %X and %r are replaced by the locale's own patterns, so the result never refers to
// another locale pattern.
std::u32string translatePattern(const std::u32string &src, const TimeFormats &fmts);

// The long date: the date part of date_fmt (else of d_t_fmt, else d_fmt), with full day
// and month names in place of abbreviated ones.
std::u32string longDatePattern(const TimeFormats &fmts);

// The first literal character of a translated pattern, '/' when there is none.
char32_t firstLiteral(const std::u32string &pattern);

}  // namespace mkdefs::locsrc
