/* Part of the Veltrin interface; include <veltrin.h>.
   Collation by the locale's sort object: weights, sort keys and comparison. */
#ifndef VELTRIN_VLCOLL_H
#define VELTRIN_VLCOLL_H

#ifdef __cplusplus
extern "C" {
#endif

#define VL_COLL_IGNORECASE  0x80000040u /* without regard to case */
#define VL_COLL_IGNOREWIDTH 0x80000041u /* without regard to case and width */
#define VL_COLL_NOPENDING   0xFFFFu     /* pending unit: none */

/* Weights of one unit: 0 none (ignorable, or its expansion entry is missing), 1 one
   element, 2 two elements. */
VL_API int VLSortGetWeights(const VLObjEntry *sort, VLUChar unit, uint16_t *primary1, uint8_t *secondary1,
                            uint8_t *tertiary1, uint16_t *fourth1, uint16_t *primary2, uint8_t *secondary2,
                            uint8_t *tertiary2, uint16_t *fourth2, uint8_t *cls);
/* 1 when the two units form one element, else 0. */
VL_API int VLSortGetCombination(const VLObjEntry *sort, VLUChar unit1, VLUChar unit2, uint16_t *primary,
                                uint8_t *secondary, uint8_t *tertiary, uint16_t *fourth, uint8_t *cls);

/* The next element of a string, as VLSortGetWeights; 0 also at the end. *pending holds a
   unit read ahead (VL_COLL_NOPENDING for none); start with it so. */
VL_API int VLStrGetNextWeight(VLLocale *locale, const char **str, int32_t *remaining, uint32_t *counter,
                              uint16_t *primary1, uint8_t *secondary1, uint8_t *tertiary1, uint16_t *fourth1,
                              uint16_t *primary2, uint8_t *secondary2, uint8_t *tertiary2, uint16_t *fourth2,
                              uint8_t *cls, uint16_t *pending);
VL_API int VLStrGetNextWeightEx(VLLocale *locale, const char **str, VLShiftState *state, int32_t *remaining,
                                uint32_t *counter, uint16_t *primary1, uint8_t *secondary1, uint8_t *tertiary1,
                                uint16_t *fourth1, uint16_t *primary2, uint8_t *secondary2, uint8_t *tertiary2,
                                uint16_t *fourth2, uint8_t *cls, uint16_t *pending);
VL_API int VLStrGetNextWeightW(VLLocale *locale, const VLWChar **str, int32_t *remaining, uint32_t *counter,
                               uint16_t *primary1, uint8_t *secondary1, uint8_t *tertiary1, uint16_t *fourth1,
                               uint16_t *primary2, uint8_t *secondary2, uint8_t *tertiary2, uint16_t *fourth2,
                               uint8_t *cls, uint16_t *pending);
VL_API int VLStrGetNextWeightU(VLLocale *locale, const VLUChar **str, int32_t *remaining, uint32_t *counter,
                               uint16_t *primary1, uint8_t *secondary1, uint8_t *tertiary1, uint16_t *fourth1,
                               uint16_t *primary2, uint8_t *secondary2, uint8_t *tertiary2, uint16_t *fourth2,
                               uint8_t *cls, uint16_t *pending);

/* Places one element's weights into four level buffers: a weight whose level has its
   forward bit in cls is appended (the mark follows the end), any other is inserted at the
   mark. The fourth level takes (position, weight) pairs. */
VL_API void VLStrInsertWeights(uint16_t primary, uint16_t **primaryMark, uint16_t **primaryEnd, uint8_t secondary,
                               uint8_t **secondaryMark, uint8_t **secondaryEnd, uint8_t tertiary,
                               uint8_t **tertiaryMark, uint8_t **tertiaryEnd, uint16_t fourth,
                               uint16_t **fourthMark, uint16_t **fourthEnd, uint16_t position, uint8_t cls);

/* Sort key of count UTF-16 units: its length (nothing written when it exceeds dstLen),
   or -1 when no work area could be had. The key always starts at dst. */
VL_API int32_t VLStrGenSortKey(VLLocale *locale, unsigned char *dst, int32_t dstLen, const VLUChar *units,
                               int32_t count);

/* Sort keys: options 0, VL_COLL_IGNORECASE or VL_COLL_IGNOREWIDTH. The key length, or -1. */
VL_API int32_t VLStrxfrm(VLLocale *locale, char *dst, int32_t dstLen, const char *src, int32_t srcLen,
                         uint32_t options);
VL_API int32_t VLStrxfrmEx(VLLocale *locale, char *dst, int32_t dstLen, const char *src, VLShiftState srcState,
                           int32_t srcLen, uint32_t options);
VL_API int32_t VLWcsxfrm(VLLocale *locale, char *dst, int32_t dstLen, const VLWChar *src, int32_t srcLen,
                         uint32_t options);
VL_API int32_t VLStrxfrmU(VLLocale *locale, char *dst, int32_t dstLen, const VLUChar *src, int32_t srcLen,
                          uint32_t options);

/* Linguistic comparison: negative, 0 or positive. Options 0, VL_COLL_IGNORECASE or
   VL_COLL_IGNOREWIDTH; bit 0x01 makes trailing blanks (full-width ones too) insignificant
   and clears 0x00200000 (VLWcscoll: 0x00200000 does it). Other words: code 2, result 0.
   A locale that sorts by code compares as VLStrcmp. */
VL_API int VLStrcoll(VLLocale *locale, const char *str1, int32_t len1, const char *str2, int32_t len2,
                     uint32_t options);
VL_API int VLStrcollEx(VLLocale *locale, const char *str1, VLShiftState state1, int32_t len1, const char *str2,
                       VLShiftState state2, int32_t len2, uint32_t options);
VL_API int VLWcscoll(VLLocale *locale, const VLWChar *str1, int32_t len1, const VLWChar *str2, int32_t len2,
                     uint32_t options);
VL_API int VLStrcollU(VLLocale *locale, const VLUChar *str1, int32_t len1, const VLUChar *str2, int32_t len2,
                      uint32_t options);

/* First occurrence of sub in str, or null: exact with options 0; with VL_COLL_IGNORECASE or
   VL_COLL_IGNOREWIDTH (bit 0x01 also allowed) a candidate span of sub's length matches
   when it collates equal to sub. A rejected option word stores 2 and gives null. */
VL_API char *VLStrstr(VLLocale *locale, const char *str, int32_t len, const char *sub, int32_t subLen,
                      uint32_t options);
VL_API char *VLStrstrEx(VLLocale *locale, const char *str, VLShiftState strState, int32_t len, const char *sub,
                        VLShiftState subState, int32_t subLen, uint32_t options);
VL_API VLWChar *VLWcsstr(VLLocale *locale, const VLWChar *str, int32_t len, const VLWChar *sub, int32_t subLen,
                         uint32_t options);
VL_API VLUChar *VLStrstrU(VLLocale *locale, const VLUChar *str, int32_t len, const VLUChar *sub, int32_t subLen,
                          uint32_t options);

#ifdef __cplusplus
}
#endif

#endif
