// The skeleton's first step, apart so that it can be checked on its own: one remote call
// decoded by its method's plan into argument slots on the caller's stack.
#ifndef CORVANE_REMOTE_UNMARSHAL_H
#define CORVANE_REMOTE_UNMARSHAL_H

#include <stddef.h>
#include <stdint.h>

#include "remote.h"
#include "remote/corvane.h"
#include "remote/wire_plan.h"

namespace corvane {
namespace remote {

// Where one parameter lives during the call.
struct arg_slot {
  union {
    corvane_mbufd desc;
    corvane_mbuf buf;  // an imbuf or ombuf: the caller's buffer with the length word as memLen
    corvane_border_value_info border;
    uint8_t u8;
    int32_t i32;
    uint32_t u32;
    uint64_t u64;
    float f32;
    double f64;
  } v;
  void* data;             // a sequence: the caller's buffer
  int len;                // its length in elements, as the primary input gives it
  const void* copy_from;  // an inrout sequence in two buffers: its input, copied to data before the call
  size_t copy_bytes;
};

// Checks every count and length of the call (failures give 14) and fills one slot per
// parameter: descriptors and scalars copied, buffers as the caller's pointers. Writes
// nothing that the caller can see; an inrout sequence in two buffers is only noted in its
// slot (copy_from) for the copy before the call. *prim_out is set to the primary output.
int unmarshal(const method_plan& plan, uint32_t sc, remote_arg* pra, arg_slot* slots, uint8_t** prim_out);

}  // namespace remote
}  // namespace corvane

#endif
