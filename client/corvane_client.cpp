#include "client/corvane_client.h"

#include <cstring>
#include <vector>

namespace corvane {
namespace client {

AEEResult identity(const Image& src, Image& dst) {
  return call<method::identity>(&src.descriptor(), &src.mbuf(), &dst.mbuf());
}

AEEResult boxfilter(const Image& in, int ddepth, int kw, int kh, bool normalize, Image& temp, Image& out) {
  return call<method::boxfilter>(&in.descriptor(), &in.mbuf(), ddepth, kw, kh, uint8_t(normalize), &temp.descriptor(),
                                 &temp.mbuf(), &out.descriptor(), &out.mbuf());
}

AEEResult deinterleave2C(const Image& src, Image& plane0, Image& plane1) {
  return call<method::deinterleave2C>(&src.descriptor(), &src.mbuf(), &plane0.descriptor(), &plane0.mbuf(),
                                      &plane1.mbuf());
}

AEEResult load() { return call<method::load>(); }
AEEResult init(uint32_t power_level) { return call<method::init>(power_level); }
AEEResult setmode(uint32_t power_level) { return call<method::setmode>(power_level); }
AEEResult deinit() { return call<method::deinit>(); }

AEEResult get_kernel_execution_time(bool reset, execution_time& out, int message_capacity) {
  std::vector<char> message(size_t(message_capacity > 0 ? message_capacity : 0) + 1, '\0');
  uint64_t time = 0, cycles = 0;
  const AEEResult r = call<method::get_kernel_execution_time>(&time, &cycles, message.data(), message_capacity,
                                                               uint8_t(reset ? 1 : 0));
  if (r != 0) return r;
  out.time = time;
  out.cycles = cycles;
  out.message.assign(message.data(), strnlen(message.data(), message.size()));
  return 0;
}

AEEResult does_nothing_but_looks_cool() { return call<method::DoesNothing_ButLooksCool>(); }
AEEResult does_nothing_but_looks_cool_pro_edition() { return call<method::DoesNothing_ButLooksCool_ProEdition>(); }

}  // namespace client
}  // namespace corvane
