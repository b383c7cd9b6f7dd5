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

/* Comparison: negative, 0 or positive (only the sign is defined). Rejected options give 0
   with lastError 2; a failed allocation for a language with special casing gives 0 with
   lastError 20. A length of -1 (Ex, W, U: any negative) means up to the 0. */
VL_API int32_t VLStrcmp(VLLocale *locale, const char *str1, int32_t len1, const char *str2, int32_t len2,
                        uint32_t options);
VL_API int32_t VLStrcmpEx(VLLocale *locale, const char *str1, VLShiftState state1, int32_t len1, const char *str2,
                          VLShiftState state2, int32_t len2, uint32_t options);
VL_API int32_t VLWcscmp(VLLocale *locale, const VLWChar *str1, int32_t len1, const VLWChar *str2, int32_t len2,
                        uint32_t options);
VL_API int32_t VLStrcmpU(VLLocale *locale, const VLUChar *str1, int32_t len1, const VLUChar *str2, int32_t len2,
                         uint32_t options);
/* len cut back to a character boundary, walking from state over shift bytes. */
VL_API int32_t AdjustLength(VLLocale *locale, const char *str, VLShiftState state, int32_t len);
/* Swaps the two bytes of each 16-bit unit of buffer in place. */
VL_API void VLStrBigEndian(void *buffer, int32_t byteCount);

#ifdef __cplusplus
}
#endif

#endif
