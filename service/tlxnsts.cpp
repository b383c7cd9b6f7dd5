// NLS1_TranslateString: one call from any code page number to any other (1200 is UTF-16),
// every character through UTF-16, with counting in characters, termination, padding and
// lenient truncation of trailing spaces.
#include <cstdint>

#include "codepage/convert.h"
#include "store/store.h"
#include "service/service.h"

VL_TRACE_MODULE("tlxnsts");

namespace {

constexpr uint32_t kUtf16 = NLS1_CP_UTF16;
constexpr uint32_t kKnownOptions = NLS1_OPT_CHARLEN | NLS1_OPT_NULLTERM | NLS1_OPT_PAD | NLS1_OPT_LENIENT;
constexpr VLUChar kSpace = 0x0020;

enum class Kind { Utf16, Single, Multi, Shift };

struct Side {
  Kind kind = Kind::Utf16;
  const VLCodePage *cp = nullptr;
  uint8_t so = 0, si = 0;  // shift bytes: into and out of the double-byte state
};

// Bytes of the character that starts with lead; never 0, never more than 4.
unsigned leadLen(const VLCodePage *cp, uint8_t lead) {
  if (vl::cp::isUtf8(cp)) return lead < 0xC0 ? 1u : lead > 0xDF ? 3u : 2u;
  unsigned n = vl::cp::charLen(cp, lead);
  return n < 1 ? 1u : n > 4 ? 4u : n;
}

unsigned dbLen(const VLCodePage *cp) {
  unsigned n = vl::cp::maxLen(cp);
  return n < 1 ? 1u : n > 4 ? 4u : n;
}

VLUChar readUnit(const uint8_t *p) {
  VLUChar u;
  std::memcpy(&u, p, 2);
  return u;
}

// Reads source characters as UTF-16 units; shift bytes switch states and are not output.
struct Reader {
  const Side *side;
  const uint8_t *p, *end;
  bool db = false;

  enum Step { Char, End, Split };

  Step next(VLUChar *u) {
    if (side->kind == Kind::Utf16) {
      if (p == end) return End;
      if (end - p < 2) return Split;
      *u = readUnit(p);
      p += 2;
      return Char;
    }
    const VLCodePage *cp = side->cp;
    if (side->kind == Kind::Shift) {
      while (p < end && (*p == side->so || *p == side->si)) db = *p++ == side->so;
      if (p == end) return End;
      unsigned n = db ? dbLen(cp) : 1u;
      if (static_cast<size_t>(end - p) < n) return Split;
      *u = n == 1 ? vl::cp::sbcsUni(cp, *p) : VLCpMbToUnicode(cp, p);
      p += n;
      return Char;
    }
    if (p == end) return End;
    unsigned n = side->kind == Kind::Single ? 1u : leadLen(cp, *p);
    if (static_cast<size_t>(end - p) < n) return Split;
    *u = n == 1 ? vl::cp::sbcsUni(cp, *p) : VLCpMbToUnicode(cp, p);
    p += n;
    return Char;
  }
};

// Writes UTF-16 units as target characters within a byte capacity (a character count with
// the character option), keeping room for the Shift-In that closes a double-byte run.
struct Writer {
  const Side &side;
  uint8_t *out;
  size_t cap;        // bytes available for characters (SIZE_MAX when counting characters)
  int64_t charCap;   // characters available (INT64_MAX when counting bytes)
  size_t used = 0;
  int64_t chars = 0;
  bool db = false;

  bool put(VLUChar u) {
    if (chars >= charCap) return false;
    if (side.kind == Kind::Utf16) {
      if (cap - used < 2) return false;
      std::memcpy(out + used, &u, 2);
      used += 2;
      ++chars;
      return true;
    }
    unsigned char b[8];
    int n = VLCpUnicodeToChar(side.cp, u, b);
    if (n < 1 || n > 4) {
      b[0] = vl::cp::subst(side.cp);
      n = 1;
    }
    size_t shift = 0, closing = 0;
    if (side.kind == Kind::Shift) {
      shift = (n > 1) != db ? 1 : 0;
      closing = n > 1 ? 1 : 0;
    }
    if (cap - used < static_cast<size_t>(n) + shift + closing) return false;
    if (shift) {
      out[used++] = n > 1 ? side.so : side.si;
      db = n > 1;
    }
    std::memcpy(out + used, b, static_cast<size_t>(n));
    used += static_cast<size_t>(n);
    ++chars;
    return true;
  }

  // Back to the single-byte state (room for this byte was kept by put).
  void close() {
    if (db) out[used++] = side.si;
    db = false;
  }
};

// The bulk of the text through the conversion family's loop: a source prefix so short that
// its output surely fits (every source byte gives at most one character of the target's
// longest length, behind a shift byte) needs no room test per character. The loop of r
// and w takes the rest: the cut character, the last characters before a full output,
// lenient endings.
template <class F>
void withSourceReader(const Side &s, const uint8_t *p, size_t n, bool db, F &&f) {
  namespace cn = vl::cnv;
  switch (s.kind) {
    case Kind::Utf16: {
      cn::U16Reader r(reinterpret_cast<const VLUChar *>(p), n / 2);
      return f(r);
    }
    case Kind::Single: {
      cn::SbReader<cn::TrieUni> r(s.cp, p, n);
      return f(r);
    }
    case Kind::Shift: {
      cn::ShiftReader<cn::TrieUni> r(s.cp, p, n, db);
      return f(r);
    }
    case Kind::Multi:
      if (vl::cp::isUtf8(s.cp)) {
        cn::MbReader<cn::Utf8Len, cn::Utf8Uni> r(s.cp, p, n);
        return f(r);
      }
      cn::MbReader<cn::TableLen, cn::TrieUni> r(s.cp, p, n);
      return f(r);
  }
}

template <class F>
void withTargetWriter(const Side &t, uint8_t *o, size_t n, bool db, F &&f) {
  namespace cn = vl::cnv;
  if (t.kind == Kind::Utf16) {
    cn::U16Writer w(reinterpret_cast<VLUChar *>(o), n / 2);
    return f(w);
  }
  if (t.kind == Kind::Shift) {
    cn::ShiftWriter<cn::IndexEnc> w(t.cp, o, n, db);
    return f(w);
  }
  if (vl::cp::isUtf8(t.cp)) {
    cn::ByteWriter<cn::Utf8Enc> w(t.cp, o, n);
    return f(w);
  }
  cn::ByteWriter<cn::IndexEnc> w(t.cp, o, n);
  f(w);
}

// True when it converted something and more may follow.
bool bulkStep(const Side &source, const Side &target, Reader &r, Writer &w) {
  const size_t closing = target.kind == Kind::Shift ? 1 : 0;
  const size_t per = target.kind == Kind::Utf16 ? 2 : vl::cp::maxLen(target.cp) + closing;
  size_t n = static_cast<size_t>(r.end - r.p);
  if (w.charCap != INT64_MAX) n = std::min(n, static_cast<size_t>(w.charCap - w.chars));
  size_t room = n * per;
  if (w.cap != SIZE_MAX) {
    room = w.cap - w.used - std::min(w.cap - w.used, closing);
    n = std::min(n, room / per);
  }
  // UTF-16 sides are read and written in place, so only where they are aligned.
  auto odd = [](const void *q) { return (reinterpret_cast<uintptr_t>(q) & 1) != 0; };
  if (n < 64 || (source.kind == Kind::Utf16 && odd(r.p)) || (target.kind == Kind::Utf16 && odd(w.out + w.used)))
    return false;
  const uint8_t *from = r.p;
  withSourceReader(source, r.p, n, r.db, [&](auto &fr) {
    withTargetWriter(target, w.out + w.used, room, w.db, [&](auto &fw) {
      size_t chars = 0;
      vl::cnv::Value held = 0;
      vl::cnv::pump(fr, fw, chars, vl::cnv::kNoLimit, held);
      r.p = reinterpret_cast<const uint8_t *>(fr.p);
      r.db = fr.state != 0;
      w.used += static_cast<size_t>(reinterpret_cast<uint8_t *>(fw.o) - reinterpret_cast<uint8_t *>(fw.start));
      w.db = fw.state != 0;
      w.chars += static_cast<int64_t>(chars);
    });
  });
  return r.p != from && r.p != r.end;
}

// Everything from the reader's position on is the space character.
bool onlySpaces(Reader r) {
  VLUChar u;
  Reader::Step s;
  while ((s = r.next(&u)) == Reader::Char)
    if (u != kSpace) return false;
  return s == Reader::End;
}

// Bytes taken by the first n characters of a code page string (n > 0).
size_t charsToBytes(const Side &side, const uint8_t *s, int32_t n) {
  if (side.kind == Kind::Utf16) return static_cast<size_t>(n) * 2;
  if (side.kind == Kind::Single) return static_cast<size_t>(n);
  size_t at = 0;
  bool db = false;
  for (int32_t i = 0; i < n; ++i) {
    if (side.kind == Kind::Shift) {
      while (s[at] == side.so || s[at] == side.si) db = s[at++] == side.so;
      at += db ? dbLen(side.cp) : 1u;
    } else {
      at += leadLen(side.cp, s[at]);
    }
  }
  return at;
}

size_t measure(const Side &side, const uint8_t *s) {
  if (side.kind != Kind::Utf16) return std::strlen(reinterpret_cast<const char *>(s));
  size_t n = 0;
  while (readUnit(s + n)) n += 2;
  return n;
}

// A load reports every unopenable file as 1003; this layer tells a missing one apart.
uint32_t fileCode(VLObjManager *m, uint32_t id, uint32_t lrc) {
  char name[300];
  if (lrc != VL_RC_FILE_IO || !m || !VLGetDataFileName(m->directory, VL_OBJ_CODEPAGE, static_cast<int>(id), name,
                                                       sizeof name))
    return lrc;
  uint32_t orc = 0;
  VLFile *f = VLOpenFile(vlglobals ? vlglobals->fileContext : 0, name, VL_FILE_READ, 1, &orc);
  if (f) VLCloseFile(f, 0);
  return orc == VL_RC_FILE_MISSING ? orc : lrc;
}

// Looks a side up; 0 or the code that fails the call. fileRc receives a load code of a
// code page that was replaced by the built-in one.
uint32_t classify(uint32_t id, Side *side, const char *which, uint32_t *fileRc) {
  if (id == kUtf16) return 0;
  uint32_t lrc = 0;
  VLObjManager *m = vlglobals ? vlglobals->objManager : nullptr;
  VLObjEntry *e = id <= 0xFFFF ? vl::store::objById(m, VL_OBJ_CODEPAGE, static_cast<uint16_t>(id), 0, &lrc) : nullptr;
  lrc = fileCode(m, id, lrc);
  if (!e || !vl::cp::body(e)) {
    VL_ERR("Unable to locate codepage %d", static_cast<int>(id));
    if (lrc == VL_RC_FILE_MISSING) return VL_RC_NOCODEPAGE;
    return lrc ? lrc : VL_RC_NOTFOUND;
  }
  if (lrc && !*fileRc) *fileRc = lrc;
  side->cp = e;
  if (vl::cp::maxLen(e) == 1 && !vl::cp::isUtf8(e)) {
    side->kind = Kind::Single;
    VL_DETAIL("%s codepage %d is single byte", which, static_cast<int>(id));
  } else if (vl::cp::isShift(e)) {
    side->kind = Kind::Shift;
    side->so = vl::cp::shiftOut(e);
    side->si = vl::cp::shiftIn(e);
    VL_DETAIL("%s codepage %d is shift sensitive, Shift-In=%02X, Shift-Out=%02x", which, static_cast<int>(id),
              side->so, side->si);
  } else {
    side->kind = Kind::Multi;
    VL_DETAIL("%s codepage %d is not shift sensitive", which, static_cast<int>(id));
  }
  return 0;
}

}  // namespace

int32_t NLS1_TranslateString(uint32_t targetCodePage, void *outVoid, int32_t outSize, uint32_t sourceCodePage,
                             const void *sourceVoid, int32_t sourceLength, int32_t *count, uint32_t options,
                             uint32_t *rcOut) {
  VL_FLOW("NLS1_TranslateString");
  uint32_t dummy;
  uint32_t *rc = rcOut ? rcOut : &dummy;
  *rc = 0;
  if (count) *count = 0;
  NLS1_PrivateFunction_GetThreadLocale();
  if (!vl::svc::ready()) {
    *rc = VL_RC_OPEN;
    VL_RET(-1);
  }
  auto *out = static_cast<uint8_t *>(outVoid);
  auto *src = static_cast<const uint8_t *>(sourceVoid);

  Side source, target;
  uint32_t fileRc = 0;
  uint32_t code = classify(sourceCodePage, &source, "Source", &fileRc);
  if (!code) code = classify(targetCodePage, &target, "Target", &fileRc);
  if (!code && (options & ~kKnownOptions)) code = VL_RC_BADARG;
  if (!code && outSize < 0) code = VL_RC_BADARG;
  if (!code && outSize > 0 && !out) code = VL_RC_BADARG;
  if (code) {
    *rc = code;
    VL_RET(-1);
  }
  const bool chars = (options & NLS1_OPT_CHARLEN) != 0;
  const bool term = (options & NLS1_OPT_NULLTERM) != 0;
  const bool u16Target = target.kind == Kind::Utf16;
  const size_t unitBytes = u16Target && !chars ? 2 : 1;  // size of the terminator in output units

  // Nothing to read, or nowhere to write.
  const bool empty = !src || sourceLength == 0 ||
                     (sourceLength < 0 && (source.kind == Kind::Utf16 ? readUnit(src) == 0 : *src == 0));
  if (empty || outSize == 0) {
    if (!(term && outSize > 0)) {
      *rc = fileRc;
      VL_RET(0);
    }
    if (static_cast<size_t>(outSize) < unitBytes) {
      *rc = VL_RC_BUFFER;
      VL_RET(-1);
    }
    std::memset(out, 0, u16Target ? 2 : 1);
    if (count) *count = chars ? 1 : 0;
    *rc = fileRc;
    VL_RET(static_cast<int32_t>(chars ? 1 : unitBytes));
  }
  if (u16Target && !chars && outSize < 2) {
    *rc = VL_RC_BUFFER;
    VL_RET(-1);
  }

  bool measured = false;
  size_t srcBytes;
  if (sourceLength < 0) {
    srcBytes = measure(source, src);
    measured = true;
    VL_DETAIL("Source length = %d", static_cast<int>(srcBytes));
  } else if (chars) {
    srcBytes = charsToBytes(source, src, sourceLength);
  } else {
    srcBytes = static_cast<size_t>(sourceLength);
  }

  const size_t reserve = term ? unitBytes : 0;
  Writer w{target, out, SIZE_MAX, INT64_MAX};
  if (chars)
    w.charCap = outSize - static_cast<int64_t>(reserve);
  else
    w.cap = static_cast<size_t>(outSize) - reserve;

  const bool sbIn = source.kind == Kind::Single;
  const bool extOut = target.kind == Kind::Shift;
  if (sbIn)
    VL_DETAIL(extOut ? "Process SingleByte Input, Extended Multi-byte output " : "Process SingleByte Input, Multi-byte output ");
  else
    VL_DETAIL(extOut ? "Process multi-byte Input, Extended Multi-byte output " : "Process Multi-Byte Input, Multi-byte output ");

  Reader r{&source, src, src + srcBytes};
  while (bulkStep(source, target, r, w)) {
  }
  uint32_t result = 0;
  for (;;) {
    Reader before = r;
    VLUChar u;
    Reader::Step s = r.next(&u);
    if (s == Reader::End) break;
    if (s == Reader::Split) {
      r = before;
      break;
    }
    if (!w.put(u)) {
      r = before;
      if (!((options & NLS1_OPT_LENIENT) && onlySpaces(before))) result = VL_RC_BUFFER;
      break;
    }
  }
  w.close();

  if (options & NLS1_OPT_PAD) {
    unsigned char space[4] = {0x20};
    if (!u16Target) space[0] = VLCpUnicodeToCharW(target.cp, kSpace) & 0xFF;
    const size_t step = u16Target ? 2 : 1;
    while (w.chars < w.charCap && w.cap - w.used >= step) {
      if (u16Target)
        std::memcpy(out + w.used, &kSpace, 2);
      else
        out[w.used] = space[0];
      w.used += step;
      ++w.chars;
    }
  }

  const bool allRead = r.p == src + srcBytes;
  const size_t termBytes = u16Target ? 2 : 1;
  bool room = chars ? w.chars < outSize : w.used + termBytes <= static_cast<size_t>(outSize);
  if (term || (measured && allRead && room)) {
    std::memset(out + w.used, 0, termBytes);
    w.used += termBytes;
    ++w.chars;
  }

  if (count) *count = chars ? static_cast<int32_t>(w.chars) : static_cast<int32_t>(r.p - src);
  *rc = result ? result : fileRc;
  VL_RET(chars ? static_cast<int32_t>(w.chars) : static_cast<int32_t>(w.used));
}
