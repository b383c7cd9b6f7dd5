/* Part of the Veltrin interface; include <veltrin.h>.
   Integers, floating point and currency, written and read by a locale's conventions. */
#ifndef VELTRIN_VLNUM_H
#define VELTRIN_VLNUM_H

#ifdef __cplusplus
extern "C" {
#endif

/* Options of the number members (with VL_OPT_DEFAULTS, VL_OPT_NULLTERM, VL_OPT_CHARLEN). */
#define VL_NUM_DIGITS   0x0010u /* read decimal digits of any script */
#define VL_NUM_MONEY    0x0020u /* read the monetary separators and signs */
#define VL_NUM_INTL     0x0040u /* the international currency symbol and fraction digits */
#define VL_NUM_UNSIGNED 0x0080u /* the 32-bit value is unsigned */

/* Tokens of VLStrGetDigit: 0-35 a digit value, then these; -1 anything else. */
#define VL_TOK_PLUS    40
#define VL_TOK_MINUS   41
#define VL_TOK_GROUP   42
#define VL_TOK_DECIMAL 43
#define VL_TOK_BLANK   44

/* Digit tables for VLStrGetDigit's asciiBased argument. */
#define VL_DIGITS_EBCDIC    0
#define VL_DIGITS_ASCII     1
#define VL_DIGITS_EBCDIC930 2

/* Digit values of bytes, radix up to 36: 0-9, letters 10-35, -1 for the rest. */
VL_API extern const int32_t VLAsciiToNum[256];
VL_API extern const int32_t VLEbcdicToNum[256];
VL_API extern const int32_t VLEbcdic930ToNum[256];

/* Integer to text: units written (characters with VL_OPT_CHARLEN), -1 on bad options. */
VL_API int32_t VLLongToString(VLLocale *locale, int32_t value, char *buffer, int32_t size, uint32_t options);
VL_API int32_t VLLongToStringEx(VLLocale *locale, int32_t value, char *buffer, VLShiftState state, int32_t size,
                                uint32_t options);
VL_API int32_t VLLongToStringU(VLLocale *locale, int32_t value, VLUChar *buffer, int32_t size, uint32_t options);
VL_API int32_t VLLongToStringW(VLLocale *locale, int32_t value, VLWChar *buffer, int32_t size, uint32_t options);

/* Text to integer; a negative length reads up to the terminator. end receives where
   reading stopped. An unsigned result comes back as its 32 bits. */
VL_API int32_t VLStringToLong(VLLocale *locale, const char *string, int32_t length, char **end, int32_t radix,
                              uint32_t options);
VL_API int32_t VLStringToLongEx(VLLocale *locale, const char *string, VLShiftState state, int32_t length,
                                char **end, VLShiftState *endState, int32_t radix, uint32_t options);
VL_API int32_t VLStringToLongU(VLLocale *locale, const VLUChar *string, int32_t length, VLUChar **end,
                               int32_t radix, uint32_t options);
VL_API int32_t VLStringToLongW(VLLocale *locale, const VLWChar *string, int32_t length, VLWChar **end,
                               int32_t radix, uint32_t options);

/* The next size of a grouping text ("3;2;0"); -1 when absent, empty or malformed.
   *next moves past the size and its separator, *remaining (units; negative: up to the
   terminator) goes down; both become 0 at the end of the text. */
VL_API int32_t VLStrGroupingSize(VLLocale *locale, const char *grouping, int32_t *remaining, char **next);
VL_API int32_t VLStrGroupingSizeU(VLLocale *locale, const VLUChar *grouping, int32_t *remaining,
                                  VLUChar **next);
VL_API int32_t VLStrGroupingSizeW(VLLocale *locale, const VLWChar *grouping, int32_t *remaining,
                                  VLWChar **next);

/* Reads one token at *position (at most length units) and moves *position, and *state,
   past it. The signs and separators are 0-terminated texts of the same form (null or
   empty: none). */
VL_API int32_t VLStrGetDigit(VLLocale *locale, char **position, int32_t length, const char *plus,
                             const char *minus, const char *group, const char *decimal, int32_t asciiBased,
                             uint32_t options);
VL_API int32_t VLStrGetDigitEx(VLLocale *locale, char **position, VLShiftState *state, int32_t length,
                               const char *plus, const char *minus, const char *group, const char *decimal,
                               int32_t asciiBased, uint32_t options);
VL_API int32_t VLStrGetDigitU(VLLocale *locale, VLUChar **position, int32_t length, const VLUChar *plus,
                              const VLUChar *minus, const VLUChar *group, const VLUChar *decimal,
                              int32_t asciiBased, uint32_t options);
VL_API int32_t VLStrGetDigitW(VLLocale *locale, VLWChar **position, int32_t length, const VLWChar *plus,
                              const VLWChar *minus, const VLWChar *group, const VLWChar *decimal,
                              int32_t asciiBased, uint32_t options);

/* Floating point to text, cut (not rounded) to the locale's precision. */
VL_API int32_t VLDoubleToString(VLLocale *locale, double value, char *buffer, int32_t size, uint32_t options);
VL_API int32_t VLDoubleToStringEx(VLLocale *locale, double value, char *buffer, VLShiftState state, int32_t size,
                                  uint32_t options);
VL_API int32_t VLDoubleToStringU(VLLocale *locale, double value, VLUChar *buffer, int32_t size, uint32_t options);
VL_API int32_t VLDoubleToStringW(VLLocale *locale, double value, VLWChar *buffer, int32_t size, uint32_t options);

/* Text to floating point; end receives the position after the last accepted token. */
VL_API double VLStringToDouble(VLLocale *locale, const char *string, int32_t length, char **end,
                               uint32_t options);
VL_API double VLStringToDoubleEx(VLLocale *locale, const char *string, VLShiftState state, int32_t length,
                                 char **end, uint32_t options, VLShiftState *endState);
VL_API double VLStringToDoubleU(VLLocale *locale, const VLUChar *string, int32_t length, VLUChar **end,
                                uint32_t options);
VL_API double VLStringToDoubleW(VLLocale *locale, const VLWChar *string, int32_t length, VLWChar **end,
                                uint32_t options);
/* One step of the number reader: the next state, or -1 when the token ends the number. */
VL_API int32_t VLStrDoubleNextState(int32_t state, int32_t token, double *value, int32_t *sign,
                                    int32_t *fractionExponent, int32_t *exponentSign, int32_t *exponent);

/* A monetary amount by the territory's conventions. */
VL_API int32_t VLCurrencyToString(VLLocale *locale, char *buffer, int32_t size, uint32_t options, double amount);
VL_API int32_t VLCurrencyToStringEx(VLLocale *locale, char *buffer, VLShiftState state, int32_t size,
                                    uint32_t options, double amount);
VL_API int32_t VLCurrencyToStringU(VLLocale *locale, VLUChar *buffer, int32_t size, uint32_t options,
                                   double amount);
VL_API int32_t VLCurrencyToStringW(VLLocale *locale, VLWChar *buffer, int32_t size, uint32_t options,
                                   double amount);

#ifdef __cplusplus
}
#endif

#endif
