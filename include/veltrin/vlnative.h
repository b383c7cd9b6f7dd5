/* Part of the Veltrin interface; include <veltrin.h>. */
#ifndef VELTRIN_VLNATIVE_H
#define VELTRIN_VLNATIVE_H

#ifdef __cplusplus
extern "C" {
#endif

#ifdef __cplusplus
}
#endif

#endif
