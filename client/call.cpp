#include "client/call.h"

#include <array>
#include <stdexcept>
#include <vector>

#include "remote.h"
#include "remote/corvane.h"

namespace corvane {
namespace client {

using remote::dir;
using remote::kind;

namespace {

// The wire is little-endian, written one byte at a time.
void store_le(uint8_t* p, uint64_t value, int bytes) {
  for (int b = 0; b < bytes; ++b, value >>= 8) p[b] = uint8_t(value);
}

uint64_t load_le(const uint8_t* p, int bytes) {
  uint64_t value = 0;
  for (int b = bytes - 1; b >= 0; --b) value = value << 8 | p[b];
  return value;
}

// Bytes of `len` elements, as a buffer length; a negative length gives an empty buffer.
size_t buffer_bytes(int len, int unit) { return len > 0 ? size_t(len) * size_t(unit) : 0; }

static_assert(__BYTE_ORDER__ == __ORDER_LITTLE_ENDIAN__, "scalars are moved to and from the caller's memory as bytes");

// The primary input with room for the largest method and its method word.
constexpr size_t kPrimaryCapacity = 512;

}  // namespace

AEEResult invoke(int number, const c_arg* args, transport via) {
  if (number < 0 || number >= remote::kMethodCount) throw std::out_of_range("corvane::client::invoke: no such method");
  const remote::method_plan& p = remote::kPlans[number];
  std::array<uint8_t, kPrimaryCapacity> prim_in{};
  std::array<uint8_t, kPrimaryCapacity> prim_out{};
  std::vector<remote_arg> pra(size_t(p.in_bufs + p.out_bufs));
  remote_arg* in = pra.data() + 1;  // input sequences
  remote_arg* out = pra.data() + p.in_bufs + (p.has_prim_out ? 1 : 0);  // output sequences
  if (p.has_prim_in) pra[0].buf = remote_buf{prim_in.data(), size_t(p.base + p.prim_in_size)};
  if (p.has_prim_out) pra[size_t(p.in_bufs)].buf = remote_buf{prim_out.data(), size_t(p.prim_out_size)};
  if (p.base > 0) store_le(prim_in.data(), uint64_t(number), 4);

  const c_arg* a = args;
  for (int i = 0; i < p.count; ++i) {
    const remote::param_plan& q = p.params[i];
    uint8_t* field = q.in_off >= 0 ? prim_in.data() + q.in_off : nullptr;
    const int unit = remote::unit_size(q.k);
    if (q.k == kind::mbufd) {
      const auto* d = static_cast<const corvane_mbufd*>(a->ptr);
      const int32_t words[9] = {d->stride, d->cols, d->rows, d->channels, d->depth,
                                d->border_left, d->border_right, d->border_top, d->border_bottom};
      for (int w = 0; w < 9; ++w) store_le(field + 4 * w, uint32_t(words[w]), 4);
      ++a;
    } else if (q.k == kind::border) {
      std::memcpy(field, static_cast<const corvane_border_value_info*>(a->ptr)->val, 32);
      ++a;
    } else if (q.k == kind::imbuf || q.k == kind::ombuf) {
      const auto* m = static_cast<const corvane_mbuf*>(a->ptr);
      store_le(field, uint32_t(m->memLen), 4);
      remote_arg& b = q.k == kind::imbuf ? in[q.in_buf] : out[q.out_buf];
      b.buf = remote_buf{m->mem, buffer_bytes(m->memLen, 1)};
      ++a;
    } else if (remote::is_sequence(q.k)) {
      void* data = a[0].ptr;
      const int len = int(int32_t(a[1].bits));
      store_le(field, uint32_t(len), 4);
      const remote_buf b{data, buffer_bytes(len, unit)};
      if (q.d == dir::inrout) store_le(field + 4, uint32_t(len), 4);
      if (q.in_buf >= 0) in[q.in_buf].buf = b;
      if (q.out_buf >= 0) out[q.out_buf].buf = b;
      a += 2;
    } else {  // a scalar: by value when in, else by pointer
      if (q.d == dir::in) store_le(field, a->bits, unit);
      if (q.d == dir::inrout) {
        uint64_t value = 0;
        std::memcpy(&value, a->ptr, size_t(unit));
        store_le(field, value, unit);
      }
      ++a;
    }
  }

  const int method_field = number < remote::kFirstEscapedMethod ? number : remote::kFirstEscapedMethod;
  const uint32_t sc = REMOTE_SCALARS_MAKE(method_field, p.in_bufs, p.out_bufs);
  const int result = via(sc, pra.empty() ? nullptr : pra.data());
  if (result != 0) return result;

  a = args;
  for (int i = 0; i < p.count; ++i) {
    const remote::param_plan& q = p.params[i];
    if (q.out_off >= 0) {
      const uint64_t value = load_le(prim_out.data() + q.out_off, remote::unit_size(q.k));
      std::memcpy(a->ptr, &value, size_t(remote::unit_size(q.k)));
    }
    a += remote::is_sequence(q.k) && q.k != kind::imbuf && q.k != kind::ombuf ? 2 : 1;
  }
  return 0;
}

}  // namespace client
}  // namespace corvane
