/* Part of the Veltrin interface; include <veltrin.h>.
   Truncation, lengths and comparison of strings. */
#ifndef VELTRIN_VLCMP_H
#define VELTRIN_VLCMP_H

#ifdef __cplusplus
extern "C" {
#endif

#define VL_TRUNC_BLANKS  0x00800000u /* VLTruncateString: drop trailing blanks */
#define VL_CMP_NOCASE    0x80000040u /* compare without regard to case */
#define VL_CMP_NOWIDTH   0x80000041u /* ... and to width; with VL_TRUNC_BLANKS full-width blanks too */
#define VL_CMP_NOBLANKS  0x00200000u /* ignore trailing blanks of both strings */

/* Truncation: bytes kept including the terminator (characters with VL_OPT_CHARLEN);
   0 when the string already fitted and nothing was to be dropped. */
VL_API int32_t VLTruncateString(VLLocale *locale, char *str, int32_t length, uint32_t options);
VL_API int32_t VLTruncateStringEx(VLLocale *locale, char *str, VLShiftState state, int32_t length,
                                  uint32_t options);
/* Closes a double-byte run at end (and with VL_OPT_NULLTERM writes the 0): bytes written;
   -1 on other options. */
VL_API int32_t VLTerminateStringEx(VLLocale *locale, char *end, VLShiftState state, uint32_t options);
VL_API int32_t VLStrByteLength(VLWChar value);
VL_API int32_t VLWcslen(VLLocale *locale, const VLWChar *str, uint32_t unused);
VL_API int32_t VLStrlenU(VLLocale *locale, const VLUChar *str, uint32_t unused);

#ifdef __cplusplus
}
#endif

#endif
