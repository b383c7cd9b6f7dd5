// The built-in English / UnitedStates / US-ASCII definitions, as constant bodies in the
// loaded (native byte order) layouts, so the library works with nothing on disk.
#include <array>
#include <bit>
#include <string_view>

#include "codepage/cpbody.h"
#include "frame/frame.h"

namespace {

template <size_t N>
constexpr void put16(std::array<uint8_t, N> &b, size_t at, uint16_t v) {
  if constexpr (std::endian::native == std::endian::little) {
    b[at] = static_cast<uint8_t>(v);
    b[at + 1] = static_cast<uint8_t>(v >> 8);
  } else {
    b[at] = static_cast<uint8_t>(v >> 8);
    b[at + 1] = static_cast<uint8_t>(v);
  }
}
template <size_t N>
constexpr void put32(std::array<uint8_t, N> &b, size_t at, uint32_t v) {
  if constexpr (std::endian::native == std::endian::little) {
    put16(b, at, static_cast<uint16_t>(v));
    put16(b, at + 2, static_cast<uint16_t>(v >> 16));
  } else {
    put16(b, at, static_cast<uint16_t>(v >> 16));
    put16(b, at + 2, static_cast<uint16_t>(v));
  }
}

// Lays out texts (ASCII here) as UTF-16 after a header of words.
template <size_t N>
struct TextBody {
  std::array<uint8_t, N> b{};
  size_t end;
  constexpr explicit TextBody(size_t header) : end(header) {}
  constexpr void text(size_t word, std::string_view s) {
    put16(b, word * 2, static_cast<uint16_t>(end));
    for (char c : s) {
      put16(b, end, static_cast<uint16_t>(c));
      end += 2;
    }
    put16(b, end, 0);
    end += 2;
  }
};

constexpr std::string_view kDays[] = {"Sunday", "Monday", "Tuesday", "Wednesday", "Thursday", "Friday", "Saturday"};
constexpr std::string_view kMonths[] = {"January", "February", "March",     "April",   "May",      "June",
                                        "July",    "August",   "September", "October", "November", "December"};

constexpr size_t kLanguageSize = 1024;
constexpr auto makeLanguage() {
  TextBody<kLanguageSize> t(51 * 2);  // words 0-48, then the two special-case table offsets
  put16(t.b, 0, 1);                   // default territory
  put16(t.b, 2, 1);                   // default code page
  put16(t.b, 4, 0);                   // binary order
  t.text(5, "EN");
  t.text(6, "English");
  for (int d = 0; d < 7; ++d) t.text(7 + d, kDays[d]);
  for (int d = 0; d < 7; ++d) t.text(14 + d, kDays[d].substr(0, 3));
  for (int m = 0; m < 12; ++m) t.text(21 + m, kMonths[m]);
  t.text(33, "");
  for (int m = 0; m < 12; ++m) t.text(34 + m, kMonths[m].substr(0, 3));
  t.text(46, "");
  t.text(47, "AM");
  t.text(48, "PM");
  put16(t.b, 98, static_cast<uint16_t>(t.end));  // both special-case tables empty
  put16(t.b, 100, static_cast<uint16_t>(t.end));
  return t;
}

constexpr size_t kTerritorySize = 256;
constexpr auto makeTerritory() {
  TextBody<kTerritorySize> t(22 * 2);
  const uint16_t punct[] = {'.', ',', ',', '.', ','};
  for (int i = 0; i < 5; ++i) put16(t.b, i * 2, punct[i]);
  put16(t.b, 10, 2);                // numeric precision
  put16(t.b, 12, 2);                // local fraction digits
  put16(t.b, 14, 2);                // international fraction digits
  put16(t.b, 16, 0x0101);           // sign before the amount, both signs
  put16(t.b, 18, 840);              // territory number
  put16(t.b, 20, 0x0A);             // currency symbol precedes positive and negative amounts
  t.text(11, "USA");
  t.text(12, "United States");
  t.text(13, "3;0");
  t.text(14, "3;0");
  t.text(15, "$");
  t.text(16, "USD");
  t.text(17, "");
  t.text(18, "-");
  t.text(19, "%#I:%M:%S %p");
  t.text(20, "%#m/%#d/%y");
  t.text(21, "%A, %B %d, %Y");
  return t;
}

// Type word of an ASCII byte: classification, direction class, width/symbol class.
constexpr uint32_t asciiType(unsigned c) {
  auto in = [c](std::string_view s) { return s.find(static_cast<char>(c)) != std::string_view::npos; };
  bool upper = c >= 'A' && c <= 'Z', lower = c >= 'a' && c <= 'z', digit = c >= '0' && c <= '9';
  bool control = c < 0x20 || c == 0x7F, space = (c >= 0x09 && c <= 0x0D) || c == 0x20;
  bool punct = c > 0x20 && c < 0x7F && !upper && !lower && !digit;
  uint32_t t1 = 0x200;
  if (upper || lower) t1 |= 0x001;
  if (upper) t1 |= 0x002;
  if (lower) t1 |= 0x004;
  if (digit) t1 |= 0x008;
  if (digit || (c >= 'A' && c <= 'F') || (c >= 'a' && c <= 'f')) t1 |= 0x010;
  if (punct) t1 |= 0x020;
  if (space) t1 |= 0x040;
  if (c == 0x09 || c == 0x20) t1 |= 0x080;
  if (control) t1 |= 0x100;
  uint32_t t2;
  if (upper || lower) t2 = 0x002;
  else if (digit) t2 = 0x008;
  else if (in("+-")) t2 = 0x010;
  else if (in("#$%")) t2 = 0x020;
  else if (in(",./:")) t2 = 0x080;
  else if (c == 0x0A || c == 0x0D || (c >= 0x1C && c <= 0x1E)) t2 = 0x100;
  else if (c == 0x09 || c == 0x0B || c == 0x1F) t2 = 0x200;
  else if (c == 0x0C || c == 0x20) t2 = 0x400;
  else if (control) t2 = 0x001;
  else t2 = 0x800;
  uint32_t t3 = 0;
  if (!control) t3 |= 0x040;
  if (in("$+<=>^`|~")) t3 |= 0x008;
  return t1 | (t2 << 10) | (t3 << 22);
}

constexpr auto makeCodePage() {
  namespace cp = vl::cp;
  std::array<uint8_t, cp::kHeader> b{};
  b[cp::kSubst] = 0x1A;
  b[cp::kLf] = 0x0A;
  b[cp::kCr] = 0x0D;
  b[cp::kLs] = 0x0A;
  b[cp::kPs] = 0x0A;
  b[cp::kMaxLen] = 1;
  for (unsigned i = 0; i < 256; ++i) {
    b[cp::kLenTable + i] = 1;
    put16(b, cp::kSbcsUni + 2 * i, i < 0x80 ? static_cast<uint16_t>(i) : 0xFFFD);
    put32(b, cp::kSbcsType + 4 * i, i < 0x80 ? asciiType(i) : 0x400);
    // Only the first row maps: U+0000-U+007F to the same byte; every other row is empty.
    size_t e = cp::kIndex + cp::kIndexSize * i;
    b[e] = 0;
    b[e + 1] = i == 0 ? 0x7F : 0;
    b[e + 2] = i == 0 ? 0 : 1;
    b[e + 3] = i == 0 ? 0x7F : 0;
  }
  put16(b, cp::kFlags, cp::kFlagAscii);
  return b;
}

constexpr auto makeLowTable() {
  std::array<uint8_t, 128> t{};
  for (unsigned i = 0; i < 128; ++i) t[i] = static_cast<uint8_t>(i);
  return t;
}

// Bodies are cut to the length they use.
template <size_t N, size_t M>
constexpr std::array<uint8_t, N> trim(const std::array<uint8_t, M> &b) {
  std::array<uint8_t, N> t{};
  for (size_t i = 0; i < N; ++i) t[i] = b[i];
  return t;
}

alignas(8) constexpr auto kLanguage = trim<makeLanguage().end>(makeLanguage().b);
alignas(8) constexpr auto kTerritory = trim<makeTerritory().end>(makeTerritory().b);
alignas(8) constexpr auto kCodePage = makeCodePage();
alignas(8) constexpr auto kLowTable = makeLowTable();

static_assert(makeLanguage().end <= kLanguageSize && makeTerritory().end <= kTerritorySize);
static_assert(asciiType('A') == 0x10000A13);

}  // namespace

const void *const VLDefaultLanguage = kLanguage.data();
const void *const VLDefaultTerritory = kTerritory.data();
const void *const VLDefaultCodePage = kCodePage.data();
const void *const VLDefCP3 = kLowTable.data();

namespace vl {
// Sizes of the built-in sections, for code that validates or copies bodies.
extern const uint16_t kBuiltinSize[4] = {static_cast<uint16_t>(kLanguage.size()),
                                         static_cast<uint16_t>(kTerritory.size()),
                                         static_cast<uint16_t>(kCodePage.size()),
                                         static_cast<uint16_t>(kLowTable.size())};
}  // namespace vl
