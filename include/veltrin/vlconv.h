/* Part of the Veltrin interface; include <veltrin.h>. */
#ifndef VELTRIN_VLCONV_H
#define VELTRIN_VLCONV_H

#ifdef __cplusplus
extern "C" {
#endif

#ifdef __cplusplus
}
#endif

#endif
