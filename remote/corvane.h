// The public interface of the library: the records that travel in a remote call and
// one exported function per method, with plain linkage.
#ifndef CORVANE_REMOTE_CORVANE_H
#define CORVANE_REMOTE_CORVANE_H

#include <stdint.h>

#ifndef __cplusplus
#include <stdbool.h>
#endif

typedef int AEEResult;

#if defined(__GNUC__)
#define CORVANE_API __attribute__((visibility("default")))
#else
#define CORVANE_API
#endif

// Where the bytes of an image are.
typedef struct corvane_mbuf {
  unsigned char* mem;
  int memLen;
} corvane_mbuf;

// How an image is laid out: nine int32, 36 bytes on the wire.
typedef struct corvane_mbufd {
  int32_t stride;  // bytes from one row to the next
  int32_t cols;    // pixels in a row, the whole stored width
  int32_t rows;    // rows, the whole stored height
  int32_t channels;
  int32_t depth;   // 0 u8, 1 i8, 2 u16, 3 i16, 4 i32, 5 f32
  int32_t border_left;
  int32_t border_right;
  int32_t border_top;
  int32_t border_bottom;
} corvane_mbufd;

// A constant border value carried by value.
typedef struct corvane_border_value_info {
  unsigned char val[32];
} corvane_border_value_info;

typedef struct corvane_point2f {
  float x;
  float y;
} corvane_point2f;

// A line segment as FastCV reports it.
typedef struct fcvLine {
  corvane_point2f start;
  corvane_point2f end;
} fcvLine;

#ifdef __cplusplus
extern "C" {
#endif

CORVANE_API AEEResult corvane_identity(const corvane_mbufd* desc, const corvane_mbuf* src, corvane_mbuf* dst);

#ifdef __cplusplus
}
#endif
#endif
