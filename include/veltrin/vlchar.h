/* Part of the Veltrin interface; include <veltrin.h>.
   Character stepping, measuring, classification and line ends. */
#ifndef VELTRIN_VLCHAR_H
#define VELTRIN_VLCHAR_H

#ifdef __cplusplus
extern "C" {
#endif

/* Classification selectors. */
#define VL_CT_TYPE1 0x80000010u /* bits 0-9 */
#define VL_CT_TYPE2 0x80000011u /* bits 10-21: direction class */
#define VL_CT_TYPE3 0x80000012u /* bits 22-31 */

/* Type 1 bits. */
#define VL_C1_ALPHA  0x001u
#define VL_C1_UPPER  0x002u
#define VL_C1_LOWER  0x004u
#define VL_C1_DIGIT  0x008u
#define VL_C1_XDIGIT 0x010u
#define VL_C1_PUNCT  0x020u
#define VL_C1_SPACE  0x040u
#define VL_C1_BLANK  0x080u
#define VL_C1_CNTRL  0x100u
#define VL_C1_ASCII  0x200u

/* Line-end kinds. */
#define VL_EOL_LF        0x0100u
#define VL_EOL_CRLF      0x0200u
#define VL_EOL_LS        0x0400u
#define VL_EOL_PS        0x0800u
#define VL_EOL_DEFAULT   0x1000u
#define VL_EOL_NOTFOUND  0x80000030u
#define VL_EOL_BADOPTION 0x80000031u

/* Unicode type words, indexed by the unit minus the first unit of each range. */
#define VL_UNICODE_CTYPE1_FIRST 0x0000u
#define VL_UNICODE_CTYPE1_LAST  0x06F9u
#define VL_UNICODE_CTYPE2_FIRST 0x0901u
#define VL_UNICODE_CTYPE2_LAST  0x0EDDu
#define VL_UNICODE_CTYPE3_FIRST 0x10A0u
#define VL_UNICODE_CTYPE3_LAST  0x11F9u
#define VL_UNICODE_CTYPE4_FIRST 0x1E00u
#define VL_UNICODE_CTYPE4_LAST  0x21FFu
#define VL_UNICODE_CTYPE5_FIRST 0x22F2u
#define VL_UNICODE_CTYPE5_LAST  0x27BEu
#define VL_UNICODE_CTYPE6_FIRST 0x3000u
#define VL_UNICODE_CTYPE6_LAST  0x33FEu
#define VL_UNICODE_CTYPE7_FIRST 0xFB00u
#define VL_UNICODE_CTYPE7_LAST  0xFBD2u
#define VL_UNICODE_CTYPE8_FIRST 0xFD3Eu
#define VL_UNICODE_CTYPE8_LAST  0xFFFFu

VL_API extern const uint32_t VL_UNICODE_Ctype1[VL_UNICODE_CTYPE1_LAST - VL_UNICODE_CTYPE1_FIRST + 1];
VL_API extern const uint32_t VL_UNICODE_Ctype2[VL_UNICODE_CTYPE2_LAST - VL_UNICODE_CTYPE2_FIRST + 1];
VL_API extern const uint32_t VL_UNICODE_Ctype3[VL_UNICODE_CTYPE3_LAST - VL_UNICODE_CTYPE3_FIRST + 1];
VL_API extern const uint32_t VL_UNICODE_Ctype4[VL_UNICODE_CTYPE4_LAST - VL_UNICODE_CTYPE4_FIRST + 1];
VL_API extern const uint32_t VL_UNICODE_Ctype5[VL_UNICODE_CTYPE5_LAST - VL_UNICODE_CTYPE5_FIRST + 1];
VL_API extern const uint32_t VL_UNICODE_Ctype6[VL_UNICODE_CTYPE6_LAST - VL_UNICODE_CTYPE6_FIRST + 1];
VL_API extern const uint32_t VL_UNICODE_Ctype7[VL_UNICODE_CTYPE7_LAST - VL_UNICODE_CTYPE7_FIRST + 1];
VL_API extern const uint32_t VL_UNICODE_Ctype8[VL_UNICODE_CTYPE8_LAST - VL_UNICODE_CTYPE8_FIRST + 1];

/* State. */
VL_API void VLInitState(VLLocale *locale, VLShiftState *state);

/* Stepping and measuring. */
VL_API char *VLNextChar(VLLocale *locale, const char *p);
VL_API char *VLNextCharEx(VLLocale *locale, const char *p, VLShiftState state, VLShiftState *stateOut);
VL_API char *VLPrevChar(VLLocale *locale, const char *start, const char *p);
VL_API char *VLPrevCharEx(VLLocale *locale, const char *start, const char *p, VLShiftState state,
                          VLShiftState *stateOut);
VL_API int32_t VLNumChars(VLLocale *locale, const char *s, int32_t length);
VL_API int32_t VLNumCharsEx(VLLocale *locale, const char *s, VLShiftState state, int32_t length);
VL_API int32_t VLByteLength(VLLocale *locale, const char *p);
VL_API int32_t VLByteLengthEx(VLLocale *locale, const char *p, VLShiftState state);
VL_API int32_t VLByteLengthW(VLLocale *locale, VLWChar value);
VL_API char *VLMoveStringPointer(VLLocale *locale, const char *p, int32_t count, uint32_t options);
VL_API char *VLMoveStringPointerEx(VLLocale *locale, const char *p, VLShiftState state, int32_t count,
                                   VLShiftState *stateOut, uint32_t options);

/* One character. */
VL_API VLWChar VLGetChar(VLLocale *locale, const char *p);
VL_API VLWChar VLGetCharEx(VLLocale *locale, const char *p, VLShiftState state);
VL_API int32_t VLPutChar(VLLocale *locale, char *out, VLWChar value);
VL_API int32_t VLPutCharEx(VLLocale *locale, char *out, VLShiftState state, VLWChar value);
VL_API int32_t VLValidChar(VLLocale *locale, const char *p);
VL_API int32_t VLValidCharEx(VLLocale *locale, const char *p, VLShiftState state);

/* Classification. */
VL_API uint32_t VLGetCharType(VLLocale *locale, const char *p, uint32_t selector);
VL_API uint32_t VLGetCharTypeEx(VLLocale *locale, const char *p, VLShiftState state, uint32_t selector);
VL_API uint32_t VLGetCharTypeW(VLLocale *locale, VLWChar value, uint32_t selector);
VL_API uint32_t VLGetCharTypeU(VLLocale *locale, VLUChar unit, uint32_t selector);

/* Line ends: the pointer behind the first line end (null when none or on a bad option). */
VL_API char *VLGetEol(VLLocale *locale, const char *s, int32_t length, uint32_t *kind, int32_t *eolLength,
                      uint32_t options);
VL_API char *VLGetEolEx(VLLocale *locale, const char *s, VLShiftState state, int32_t length, uint32_t *kind,
                        int32_t *eolLength, VLShiftState *stateOut, uint32_t options);
VL_API VLWChar *VLGetEolW(VLLocale *locale, const VLWChar *s, int32_t length, uint32_t *kind,
                          int32_t *eolLength, uint32_t options);
VL_API VLUChar *VLGetEolU(VLLocale *locale, const VLUChar *s, int32_t length, uint32_t *kind,
                          int32_t *eolLength, uint32_t options);
/* Writing line ends: the pointer behind what was written (null on a bad option). */
VL_API char *VLPutEol(VLLocale *locale, char *out, uint32_t options);
VL_API char *VLPutEolEx(VLLocale *locale, char *out, VLShiftState state, VLShiftState *stateOut,
                        uint32_t options);
VL_API VLWChar *VLPutEolW(VLLocale *locale, VLWChar *out, uint32_t options);
VL_API VLUChar *VLPutEolU(VLLocale *locale, VLUChar *out, uint32_t options);

#ifdef __cplusplus
}
#endif

#endif
