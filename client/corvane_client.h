// The host client: one small function per built method, each a call through the remote
// entry (client/call.h). A method that lands adds its function here in a line or two:
//
//   AEEResult boxfilter(const Image& in, int ddepth, int kw, int kh, bool normalize, Image& temp, Image& out) {
//     return call<method::boxfilter>(&in.descriptor(), &in.mbuf(), ddepth, kw, kh, uint8_t(normalize),
//                                    &temp.descriptor(), &temp.mbuf(), &out.descriptor(), &out.mbuf());
//   }
#ifndef CORVANE_CLIENT_CORVANE_CLIENT_H
#define CORVANE_CLIENT_CORVANE_CLIENT_H

#include <stdint.h>

#include <string>

#include "client/call.h"
#include "client/image.h"

namespace corvane {
namespace client {

// Copies the bytes that src's rows span (stride * rows) into dst.
AEEResult identity(const Image& src, Image& dst);

// Sum (or mean, if `normalize`) of each kw x kh window of `in` into `out`, with `temp` as
// the ring of row sums: 2 * kh rows of at least one 128-byte pair (SingleHVX) or
// 256-byte pair (DualHVX) per input vector. ddepth: the output's depth code, 0 to 5 for
// 8-bit input, 2 to 5 for 16-bit input.
AEEResult boxfilter(const Image& in, int ddepth, int kw, int kh, bool normalize, Image& temp, Image& out);

// Splits a two-channel image into two planes that share plane0's descriptor.
AEEResult deinterleave2C(const Image& src, Image& plane0, Image& plane1);

AEEResult load();
AEEResult init(uint32_t power_level);
AEEResult setmode(uint32_t power_level);
AEEResult deinit();

struct execution_time {
  uint64_t time = 0;
  uint64_t cycles = 0;
  std::string message;
};
// Reads the kernel timing counters; `message_capacity` bytes are offered for the message.
AEEResult get_kernel_execution_time(bool reset, execution_time& out, int message_capacity = 256);

AEEResult does_nothing_but_looks_cool();
AEEResult does_nothing_but_looks_cool_pro_edition();

}  // namespace client
}  // namespace corvane

#endif
