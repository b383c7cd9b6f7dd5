/* Part of the Veltrin interface; include <veltrin.h>.
   Case, width and digit mapping: the built-in Unicode tables, the unit mappings and the
   four forms of VLMapString. */
#ifndef VELTRIN_VLMAP_H
#define VELTRIN_VLMAP_H

#ifdef __cplusplus
extern "C" {
#endif

/* Selectors of the VLMapString family. VL_OPT_CHARLEN may be added to the byte form's. */
#define VL_MAP_COPY      0x80000023u
#define VL_MAP_FULLWIDTH 0x80000021u
#define VL_MAP_HALFWIDTH 0x80000022u
#define VL_MAP_LOWER     0x80000024u
#define VL_MAP_UPPER     0x80000025u
#define VL_MAP_NOSPECIAL 0x00002000u /* with VL_MAP_LOWER or VL_MAP_UPPER: simple mapping only */
#define VL_MAP_DIGITS    0x00000010u

/* Each table covers FIRST..LAST; entry i belongs to the unit BASE + i. */
#define VL_UNICODE_LOWER1_BASE 0x0100u
#define VL_UNICODE_LOWER1_FIRST 0x0100u
#define VL_UNICODE_LOWER1_LAST 0x01FEu
#define VL_UNICODE_LOWER2_BASE 0x0200u
#define VL_UNICODE_LOWER2_FIRST 0x0200u
#define VL_UNICODE_LOWER2_LAST 0x0275u
#define VL_UNICODE_LOWER3_BASE 0x0380u
#define VL_UNICODE_LOWER3_FIRST 0x0386u
#define VL_UNICODE_LOWER3_LAST 0x03EEu
#define VL_UNICODE_LOWER4_BASE 0x0400u
#define VL_UNICODE_LOWER4_FIRST 0x0401u
#define VL_UNICODE_LOWER4_LAST 0x04F8u
#define VL_UNICODE_LOWER5_BASE 0x1E00u
#define VL_UNICODE_LOWER5_FIRST 0x1E00u
#define VL_UNICODE_LOWER5_LAST 0x1EF8u
#define VL_UNICODE_LOWER6_BASE 0x1F00u
#define VL_UNICODE_LOWER6_FIRST 0x1F08u
#define VL_UNICODE_LOWER6_LAST 0x1FFCu
#define VL_UNICODE_UPPER1_BASE 0x0100u
#define VL_UNICODE_UPPER1_FIRST 0x0101u
#define VL_UNICODE_UPPER1_LAST 0x01FFu
#define VL_UNICODE_UPPER2_BASE 0x0200u
#define VL_UNICODE_UPPER2_FIRST 0x0200u
#define VL_UNICODE_UPPER2_LAST 0x0292u
#define VL_UNICODE_UPPER3_BASE 0x03A0u
#define VL_UNICODE_UPPER3_FIRST 0x03ACu
#define VL_UNICODE_UPPER3_LAST 0x03F1u
#define VL_UNICODE_UPPER4_BASE 0x0430u
#define VL_UNICODE_UPPER4_FIRST 0x0430u
#define VL_UNICODE_UPPER4_LAST 0x04F9u
#define VL_UNICODE_UPPER5_BASE 0x1E00u
#define VL_UNICODE_UPPER5_FIRST 0x1E01u
#define VL_UNICODE_UPPER5_LAST 0x1EF9u
#define VL_UNICODE_UPPER6_BASE 0x1F00u
#define VL_UNICODE_UPPER6_FIRST 0x1F00u
#define VL_UNICODE_UPPER6_LAST 0x1FF3u
#define VL_UNICODE_H2F1_BASE 0x00A0u
#define VL_UNICODE_H2F1_FIRST 0x00A2u
#define VL_UNICODE_H2F1_LAST 0x00AFu
#define VL_UNICODE_H2F2_BASE 0xFF60u
#define VL_UNICODE_H2F2_FIRST 0xFF61u
#define VL_UNICODE_H2F2_LAST 0xFFEEu
#define VL_UNICODE_F2H1_BASE 0x2500u
#define VL_UNICODE_F2H1_FIRST 0x2502u
#define VL_UNICODE_F2H1_LAST 0x25CBu
#define VL_UNICODE_F2H2_BASE 0x3000u
#define VL_UNICODE_F2H2_FIRST 0x3000u
#define VL_UNICODE_F2H2_LAST 0x30FCu
#define VL_UNICODE_F2H3_BASE 0x3130u
#define VL_UNICODE_F2H3_FIRST 0x3131u
#define VL_UNICODE_F2H3_LAST 0x3164u
#define VL_UNICODE_F2H4_BASE 0xFFE0u
#define VL_UNICODE_F2H4_FIRST 0xFFE0u
#define VL_UNICODE_F2H4_LAST 0xFFE6u

#define VL_UNICODE_TABLE_SIZE(T) (VL_UNICODE_##T##_LAST - VL_UNICODE_##T##_BASE + 1)
VL_API extern const uint16_t VL_UNICODE_Lower1[VL_UNICODE_TABLE_SIZE(LOWER1)];
VL_API extern const uint16_t VL_UNICODE_Lower2[VL_UNICODE_TABLE_SIZE(LOWER2)];
VL_API extern const uint16_t VL_UNICODE_Lower3[VL_UNICODE_TABLE_SIZE(LOWER3)];
VL_API extern const uint16_t VL_UNICODE_Lower4[VL_UNICODE_TABLE_SIZE(LOWER4)];
VL_API extern const uint16_t VL_UNICODE_Lower5[VL_UNICODE_TABLE_SIZE(LOWER5)];
VL_API extern const uint16_t VL_UNICODE_Lower6[VL_UNICODE_TABLE_SIZE(LOWER6)];
VL_API extern const uint16_t VL_UNICODE_Upper1[VL_UNICODE_TABLE_SIZE(UPPER1)];
VL_API extern const uint16_t VL_UNICODE_Upper2[VL_UNICODE_TABLE_SIZE(UPPER2)];
VL_API extern const uint16_t VL_UNICODE_Upper3[VL_UNICODE_TABLE_SIZE(UPPER3)];
VL_API extern const uint16_t VL_UNICODE_Upper4[VL_UNICODE_TABLE_SIZE(UPPER4)];
VL_API extern const uint16_t VL_UNICODE_Upper5[VL_UNICODE_TABLE_SIZE(UPPER5)];
VL_API extern const uint16_t VL_UNICODE_Upper6[VL_UNICODE_TABLE_SIZE(UPPER6)];
VL_API extern const uint16_t VL_UNICODE_H2F1[VL_UNICODE_TABLE_SIZE(H2F1)];
VL_API extern const uint16_t VL_UNICODE_H2F2[VL_UNICODE_TABLE_SIZE(H2F2)];
VL_API extern const uint16_t VL_UNICODE_F2H1[VL_UNICODE_TABLE_SIZE(F2H1)];
VL_API extern const uint16_t VL_UNICODE_F2H2[VL_UNICODE_TABLE_SIZE(F2H2)];
VL_API extern const uint16_t VL_UNICODE_F2H3[VL_UNICODE_TABLE_SIZE(F2H3)];
VL_API extern const uint16_t VL_UNICODE_F2H4[VL_UNICODE_TABLE_SIZE(F2H4)];

/* Every decimal digit of the BMP (superscript and subscript digits too) and the ASCII
   digit it stands for, ascending by the first. */
#define VL_DIGITS_COUNT 390u
VL_API extern const uint16_t VLDigits[VL_DIGITS_COUNT][2];

/* Unit mappings; the unit itself where it has no counterpart. */
VL_API VLUChar VLUnicodeToLower(VLLocale *locale, VLUChar unit);
VL_API VLUChar VLUnicodeToUpper(VLLocale *locale, VLUChar unit);
VL_API VLUChar VLUnicodeToH2F(VLLocale *locale, VLUChar unit);
VL_API VLUChar VLUnicodeToF2H(VLLocale *locale, VLUChar unit);

/* Copies a string while mapping it; the result counts what was written, -1 for a bad
   selector (lastError 2). A negative input length maps the terminating 0 too. */
VL_API int32_t VLMapString(VLLocale *locale, char *out, int32_t outLen, const char *in, int32_t inLen,
                           uint32_t selector);
VL_API int32_t VLMapStringEx(VLLocale *locale, char *out, int32_t outLen, const char *in, VLShiftState state,
                             int32_t inLen, uint32_t selector);
VL_API int32_t VLMapStringW(VLLocale *locale, VLWChar *out, int32_t outLen, const VLWChar *in, int32_t inLen,
                            uint32_t selector);
VL_API int32_t VLMapStringU(VLLocale *locale, VLUChar *out, int32_t outLen, const VLUChar *in, int32_t inLen,
                            uint32_t selector);

#ifdef __cplusplus
}
#endif
#endif
