/* Part of the Veltrin interface; include <veltrin.h>.
   Times written and read by percent patterns whose names, patterns and digits come from
   a locale: %a %A %b %B %c %d %H %I %j %m %M %p %S %U %w %W %x %X %y %Y %%, and "#"
   before the letter (no leading zeros; %#c and %#x take the long date pattern). */
#ifndef VELTRIN_VLTIME_H
#define VELTRIN_VLTIME_H

#include <time.h>

#ifdef __cplusplus
extern "C" {
#endif

/* Directive tables, indexed by a pattern byte: -1, or 50 + the directive code (0 the
   percent sign, 1 the modifier "#"). ASCII-based pages, code page 930, other EBCDIC. */
#define VL_TM_NONE   (-1)
#define VL_TM_BASE   50
VL_API extern const int32_t VLAsciiTMChar[256];
VL_API extern const int32_t VLEbcdicTMChar[256];
VL_API extern const int32_t VLEbcdic930TMChar[256];

/* Formatting. Result: units written (characters with VL_OPT_CHARLEN in the byte forms),
   -1 on error with the code in the handle. Options: VL_OPT_DEFAULTS (territory
   defaults), VL_OPT_NULLTERM (terminate; counted), VL_OPT_CHARLEN (byte forms). */
VL_API int32_t VLTimeToString(VLLocale *locale, const struct tm *time, char *buffer, int32_t size,
                              const char *pattern, int32_t patternLength, uint32_t options);
VL_API int32_t VLTimeToStringEx(VLLocale *locale, const struct tm *time, char *buffer, VLShiftState state,
                                int32_t size, const char *pattern, VLShiftState patternState,
                                int32_t patternLength, uint32_t options);
VL_API int32_t VLTimeToStringW(VLLocale *locale, const struct tm *time, VLWChar *buffer, int32_t size,
                               const VLWChar *pattern, int32_t patternLength, uint32_t options);
VL_API int32_t VLTimeToStringU(VLLocale *locale, const struct tm *time, VLUChar *buffer, int32_t size,
                               const VLUChar *pattern, int32_t patternLength, uint32_t options);

/* One directive: *patternPosition is at its percent sign and moves past it; *position
   (and *state) move past what was written. 0 or the code. Options: VL_OPT_DEFAULTS. */
VL_API uint32_t VLStrExpandTime(VLLocale *locale, const struct tm *time, char *buffer, int32_t *position,
                                int32_t size, const char *pattern, int32_t *patternPosition,
                                int32_t patternLength, uint32_t options);
VL_API uint32_t VLStrExpandTimeEx(VLLocale *locale, const struct tm *time, char *buffer, int32_t *position,
                                  VLShiftState *state, int32_t size, const char *pattern,
                                  int32_t *patternPosition, int32_t patternLength, uint32_t options);
VL_API uint32_t VLStrExpandTimeW(VLLocale *locale, const struct tm *time, VLWChar *buffer, int32_t *position,
                                 int32_t size, const VLWChar *pattern, int32_t *patternPosition,
                                 int32_t patternLength, uint32_t options);
VL_API uint32_t VLStrExpandTimeU(VLLocale *locale, const struct tm *time, VLUChar *buffer, int32_t *position,
                                 int32_t size, const VLUChar *pattern, int32_t *patternPosition,
                                 int32_t patternLength, uint32_t options);

/* A locale text item appended at *position; source 1 takes the territory default.
   0, or 40 when it was cut (what fitted stays). */
VL_API uint32_t VLStrWriteWord(VLLocale *locale, char *buffer, int32_t *position, int32_t size, int32_t item,
                               int32_t source);
VL_API uint32_t VLStrWriteWordEx(VLLocale *locale, char *buffer, int32_t *position, VLShiftState *state,
                                 int32_t size, int32_t item, int32_t source);
VL_API uint32_t VLStrWriteWordW(VLLocale *locale, VLWChar *buffer, int32_t *position, int32_t size,
                                int32_t item, int32_t source);
VL_API uint32_t VLStrWriteWordU(VLLocale *locale, VLUChar *buffer, int32_t *position, int32_t size,
                                int32_t item, int32_t source);

/* The low `width` (1-10) decimal digits of value, zero-padded unless modifier is set;
   ascii picks "0" (0x30) or the EBCDIC 0xF0 (ignored by the U form). 0, or 40 when the
   digits did not fit or filled the buffer to its end. */
VL_API uint32_t VLStrWriteNumber(VLLocale *locale, char *buffer, int32_t *position, int32_t size, int32_t value,
                                 int32_t width, int ascii, int modifier);
VL_API uint32_t VLStrWriteNumberEx(VLLocale *locale, char *buffer, int32_t *position, VLShiftState *state,
                                   int32_t size, int32_t value, int32_t width, int ascii, int modifier);
VL_API uint32_t VLStrWriteNumberW(VLLocale *locale, VLWChar *buffer, int32_t *position, int32_t size,
                                  int32_t value, int32_t width, int ascii, int modifier);
VL_API uint32_t VLStrWriteNumberU(VLLocale *locale, VLUChar *buffer, int32_t *position, int32_t size,
                                  int32_t value, int32_t width, int ascii, int modifier);

/* Parsing. Result: input units consumed (characters with VL_OPT_CHARLEN in the byte
   forms), -1 on error with the code in the handle. Fields the pattern does not name
   keep their values. Options: VL_OPT_DEFAULTS, VL_OPT_CHARLEN. */
VL_API int32_t VLStringToTime(VLLocale *locale, struct tm *time, const char *input, int32_t inputLength,
                              const char *pattern, int32_t patternLength, uint32_t options);
VL_API int32_t VLStringToTimeEx(VLLocale *locale, struct tm *time, const char *input, VLShiftState inputState,
                                int32_t inputLength, const char *pattern, VLShiftState patternState,
                                int32_t patternLength, uint32_t options);
VL_API int32_t VLStringToTimeW(VLLocale *locale, struct tm *time, const VLWChar *input, int32_t inputLength,
                               const VLWChar *pattern, int32_t patternLength, uint32_t options);
VL_API int32_t VLStringToTimeU(VLLocale *locale, struct tm *time, const VLUChar *input, int32_t inputLength,
                               const VLUChar *pattern, int32_t patternLength, uint32_t options);

/* One directive read: *patternPosition at its percent sign, *position in the input; both
   move on. *afternoon is set when "%p" is read. 0 or the code. */
VL_API uint32_t VLStrExtractTime(VLLocale *locale, struct tm *time, int *afternoon, const char *input,
                                 int32_t *position, int32_t inputLength, const char *pattern,
                                 int32_t *patternPosition, int32_t patternLength, uint32_t options);
VL_API uint32_t VLStrExtractTimeEx(VLLocale *locale, struct tm *time, int *afternoon, const char *input,
                                   int32_t *position, VLShiftState *state, int32_t inputLength,
                                   const char *pattern, int32_t *patternPosition, int32_t patternLength,
                                   uint32_t options);
VL_API uint32_t VLStrExtractTimeW(VLLocale *locale, struct tm *time, int *afternoon, const VLWChar *input,
                                  int32_t *position, int32_t inputLength, const VLWChar *pattern,
                                  int32_t *patternPosition, int32_t patternLength, uint32_t options);
VL_API uint32_t VLStrExtractTimeU(VLLocale *locale, struct tm *time, int *afternoon, const VLUChar *input,
                                  int32_t *position, int32_t inputLength, const VLUChar *pattern,
                                  int32_t *patternPosition, int32_t patternLength, uint32_t options);

/* 1 to `width` digits at *position, at most `maximum`; *error becomes 0 or 37. A null
   state is the single-byte state. */
VL_API int32_t VLStrReadNumber(uint32_t *error, const char *input, int32_t *position, int32_t length,
                               int32_t width, int32_t maximum, int ascii);
VL_API int32_t VLStrReadNumberEx(uint32_t *error, const char *input, int32_t *position, VLShiftState *state,
                                 int32_t length, int32_t width, int32_t maximum, int ascii);
VL_API int32_t VLStrReadNumberW(uint32_t *error, const VLWChar *input, int32_t *position, int32_t length,
                                int32_t width, int32_t maximum, int ascii);
VL_API int32_t VLStrReadNumberU(uint32_t *error, const VLUChar *input, int32_t *position, int32_t length,
                                int32_t width, int32_t maximum, int ascii);

/* The longest of items first .. first + count - 1 found at *position (case-sensitive; the
   first among equals); *index receives its 0-based index. 0 or 37. */
VL_API uint32_t VLStrReadWord(VLLocale *locale, int32_t *index, const char *input, int32_t *position,
                              int32_t length, int32_t first, int32_t count, int32_t source);
VL_API uint32_t VLStrReadWordEx(VLLocale *locale, int32_t *index, const char *input, int32_t *position,
                                VLShiftState *state, int32_t length, int32_t first, int32_t count,
                                int32_t source);
VL_API uint32_t VLStrReadWordW(VLLocale *locale, int32_t *index, const VLWChar *input, int32_t *position,
                               int32_t length, int32_t first, int32_t count, int32_t source);
VL_API uint32_t VLStrReadWordU(VLLocale *locale, int32_t *index, const VLUChar *input, int32_t *position,
                               int32_t length, int32_t first, int32_t count, int32_t source);

#ifdef __cplusplus
}
#endif

#endif
