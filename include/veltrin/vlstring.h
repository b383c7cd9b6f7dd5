/* Part of the Veltrin interface; include <veltrin.h>.
   Copy, concatenation, character search, spans and tokenising. */
#ifndef VELTRIN_VLSTRING_H
#define VELTRIN_VLSTRING_H

#ifdef __cplusplus
extern "C" {
#endif

#define VL_OPT_LAST 0x80000020u /* VLStrchr family: the last occurrence */

/* Copy: count copied (bytes, or characters with VL_OPT_CHARLEN); -1 on bad options. */
VL_API int32_t VLStrcpy(VLLocale *locale, char *dst, int32_t dstLen, const char *src, int32_t srcLen,
                        uint32_t options);
VL_API int32_t VLStrcpyEx(VLLocale *locale, char *dst, VLShiftState dstState, int32_t dstLen, const char *src,
                          VLShiftState srcState, int32_t srcLen, uint32_t options);
VL_API int32_t VLWcscpy(VLLocale *locale, VLWChar *dst, int32_t dstLen, const VLWChar *src, int32_t srcLen);
VL_API int32_t VLStrcpyU(VLLocale *locale, VLUChar *dst, int32_t dstLen, const VLUChar *src, int32_t srcLen);

/* Concatenation: the resulting length of dst; -1 on bad options. */
VL_API int32_t VLStrcat(VLLocale *locale, char *dst, const char *src, int32_t srcLen, uint32_t options);
VL_API int32_t VLStrcatEx(VLLocale *locale, char *dst, VLShiftState dstState, const char *src,
                          VLShiftState srcState, int32_t srcLen, uint32_t options);
VL_API int32_t VLWcscat(VLLocale *locale, VLWChar *dst, const VLWChar *src, int32_t srcLen, uint32_t options);
VL_API int32_t VLStrcatU(VLLocale *locale, VLUChar *dst, const VLUChar *src, int32_t srcLen, uint32_t options);

/* Character search: the match or null. */
VL_API char *VLStrchr(VLLocale *locale, const char *str, int32_t len, const char *chr, uint32_t options);
VL_API char *VLStrchrEx(VLLocale *locale, const char *str, VLShiftState strState, int32_t len, const char *chr,
                        VLShiftState chrState, VLShiftState *foundState, uint32_t options);
VL_API VLWChar *VLWcschr(VLLocale *locale, const VLWChar *str, int32_t len, VLWChar chr, uint32_t options);
VL_API VLUChar *VLStrchrU(VLLocale *locale, const VLUChar *str, int32_t len, VLUChar chr, uint32_t options);

/* Spans: the length of the initial run of characters in (spn) or not in (cspn) set. */
VL_API int32_t VLStrspn(VLLocale *locale, const char *str, int32_t len, const char *set, int32_t setLen,
                        uint32_t options);
VL_API int32_t VLStrcspn(VLLocale *locale, const char *str, int32_t len, const char *set, int32_t setLen,
                         uint32_t options);
VL_API int32_t VLStrspnEx(VLLocale *locale, const char *str, VLShiftState strState, int32_t len,
                          const char *set, VLShiftState setState, int32_t setLen, uint32_t options);
VL_API int32_t VLStrcspnEx(VLLocale *locale, const char *str, VLShiftState strState, int32_t len,
                           const char *set, VLShiftState setState, int32_t setLen, uint32_t options);
VL_API int32_t VLWcsspn(VLLocale *locale, const VLWChar *str, int32_t len, const VLWChar *set, int32_t setLen);
VL_API int32_t VLWcscspn(VLLocale *locale, const VLWChar *str, int32_t len, const VLWChar *set, int32_t setLen);
VL_API int32_t VLStrspnU(VLLocale *locale, const VLUChar *str, int32_t len, const VLUChar *set, int32_t setLen);
VL_API int32_t VLStrcspnU(VLLocale *locale, const VLUChar *str, int32_t len, const VLUChar *set,
                          int32_t setLen);

/* Tokenising: the token or null; *len is what remains from *next, *next the position
   to continue from (null when nothing follows). */
VL_API char *VLStrtok(VLLocale *locale, char *str, int32_t *len, const char *delims, int32_t delimLen,
                      char **next, uint32_t options);
VL_API char *VLStrtokEx(VLLocale *locale, char *str, VLShiftState strState, int32_t *len, const char *delims,
                        VLShiftState delimState, int32_t delimLen, char **next, VLShiftState *tokenState,
                        VLShiftState *nextState, uint32_t options);
VL_API VLWChar *VLWcstok(VLLocale *locale, VLWChar *str, int32_t *len, const VLWChar *delims, int32_t delimLen,
                         VLWChar **next);
VL_API VLUChar *VLStrtokU(VLLocale *locale, VLUChar *str, int32_t *len, const VLUChar *delims, int32_t delimLen,
                          VLUChar **next);

#ifdef __cplusplus
}
#endif

#endif
