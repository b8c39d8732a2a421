// Calls a method through corvane_skel_invoke the way the transport does, from values
// given per parameter. Freestanding (it runs in both builds): the layout comes from the
// remote layer's wire plan, the buffers from an arena on the platform heap.
#ifndef CORVANE_TESTS_HEXAGON_WIRE_CALL_H
#define CORVANE_TESTS_HEXAGON_WIRE_CALL_H

#include <stddef.h>
#include <stdint.h>

#include "remote.h"
#include "remote/corvane.h"
#include "remote/wire_plan.h"

namespace wire {

// The value of one parameter, in the method's parameter order.
struct arg {
  enum form : uint8_t { none, descriptor, sequence, scalar, border_value } f;
  corvane_mbufd desc;     // descriptor
  int32_t count;          // sequence: elements in the buffer and in the length word
  uint64_t bits;          // scalar: the value's bytes, little-endian
  uint8_t border[32];     // border_value
};

constexpr arg desc(int32_t stride, int32_t cols, int32_t rows, int32_t channels = 1, int32_t depth = 0) {
  return arg{arg::descriptor, corvane_mbufd{stride, cols, rows, channels, depth, 0, 0, 0, 0}, 0, 0, {}};
}
constexpr arg seq(int32_t count) { return arg{arg::sequence, {}, count, 0, {}}; }
constexpr arg u32(uint32_t v) { return arg{arg::scalar, {}, 0, v, {}}; }
constexpr arg i32(int32_t v) { return arg{arg::scalar, {}, 0, static_cast<uint32_t>(v), {}}; }
constexpr arg u8(uint8_t v) { return arg{arg::scalar, {}, 0, v, {}}; }
constexpr arg f32(float v) { return arg{arg::scalar, {}, 0, __builtin_bit_cast(uint32_t, v), {}}; }
constexpr arg f64(double v) { return arg{arg::scalar, {}, 0, __builtin_bit_cast(uint64_t, v), {}}; }

constexpr int kMaxBuffers = 2 + 2 * corvane::remote::kMaxParams;

// One marshalled call: its buffers stay valid until the call object is reset.
struct call {
  int method;
  uint32_t sc;
  int count;  // remote args
  remote_arg pra[kMaxBuffers];
  int in_seq[corvane::remote::kMaxParams];   // per parameter: index into pra of its input buffer, or -1
  int out_seq[corvane::remote::kMaxParams];  // ... of its output buffer, or -1
  int prim_out;                              // index of the primary output, or -1
};

// Fills input sequences with pseudo-random bytes from `seed` and output buffers with
// 0xcd, so that bytes a method leaves alone hash the same on every build.
void marshal(call& c, int method, const arg* args, int nargs, uint64_t seed);
int invoke(call& c);

// The scratch arena that buffers come from; reset between calls.
void reset_arena();

// FNV-1a, 64 bits.
uint64_t fnv1a(uint64_t h, const void* data, size_t n);
constexpr uint64_t kFnvBasis = 0xcbf29ce484222325ull;

}  // namespace wire

#endif
