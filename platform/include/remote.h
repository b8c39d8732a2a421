// The transport's call record: a buffer argument is a pointer and a byte length,
// and the scalars word packs the buffer counts and the method number.
#ifndef CORVANE_PLATFORM_REMOTE_H
#define CORVANE_PLATFORM_REMOTE_H

#include <stddef.h>
#include <stdint.h>

typedef struct {
  void* pv;
  size_t nLen;
} remote_buf;

typedef union {
  remote_buf buf;
} remote_arg;

#define REMOTE_SCALARS_METHOD_ATTR(sc) (((sc) >> 29) & 0x7)
#define REMOTE_SCALARS_METHOD(sc) (((sc) >> 24) & 0x1f)
#define REMOTE_SCALARS_INBUFS(sc) (((sc) >> 16) & 0xff)
#define REMOTE_SCALARS_OUTBUFS(sc) (((sc) >> 8) & 0xff)
#define REMOTE_SCALARS_INHANDLES(sc) (((sc) >> 4) & 0x0f)
#define REMOTE_SCALARS_OUTHANDLES(sc) ((sc) & 0x0f)

#define REMOTE_SCALARS_MAKEX(attr, method, nin, nout, noin, noout)                    \
  ((((uint32_t)(attr) & 0x7) << 29) | (((uint32_t)(method) & 0x1f) << 24) |            \
   (((uint32_t)(nin) & 0xff) << 16) | (((uint32_t)(nout) & 0xff) << 8) |               \
   (((uint32_t)(noin) & 0x0f) << 4) | ((uint32_t)(noout) & 0x0f))
#define REMOTE_SCALARS_MAKE(method, nin, nout) REMOTE_SCALARS_MAKEX(0, method, nin, nout, 0, 0)

#endif
