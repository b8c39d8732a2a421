// The exported morphology: one pass (morphOp), or two chained through `tmp`
// (morphologyEx), each a parallel loop in DualHVX.
#include "core/dispatch.h"
#include "kernels/filters/morph.h"

namespace {

// The border value clamped to the element's range, once in every lane of a word; 0 for
// the replicated border.
int32_t clamp(int32_t v, int32_t lo, int32_t hi) { return v < lo ? lo : v > hi ? hi : v; }

int32_t border_word(int depth, int border, int32_t value) {
  if (border != 0) return 0;
  if (depth == 0) return static_cast<int32_t>(static_cast<uint32_t>(clamp(value, 0, 255)) * 0x01010101u);
  const int32_t v = depth == 2 ? clamp(value, 0, 65535) : clamp(value, -32768, 32767);
  return static_cast<int32_t>((static_cast<uint32_t>(v) & 0xffffu) * 0x00010001u);
}

AEEResult pass(gen_in& src, gen_out& dst, int row, int32_t border, int32_t value) {
  const int depth = src.depth();
  return hvx::on_host_isa([&](auto isa) {
    return hvx::morph::run<decltype(isa)::value>(src, dst, row, border, border_word(depth, border, value), depth);
  });
}

}  // namespace

extern "C" {

CORVANE_API AEEResult corvane_morphOp(const corvane_mbufd* srcDesc, const corvane_mbuf* src,
                                      const corvane_mbufd* dstDesc, corvane_mbuf* dst, int32_t, int32_t,
                                      int32_t kernelShape, int32_t borderType, int32_t borderValue, uint32_t op) {
  const int row = hvx::morph::routine_row(static_cast<int32_t>(op), kernelShape, borderType, srcDesc->depth);
  if (row < 0) return hvx::RESULT_UNSUPPORTED;
  gen_in input(srcDesc, src);
  gen_out output(dstDesc, dst);
  if (!hvx::morph::pass_reach(input, output).fits()) return hvx::RESULT_BAD_POINTER;
  return pass(input, output, row, borderType, borderValue);
}

// Two passes by `op`: open 2 and top hat 5 erode into tmp and dilate tmp; close 3 and
// black hat 6 the other way round; gradient 4 erodes into tmp and dilates src. No
// difference is taken. A pass without a routine is skipped; the answer is 0 but for
// buffers that do not hold what a pass touches.
CORVANE_API AEEResult corvane_morphologyEx(const corvane_mbufd* srcDesc, const corvane_mbuf* src,
                                           const corvane_mbufd* tmpDesc, corvane_mbuf* tmp,
                                           const corvane_mbufd* dstDesc, corvane_mbuf* dst, int32_t, int32_t,
                                           int32_t kernelShape, int32_t borderType, int32_t borderValue, uint32_t op) {
  if (op < 2 || op > 6) return hvx::RESULT_OK;
  const int first_op = op == 3 || op == 6 ? 1 : 0, second_op = 1 - first_op;
  gen_in input(srcDesc, src), temp_in(tmpDesc, tmp);
  gen_out temp(tmpDesc, tmp), output(dstDesc, dst);
  gen_in& second_src = op == 4 ? input : temp_in;
  const int first = hvx::morph::routine_row(first_op, kernelShape, borderType, input.depth());
  const int second = hvx::morph::routine_row(second_op, kernelShape, borderType, second_src.depth());
  if ((first >= 0 && !hvx::morph::pass_reach(input, temp).fits()) ||
      (second >= 0 && !hvx::morph::pass_reach(second_src, output).fits()))
    return hvx::RESULT_BAD_POINTER;
  if (first >= 0) pass(input, temp, first, borderType, borderValue);
  if (second >= 0) pass(second_src, output, second, borderType, borderValue);
  return hvx::RESULT_OK;
}

}  // extern "C"
