/* Part of the Veltrin interface; include <veltrin.h>. */
#ifndef VELTRIN_VLSTRING_H
#define VELTRIN_VLSTRING_H

#ifdef __cplusplus
extern "C" {
#endif

#ifdef __cplusplus
}
#endif

#endif
