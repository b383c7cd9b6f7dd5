/* Part of the Veltrin interface; include <veltrin.h>. */
#ifndef VELTRIN_VLINFO_H
#define VELTRIN_VLINFO_H

#ifdef __cplusplus
extern "C" {
#endif

/* Information items are numbered 1 to 88; VL_ITEM_LOCALE is the whole locale name. */
#define VL_ITEM_LAST   88
#define VL_ITEM_LOCALE 88

/* Kinds written by VLLocaleGetTextItem. */
#define VL_ITEMKIND_UTF16 1 /* 0-terminated UTF-16 text */
#define VL_ITEMKIND_CP    2 /* code-page text or one code-page byte held by the handle */
#define VL_ITEMKIND_NAME  3 /* NUL-terminated 8-bit (ASCII) name */

/* Room VLLocaleGetLocaleString needs: four names of up to 33 bytes, three separators, NUL. */
#define VL_LOCALE_STRING_SIZE 140

/* Getters: source / option 0x1 takes the territory's defaults instead of the handle's
   values; option 0x4000 makes the byte getters' size count characters. */
VL_API int32_t VLGetLocaleNumInfo(VLLocale *locale, int32_t item, int32_t source);
VL_API int32_t VLGetLocaleTextInfo(VLLocale *locale, int32_t item, char *buffer, int32_t size,
                                   uint32_t options);
VL_API int32_t VLGetLocaleTextInfoW(VLLocale *locale, int32_t item, VLWChar *buffer, int32_t size,
                                    uint32_t options);
VL_API int32_t VLGetLocaleTextInfoU(VLLocale *locale, int32_t item, VLUChar *buffer, int32_t size,
                                    uint32_t options);
VL_API int32_t VLGetLocaleTextInfoEx(VLLocale *locale, int32_t item, char *buffer, VLShiftState state,
                                     int32_t size, uint32_t options);

/* Setters return 1 on success, 0 on failure (the code is in the handle). */
VL_API int VLSetLocaleNumInfo(VLLocale *locale, int32_t item, int32_t value, uint32_t reserved);
VL_API int VLSetLocaleTextInfo(VLLocale *locale, int32_t item, const char *data, int32_t length,
                               uint32_t options);
VL_API int VLSetLocaleTextInfoW(VLLocale *locale, int32_t item, const VLWChar *data, int32_t length,
                                uint32_t options);
VL_API int VLSetLocaleTextInfoU(VLLocale *locale, int32_t item, const VLUChar *data, int32_t length,
                                uint32_t options);
VL_API int VLSetLocaleTextInfoEx(VLLocale *locale, int32_t item, const char *data, VLShiftState state,
                                 int32_t length, uint32_t options);

/* Where an item's text is kept: current nonzero for the handle's values, 0 for the
   territory's. The U member answers with the handle's UTF-16 copies. Null for items
   without a stored text (numbers, item 88, unknown numbers). */
VL_API const void *VLLocaleGetTextItem(VLLocale *locale, int32_t item, int current, int *kind);
VL_API const void *VLLocaleGetTextItemU(VLLocale *locale, int32_t item, int current, int *kind);
/* Writes language_territory.codepage@sort into buffer (VL_LOCALE_STRING_SIZE bytes). */
VL_API char *VLLocaleGetLocaleString(VLLocale *locale, char *buffer);

#ifdef __cplusplus
}
#endif

#endif
