/* Veltrin service layer: the NLS1_ interface. Compiles as C11 and as C++. */
#ifndef NLS1_H
#define NLS1_H

#include "veltrin.h"

#ifdef __cplusplus
extern "C" {
#endif

/* A locale id: language id in the low 16 bits, territory id in the high 16 bits (0: not given). */
#define NLS1_LOCALE_ID(language, territory) ((uint32_t)(language) | ((uint32_t)(territory) << 16))

/* NLS1_SetLocale and NLS1_SetLocaleFromNative: the calling thread's handle; with
   NLS1_SET_PROCESS as well, the process default too. */
#define NLS1_SET_THREAD  0x40000000u
#define NLS1_SET_PROCESS 0x80000000u

/* NLS1_TranslateString */
#define NLS1_CP_UTF16       1200u
#define NLS1_OPT_CHARLEN    0x4000u   /* lengths and counts in characters */
#define NLS1_OPT_NULLTERM   0x0008u   /* terminate the output */
#define NLS1_OPT_PAD        0x400000u /* pad the output with spaces */
#define NLS1_OPT_LENIENT    0x800000u /* cutting off only spaces is no error */

/* Process and thread state. */
VL_API int32_t NLS1_PrivateFunction_GetProcessLocale(void);
VL_API VLLocale *NLS1_PrivateFunction_GetThreadLocale(void);

/* Locales by id. */
VL_API VLLocale *NLS1_GetLocale(uint32_t localeId, uint32_t codePageId, uint32_t options, uint32_t *rc);
VL_API uint32_t NLS1_SetLocale(uint32_t localeId, uint32_t codePageId, uint32_t options);

/* Locales by native name. NLS1_SetLocaleFromNative takes the option bits of NLS1_SetLocale;
   NLS1_SetNativeLocale installs for the calling thread and the process at once. */
VL_API uint32_t NLS1_SetLocaleFromNative(const char *native, uint32_t options);
VL_API uint32_t NLS1_SetNativeLocale(const char *native, uint32_t options);
/* Sets the platform locale of the category from a handle (null: the thread's). 0, 37 when
   the locale has no native name, 1 when the platform refuses it. */
VL_API uint32_t NLS1_SetNativeFromLocale(VLLocale *locale, int category);
VL_API VLLocale *NLS1_ConvertNativeLocale(const char *native, uint32_t options, uint32_t *rc);

/* Information items; a null handle means the calling thread's. */
VL_API int32_t NLS1_GetLocaleNumInfo(VLLocale *locale, int32_t item, int32_t source);
VL_API int32_t NLS1_GetLocaleTextInfo(VLLocale *locale, int32_t item, char *buffer, int32_t size,
                                      uint32_t options);
VL_API int32_t NLS1_GetLocaleTextInfoW(VLLocale *locale, int32_t item, VLWChar *buffer, int32_t size,
                                       uint32_t options);
VL_API int32_t NLS1_GetLocaleTextInfoU(VLLocale *locale, int32_t item, VLUChar *buffer, int32_t size,
                                       uint32_t options);
VL_API int32_t NLS1_GetLocaleTextInfoEx(VLLocale *locale, int32_t item, char *buffer, VLShiftState state,
                                        int32_t size, uint32_t options);
VL_API int NLS1_SetLocaleNumInfo(VLLocale *locale, int32_t item, int32_t value, uint32_t reserved);
VL_API int NLS1_SetLocaleTextInfo(VLLocale *locale, int32_t item, const char *data, int32_t length,
                                  uint32_t options);
VL_API int NLS1_SetLocaleTextInfoW(VLLocale *locale, int32_t item, const VLWChar *data, int32_t length,
                                   uint32_t options);
VL_API int NLS1_SetLocaleTextInfoU(VLLocale *locale, int32_t item, const VLUChar *data, int32_t length,
                                   uint32_t options);
VL_API int NLS1_SetLocaleTextInfoEx(VLLocale *locale, int32_t item, const char *data, VLShiftState state,
                                    int32_t length, uint32_t options);

/* Ids and names of definition objects (0 when not found; the code in rc). */
VL_API uint32_t NLS1_GetCodepageId(const char *name, uint32_t *rc);
VL_API uint32_t NLS1_GetLanguageId(const char *name, uint32_t *rc);
VL_API uint32_t NLS1_GetTerritoryId(const char *name, uint32_t *rc);
VL_API uint32_t NLS1_GetSortId(const char *name, uint32_t *rc);
VL_API uint32_t NLS1_GetObjectName(uint32_t id, char *out, int32_t outSize, int type);
VL_API uint32_t NLS1_GetLanguageName(uint32_t localeId, char *out, int32_t outSize);
VL_API uint32_t NLS1_GetTerritoryName(uint32_t localeId, char *out, int32_t outSize);
VL_API uint32_t NLS1_GetCodepageName(uint32_t codePageId, char *out, int32_t outSize);
VL_API uint32_t NLS1_GetSortName(uint32_t sortId, char *out, int32_t outSize);

/* One-call translation between code page numbers (1200: UTF-16 in machine order). Returns
   the bytes written (characters with NLS1_OPT_CHARLEN) or -1; count receives the source
   bytes consumed (characters written with NLS1_OPT_CHARLEN). */
VL_API int32_t NLS1_TranslateString(uint32_t targetCodePage, void *out, int32_t outSize,
                                    uint32_t sourceCodePage, const void *source, int32_t sourceLength,
                                    int32_t *count, uint32_t options, uint32_t *rc);

#ifdef __cplusplus
}
#endif

#endif /* NLS1_H */
