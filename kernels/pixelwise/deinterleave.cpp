// The exported channel-split functions. Only the two-channel split is served.
#include "core/dispatch.h"
#include "kernels/pixelwise/deinterleave.h"

namespace {

constexpr size_t kVectorBytes = hvx::mode_vector_bytes<hvx::SingleHVX>;

size_t round_up(size_t n) { return (n + kVectorBytes - 1) / kVectorBytes * kVectorBytes; }

// The split reads the input as whole vectors (its last partial vector too) and stores
// whole vectors into each plane: the pairs from the front, and one vector at the end of
// the plane's whole vectors when the input leaves a tail. Buffers too short for that
// are refused, so that nothing is read or written outside the caller's memory.
bool buffers_cover_the_split(const corvane_mbufd& in_desc, const corvane_mbuf& input, const corvane_mbufd& out_desc,
                             const corvane_mbuf& o0, const corvane_mbuf& o1) {
  if (in_desc.stride < 0 || in_desc.rows < 0 || out_desc.stride < 0 || out_desc.rows < 0) return false;
  const size_t in_bytes = static_cast<size_t>(in_desc.stride) * static_cast<size_t>(in_desc.rows);
  const size_t total = in_bytes / kVectorBytes;
  const bool has_tail = total % 2 == 1 || in_bytes % kVectorBytes != 0;
  const size_t plane_vectors = static_cast<size_t>(out_desc.stride) * static_cast<size_t>(out_desc.rows) / kVectorBytes;
  size_t plane_bytes = total / 2 * kVectorBytes;
  if (has_tail) plane_bytes = nstd::max(plane_bytes, (plane_vectors + 1) * kVectorBytes);
  const auto holds = [](const corvane_mbuf& b, size_t n) { return b.memLen >= 0 && static_cast<size_t>(b.memLen) >= n; };
  return holds(input, round_up(in_bytes)) && holds(o0, plane_bytes) && holds(o1, plane_bytes);
}

}  // namespace

extern "C" {

CORVANE_API AEEResult corvane_deinterleave2C(const corvane_mbufd* input_desc, const corvane_mbuf* input,
                                             const corvane_mbufd* outputs_desc, corvane_mbuf* output0,
                                             corvane_mbuf* output1) {
  if (!hvx::IsInitialized()) return hvx::RESULT_NOT_READY;
  hvx::scoped_reservation reservation = hvx::reserve_all();
  if (!hvx::scoped_reservation::num_reserved<1>()) return hvx::RESULT_NOT_READY;
  const bool known_depth = input_desc->depth >= 0 && input_desc->depth <= 5;
  if (known_depth && !buffers_cover_the_split(*input_desc, *input, *outputs_desc, *output0, *output1))
    return hvx::RESULT_BAD_POINTER;
  gen_in in(input_desc, input);
  GenInOutArray<false, 2> outputs(outputs_desc, output0, output1);
  hvx::single::deinterleave2C(in, outputs);
  return hvx::RESULT_OK;
}

CORVANE_API AEEResult corvane_deinterleave3C(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*,
                                             corvane_mbuf*, corvane_mbuf*, corvane_mbuf*) {
  return hvx::RESULT_UNSUPPORTED;
}

CORVANE_API AEEResult corvane_deinterleave4C(const corvane_mbufd*, const corvane_mbuf*, const corvane_mbufd*,
                                             corvane_mbuf*, corvane_mbuf*, corvane_mbuf*, corvane_mbuf*) {
  return hvx::RESULT_UNSUPPORTED;
}

}  // extern "C"
