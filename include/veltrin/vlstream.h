/* Part of the Veltrin interface; include <veltrin.h>.
   Encoded text streams over a caller's transfer function. */
#ifndef VELTRIN_VLSTREAM_H
#define VELTRIN_VLSTREAM_H

#ifdef __cplusplus
extern "C" {
#endif

/* Return codes of stream operations. */
#define VL_RC_STM_DIRECTION 60u /* read on a write stream or write on a read stream */
#define VL_RC_STM_PARTIAL   61u /* the data ended inside a character */
#define VL_RC_STM_FLUSH     62u /* flush refused; the buffered bytes were discarded */
#define VL_RC_STM_READ      63u /* read failed inside a character; odd byte on a UTF-16 stream */
#define VL_RC_STM_NOBYTE    64u /* no byte where a character was due; misplaced shift byte */
#define VL_RC_STM_REFUSED   65u /* write refused; the character waits in the stream buffer */

/* Open modes. */
#define VL_STREAM_READ  0x80000050u
#define VL_STREAM_WRITE 0x80000051u

/* VLReadString family: remove the line end from the result. */
#define VL_OPT_STRIPEOL 0x8000u

#define VL_STREAM_BUFSIZE 80

/* Moves up to count bytes between the caller's medium and buffer. Returns the bytes
   moved, or -1: no more data (reading) or the bytes cannot be taken now (writing).
   Any other negative value is an error. */
typedef int32_t (*VLTransferFn)(uint32_t handle, void *buffer, int32_t count);

typedef struct VLStream {
  VLTransferFn transfer;
  uint32_t handle;
  uint8_t direction;   /* 0 read, 1 write */
  uint8_t state;       /* shift state of the data last read or written */
  uint8_t bufState;    /* shift state of the first buffered character (reading) */
  uint16_t count;      /* bytes held in buffer */
  uint8_t buffer[VL_STREAM_BUFSIZE];
} VLStream;

VL_API VLStream *VLOpenStream(VLLocale *locale, VLTransferFn transfer, uint32_t handle, uint32_t mode);
VL_API int VLCloseStream(VLStream *stream, VLLocale *locale);
VL_API int VLFlushStream(VLStream *stream, VLLocale *locale);

/* One character: a W value, or (VLWChar)-1 at the end or on an error. */
VL_API VLWChar VLReadCharW(VLStream *stream, VLLocale *locale);
/* One UTF-16 unit from a UTF-16 stream, or 0xFFFF at the end or on an error. */
VL_API VLUChar VLReadCharU(VLStream *stream, VLLocale *locale);

/* A line or a run of characters: bytes stored (characters with VL_OPT_CHARLEN),
   -1 at the end of the stream, -2 on an error. The Ex form writes shift bytes and
   carries the output's shift state in *state (null: starts in state 0). */
VL_API int32_t VLReadString(VLStream *stream, VLLocale *locale, char *out, int32_t size, uint32_t options);
VL_API int32_t VLReadStringEx(VLStream *stream, VLLocale *locale, char *out, VLShiftState *state, int32_t size,
                              uint32_t options);
VL_API int32_t VLReadStringW(VLStream *stream, VLLocale *locale, VLWChar *out, int32_t size, uint32_t options);
VL_API int32_t VLReadStringU(VLStream *stream, VLLocale *locale, VLUChar *out, int32_t size, uint32_t options);

/* Push-back: 1, or 0 (40 buffer full, 60 not a read stream). */
VL_API int VLUngetChar(VLStream *stream, VLLocale *locale, const char *chr);
VL_API int VLUngetCharEx(VLStream *stream, VLLocale *locale, const char *chr, VLShiftState state);
VL_API int VLUngetCharW(VLStream *stream, VLLocale *locale, VLWChar value);
VL_API int VLUngetCharU(VLStream *stream, VLLocale *locale, VLUChar unit);

/* Writing: 1 written, 0 not written now (65 kept for later, 40 no room, 60). */
VL_API int VLWriteChar(VLStream *stream, VLLocale *locale, const char *chr);
VL_API int VLWriteCharEx(VLStream *stream, VLLocale *locale, const char *chr, int doubleByte);
VL_API int VLWriteCharW(VLStream *stream, VLLocale *locale, VLWChar value);
VL_API int VLWriteCharU(VLStream *stream, VLLocale *locale, VLUChar unit);

#ifdef __cplusplus
}
#endif

#endif
