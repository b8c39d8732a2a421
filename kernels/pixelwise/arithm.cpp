// The exported element-wise functions: the vector ones look their operation up by the
// depths and run it on the pool in SingleHVX; the divisions walk the elements on the
// calling thread.
#include "core/dispatch.h"
#include "core/hvx_modes.h"
#include "kernels/pixelwise/arithm.h"
#include "remote/corvane.h"

namespace {

using namespace hvx::arithm;

// N = the longer input's whole vectors; only the entries of the table are served.
AEEResult vector_op(table_id t, const uint8_t* src1, int src1Len, int d1, const uint8_t* src2, int src2Len, int d2,
                    uint8_t* dst, int dstLen, int d3, int32_t scale = 0) {
  hvx::scoped_reservation reservation = hvx::reserve_all();
  if (hvx::scoped_reservation::query_reserved() == 0) return hvx::RESULT_NOT_READY;
  const int step = d1 > 4 || d2 > 4 || d3 > 4 ? 0 : output_step(t, d1, d2, d3);
  if (step == 0) return hvx::RESULT_UNSUPPORTED;
  const int64_t N = nstd::max(nstd::max(src1Len, src2Len), 0) / 64;
  const corvane_mbuf in1 = hvx::flat_buffer(src1, src1Len), in2 = hvx::flat_buffer(src2, src2Len), out = hvx::flat_buffer(dst, dstLen);
  if (!flat_reach(in1, t == MUL_SCALE ? nullptr : &in2, out, N, step).fits()) return hvx::RESULT_BAD_POINTER;
  hvx::on_host_isa([&](auto isa) {
    constexpr int level = decltype(isa)::value;
    if (t == MUL_SCALE)
      run_scale<level>(src1, scale, dst, static_cast<unsigned>(N), d1, d3);
    else
      run_binary<level>(t, src1, src2, dst, static_cast<unsigned>(N), d1, d2, d3);
  });
  return hvx::RESULT_OK;
}

// Bytes of an element of depth codes 0 to 7: the nibbles of 0x48442211.
constexpr int element_bytes(int depth) { return (0x48442211 >> (4 * depth)) & 0xf; }

// Depth 1 a signed byte, 2 uint16, 3 int16, 4 int32, any other code one unsigned byte.
int64_t get_value(const uint8_t* p, int depth) {
  switch (depth) {
    case 1: return static_cast<int8_t>(*p);
    case 2: {
      uint16_t v;
      __builtin_memcpy(&v, p, sizeof(v));
      return v;
    }
    case 3: {
      int16_t v;
      __builtin_memcpy(&v, p, sizeof(v));
      return v;
    }
    case 4: {
      int32_t v;
      __builtin_memcpy(&v, p, sizeof(v));
      return v;
    }
    default: return *p;
  }
}

int64_t clamp(int64_t v, int64_t lo, int64_t hi) { return v < lo ? lo : v > hi ? hi : v; }

// Clamped to the element's range: int32 -2^31 / -1 comes out as 2^31 - 1.
void set_value(uint8_t* p, int depth, int64_t v) {
  switch (depth) {
    case 1: *p = static_cast<uint8_t>(static_cast<int8_t>(clamp(v, -128, 127))); return;
    case 2: {
      const uint16_t x = static_cast<uint16_t>(clamp(v, 0, 65535));
      __builtin_memcpy(p, &x, sizeof(x));
      return;
    }
    case 3: {
      const int16_t x = static_cast<int16_t>(clamp(v, -32768, 32767));
      __builtin_memcpy(p, &x, sizeof(x));
      return;
    }
    case 4: {
      const int32_t x = static_cast<int32_t>(clamp(v, INT32_MIN, INT32_MAX));
      __builtin_memcpy(p, &x, sizeof(x));
      return;
    }
    default: *p = static_cast<uint8_t>(clamp(v, 0, 255)); return;
  }
}

int64_t quotient(int64_t num, int64_t den) { return den != 0 ? num / den : 0; }

// Walks src1 element by element: src1 / src2, or with `by_scale` scale / src1.
AEEResult divide(bool by_scale, const uint8_t* src1, int src1Len, int d1, const uint8_t* src2, int src2Len, int d2,
                 int32_t scale, uint8_t* dst, int dstLen, int d3) {
  if (src1Len <= 0) return hvx::RESULT_OK;
  if (d1 > 7 || d2 > 7 || d3 > 7) return hvx::RESULT_UNSUPPORTED;
  const int e1 = element_bytes(d1), e2 = element_bytes(d2), e3 = element_bytes(d3);
  const int64_t count = hvx::div_up(src1Len, e1);
  const corvane_mbuf in1 = hvx::flat_buffer(src1, src1Len), in2 = hvx::flat_buffer(src2, src2Len), out = hvx::flat_buffer(dst, dstLen);
  hvx::reach r;
  r.bytes(&in1, count * e1).bytes(&out, count * e3);
  if (!by_scale) r.bytes(&in2, count * e2);
  if (!r.fits()) return hvx::RESULT_BAD_POINTER;
  for (int64_t j = 0; j < count; ++j) {
    const int64_t a = get_value(src1 + j * e1, d1);
    const int64_t q = by_scale ? quotient(scale, a) : quotient(a, get_value(src2 + j * e2, d2));
    set_value(dst + j * e3, d3, q);
  }
  return hvx::RESULT_OK;
}

}  // namespace

extern "C" {

CORVANE_API AEEResult corvane_vadd_mm(const uint8_t* src1, int src1Len, uint8_t src1Depth, const uint8_t* src2,
                                      int src2Len, uint8_t src2Depth, const uint8_t*, int, uint8_t* dst, int dstLen,
                                      uint8_t dstDepth) {
  return vector_op(ADD, src1, src1Len, src1Depth, src2, src2Len, src2Depth, dst, dstLen, dstDepth);
}

CORVANE_API AEEResult corvane_vsub_mm(const uint8_t* src1, int src1Len, uint8_t src1Depth, const uint8_t* src2,
                                      int src2Len, uint8_t src2Depth, const uint8_t*, int, uint8_t* dst, int dstLen,
                                      uint8_t dstDepth) {
  return vector_op(SUB, src1, src1Len, src1Depth, src2, src2Len, src2Depth, dst, dstLen, dstDepth);
}

CORVANE_API AEEResult corvane_vmul_mm(const uint8_t* src1, int src1Len, uint8_t src1Depth, const uint8_t* src2,
                                      int src2Len, uint8_t src2Depth, uint8_t* dst, int dstLen, uint8_t dstDepth) {
  return vector_op(MUL, src1, src1Len, src1Depth, src2, src2Len, src2Depth, dst, dstLen, dstDepth);
}

CORVANE_API AEEResult corvane_vmul_scale(const uint8_t* src, int srcLen, uint8_t srcDepth, int32_t scale, uint8_t* dst,
                                         int dstLen, uint8_t dstDepth) {
  return vector_op(MUL_SCALE, src, srcLen, srcDepth, nullptr, 0, srcDepth, dst, dstLen, dstDepth, scale);
}

CORVANE_API AEEResult corvane_vdiv_mm(const uint8_t* src1, int src1Len, uint8_t src1Depth, const uint8_t* src2,
                                      int src2Len, uint8_t src2Depth, uint8_t* dst, int dstLen, uint8_t dstDepth) {
  return divide(false, src1, src1Len, src1Depth, src2, src2Len, src2Depth, 0, dst, dstLen, dstDepth);
}

CORVANE_API AEEResult corvane_vdiv_scale(int32_t scale, const uint8_t* src, int srcLen, uint8_t srcDepth, uint8_t* dst,
                                         int dstLen, uint8_t dstDepth) {
  return divide(true, src, srcLen, srcDepth, nullptr, 0, srcDepth, scale, dst, dstLen, dstDepth);
}

}  // extern "C"
