// The skeleton: decodes one remote call by the method's plan (wire_plan.h), checks every
// buffer length before anything runs, copies descriptors and scalars to its stack, hands
// the exported function the caller's own buffers by pointer, and writes the rout scalars
// to the primary output only after the function succeeded. The unmarshalling is written
// once per parameter kind; the only per-method code is the call itself, generated from the
// method table together with a compile-time check of each exported function's signature.
//
// DSP code: no C++ library, no heap, all state on the stack of the call.
#include <stddef.h>
#include <stdint.h>

#include "core/nstd.h"
#include "core/result.h"
#include "libc.h"
#include "remote.h"
#include "remote/corvane.h"
#include "remote/signature.h"
#include "remote/unmarshal.h"
#include "remote/wire_plan.h"

namespace corvane {
namespace remote {
namespace {

constexpr int kBadLength = hvx::RESULT_BAD_POINTER;
constexpr int kNoSuchMethod = hvx::RESULT_NOT_IMPLEMENTED;

static_assert(sizeof(corvane_mbufd) == 36 && sizeof(corvane_border_value_info) == 32,
              "records must have their wire size");

// The transport does not promise aligned buffers: fields are read and written one byte at
// a time, little-endian.
uint64_t load_le(const uint8_t* p, int bytes) {
  uint64_t value = 0;
  for (int b = bytes - 1; b >= 0; --b) value = value << 8 | p[b];
  return value;
}

int32_t load_i32(const uint8_t* p) { return int32_t(uint32_t(load_le(p, 4))); }

void store_le(uint8_t* p, uint64_t value, int bytes) {
  for (int b = 0; b < bytes; ++b, value >>= 8) p[b] = uint8_t(value);
}

void set_scalar(arg_slot& s, kind k, uint64_t bits) {
  const uint32_t low = uint32_t(bits);
  switch (k) {
    case kind::u8: s.v.u8 = uint8_t(bits); break;
    case kind::i32: s.v.i32 = int32_t(low); break;
    case kind::u32: s.v.u32 = low; break;
    case kind::f32: memcpy(&s.v.f32, &low, 4); break;
    case kind::u64: s.v.u64 = bits; break;
    case kind::f64: memcpy(&s.v.f64, &bits, 8); break;
    default: break;
  }
}

uint64_t scalar_bits(const arg_slot& s, kind k) {
  uint32_t low = 0;
  uint64_t wide = 0;
  switch (k) {
    case kind::u8: return s.v.u8;
    case kind::i32: return uint32_t(s.v.i32);
    case kind::u32: return s.v.u32;
    case kind::f32: memcpy(&low, &s.v.f32, 4); return low;
    case kind::u64: return s.v.u64;
    case kind::f64: memcpy(&wide, &s.v.f64, 8); return wide;
    default: return 0;
  }
}

void read_descriptor(const uint8_t* p, corvane_mbufd& d) {
  int32_t words[9];
  for (int i = 0; i < 9; ++i) words[i] = load_i32(p + 4 * i);
  memcpy(&d, words, sizeof(d));
}

// A length fits when it is at most the buffer's capacity in elements. Lengths compare as
// signed numbers: a negative one passes and reaches the function as it is.
bool fits(int32_t n, const remote_arg& a, int unit) { return n <= 0 || size_t(n) <= a.buf.nLen / size_t(unit); }

bool unmarshal_sequence(const param_plan& q, const uint8_t* prim, remote_arg* in, remote_arg* out, arg_slot& x) {
  const int unit = unit_size(q.k);
  const int32_t n = load_i32(prim + q.in_off);
  if (q.d == dir::inrout) {
    const int32_t n_out = load_i32(prim + q.in_off + 4);
    const remote_arg& a = in[q.in_buf];
    const remote_arg& b = out[q.out_buf];
    if (!fits(n, a, unit) || !fits(n_out, b, unit) || n > n_out) return false;
    x.data = b.buf.pv;
    x.len = n_out;
    if (a.buf.pv != b.buf.pv && n > 0) {
      x.copy_from = a.buf.pv;
      x.copy_bytes = size_t(n) * size_t(unit);
    }
    return true;
  }
  const remote_arg& a = q.d == dir::in ? in[q.in_buf] : out[q.out_buf];
  if (!fits(n, a, unit)) return false;
  x.data = a.buf.pv;
  x.len = n;
  if (q.k == kind::imbuf || q.k == kind::ombuf) {
    x.v.buf.mem = static_cast<unsigned char*>(a.buf.pv);
    x.v.buf.memLen = n;
  }
  return true;
}

}  // namespace

int unmarshal(const method_plan& p, uint32_t sc, remote_arg* pra, arg_slot* slots, uint8_t** prim_out) {
  const uint32_t n_in = REMOTE_SCALARS_INBUFS(sc);
  const uint32_t total =
      n_in + REMOTE_SCALARS_OUTBUFS(sc) + REMOTE_SCALARS_INHANDLES(sc) + REMOTE_SCALARS_OUTHANDLES(sc);
  if (total < uint32_t(p.in_bufs + p.out_bufs)) return kBadLength;
  // Output buffers are found from the counts of the call, so they must also lie inside it.
  if (n_in + uint32_t(p.out_bufs) > total) return kBadLength;

  // A call without buffers may come with no array at all.
  remote_arg* in = total > 0 ? pra + 1 : nullptr;
  remote_arg* out = total > 0 ? pra + n_in : nullptr;
  const uint8_t* prim = nullptr;
  if (p.has_prim_in) {
    if (pra[0].buf.nLen < size_t(p.base + p.prim_in_size)) return kBadLength;
    prim = static_cast<const uint8_t*>(pra[0].buf.pv);
  }
  if (p.has_prim_out) {
    if (out[0].buf.nLen < size_t(p.prim_out_size)) return kBadLength;
    *prim_out = static_cast<uint8_t*>(out[0].buf.pv);
    ++out;
  }
  for (int i = 0; i < p.count; ++i) {
    const param_plan& q = p.params[i];
    arg_slot& x = slots[i];
    if (q.k == kind::mbufd) {
      read_descriptor(prim + q.in_off, x.v.desc);
    } else if (q.k == kind::border) {
      memcpy(x.v.border.val, prim + q.in_off, sizeof(x.v.border.val));
    } else if (is_scalar(q.k)) {
      if (q.in_off >= 0) set_scalar(x, q.k, load_le(prim + q.in_off, unit_size(q.k)));
    } else if (!unmarshal_sequence(q, prim, in, out, x)) {
      return kBadLength;
    }
  }
  return 0;
}

namespace {

// An inrout sequence given in two buffers starts as a copy of its input.
void copy_inrout_inputs(const method_plan& p, const arg_slot* slots) {
  for (int i = 0; i < p.count; ++i)
    if (slots[i].copy_from != nullptr) memmove(slots[i].data, slots[i].copy_from, slots[i].copy_bytes);
}

void marshal_outputs(const method_plan& p, const arg_slot* slots, uint8_t* prim_out) {
  for (int i = 0; i < p.count; ++i) {
    const param_plan& q = p.params[i];
    if (q.out_off >= 0) store_le(prim_out + q.out_off, scalar_bits(slots[i], q.k), unit_size(q.k));
  }
}

// ---- The call ----

template <kind K> value_t<K>& scalar_field(arg_slot& s) {
  if constexpr (K == kind::u8) return s.v.u8;
  else if constexpr (K == kind::i32) return s.v.i32;
  else if constexpr (K == kind::u32) return s.v.u32;
  else if constexpr (K == kind::u64) return s.v.u64;
  else if constexpr (K == kind::f32) return s.v.f32;
  else return s.v.f64;
}

template <int N, size_t J> c_arg_t<N, J> argument(arg_slot* slots) {
  constexpr arg_ref r = kPlans[N].args[J];
  constexpr param_plan q = param_of_arg<N, J>();
  arg_slot& x = slots[r.param];
  if constexpr (q.k == kind::mbufd) return &x.v.desc;
  else if constexpr (q.k == kind::imbuf || q.k == kind::ombuf) return &x.v.buf;
  else if constexpr (q.k == kind::border) return &x.v.border;
  else if constexpr (is_sequence(q.k) && r.part == 1) return x.len;
  else if constexpr (is_sequence(q.k)) return static_cast<c_arg_t<N, J>>(x.data);
  else if constexpr (q.d == dir::in) return scalar_field<q.k>(x);
  else return &scalar_field<q.k>(x);
}

template <int N, class... A, size_t... J>
AEEResult call(AEEResult (*fn)(A...), [[maybe_unused]] arg_slot* slots, nstd::integer_sequence<size_t, J...>) {
  return fn(argument<N, J>(slots)...);
}

template <int N, class... A> AEEResult call(AEEResult (*fn)(A...), arg_slot* slots) {
  return call<N>(fn, slots, nstd::make_integer_sequence<size_t, sizeof...(A)>{});
}

template <int N, auto Fn> int invoke(uint32_t sc, remote_arg* pra) {
  static_assert(signature_matches<N>(Fn), "the exported function's declaration disagrees with its method row");
  constexpr const method_plan& plan = kPlans[N];
  arg_slot slots[plan.count > 0 ? plan.count : 1] = {};
  uint8_t* prim_out = nullptr;
  const int checked = unmarshal(plan, sc, pra, slots, &prim_out);
  if (checked != 0) return checked;
  copy_inrout_inputs(plan, slots);
  const AEEResult result = call<N>(Fn, slots);
  if (result != 0) return result;
  if (plan.has_prim_out) marshal_outputs(plan, slots, prim_out);
  return 0;
}

using handler = int (*)(uint32_t, remote_arg*);

#define CORVANE_SKEL_HANDLER(number, name, state, plist) &invoke<number, &corvane_##name>,
constexpr handler kHandlers[kMethodCount] = {CORVANE_REMOTE_METHODS(CORVANE_SKEL_HANDLER)};
#undef CORVANE_SKEL_HANDLER

}  // namespace
}  // namespace remote
}  // namespace corvane

extern "C" CORVANE_API int corvane_skel_invoke(uint32_t _sc, remote_arg* _pra) {
  using namespace corvane::remote;
  const uint32_t m = REMOTE_SCALARS_METHOD(_sc);
  if (m < uint32_t(kFirstEscapedMethod)) return kHandlers[m](_sc, _pra);
  // The escape: the method number is the first word of the primary input.
  if (REMOTE_SCALARS_INBUFS(_sc) == 0 || _pra[0].buf.nLen < 4) return kBadLength;
  const uint32_t mid = uint32_t(load_le(static_cast<const uint8_t*>(_pra[0].buf.pv), 4));
  if (mid < uint32_t(kFirstEscapedMethod) || mid >= uint32_t(kMethodCount)) return kNoSuchMethod;
  return kHandlers[mid](_sc, _pra);
}
