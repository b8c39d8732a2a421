#include "wire_call.h"

#include "apps_mem.h"
#include "libc.h"

namespace wire {
namespace {

using corvane::remote::kPlans;
using corvane::remote::method_plan;
using corvane::remote::param_plan;
using corvane::remote::unit_size;

constexpr size_t kArenaBytes = 4u << 20;
uint8_t* arena;
size_t arena_used;

// 128-byte aligned block of the arena (vector kernels need aligned images).
uint8_t* take(size_t bytes) {
  if (arena == nullptr) {
    arena = static_cast<uint8_t*>(apps_mem_heap_malloc(kArenaBytes + 128));
    arena = reinterpret_cast<uint8_t*>((reinterpret_cast<uintptr_t>(arena) + 127) & ~uintptr_t{127});
  }
  const size_t at = (arena_used + 127) & ~size_t{127};
  if (at + bytes > kArenaBytes) return nullptr;
  arena_used = at + bytes;
  return arena + at;
}

uint64_t next(uint64_t& state) {  // splitmix64
  uint64_t z = (state += 0x9e3779b97f4a7c15ull);
  z = (z ^ (z >> 30)) * 0xbf58476d1ce4e5b9ull;
  z = (z ^ (z >> 27)) * 0x94d049bb133111ebull;
  return z ^ (z >> 31);
}

void put_le(uint8_t* p, uint64_t v, int bytes) {
  for (int i = 0; i < bytes; ++i) p[i] = static_cast<uint8_t>(v >> (8 * i));
}

}  // namespace

void reset_arena() { arena_used = 0; }

uint64_t fnv1a(uint64_t h, const void* data, size_t n) {
  const uint8_t* p = static_cast<const uint8_t*>(data);
  for (size_t i = 0; i < n; ++i) h = (h ^ p[i]) * 0x100000001b3ull;
  return h;
}

void marshal(call& c, int method, const arg* args, int nargs, uint64_t seed) {
  const method_plan& plan = kPlans[method];
  c.method = method;
  c.count = plan.in_bufs + plan.out_bufs;
  c.sc = REMOTE_SCALARS_MAKE(method < corvane::remote::kFirstEscapedMethod ? method : 31, plan.in_bufs,
                             plan.out_bufs);
  const int in_seq_base = plan.has_prim_in ? 1 : 0;
  const int out_base = plan.in_bufs;
  const int out_seq_base = out_base + (plan.has_prim_out ? 1 : 0);
  c.prim_out = plan.has_prim_out ? out_base : -1;

  uint8_t* prim = nullptr;
  if (plan.has_prim_in) {
    const size_t bytes = static_cast<size_t>(plan.base + plan.prim_in_size);
    prim = take(bytes);
    memset(prim, 0, bytes);
    if (plan.base == 4) put_le(prim, static_cast<uint32_t>(method), 4);
    c.pra[0].buf = {prim, bytes};
  }
  if (plan.has_prim_out) {
    uint8_t* p = take(static_cast<size_t>(plan.prim_out_size));
    memset(p, 0xcd, static_cast<size_t>(plan.prim_out_size));
    c.pra[out_base].buf = {p, static_cast<size_t>(plan.prim_out_size)};
  }
  uint64_t random = seed;
  for (int i = 0; i < plan.count; ++i) {
    const param_plan& q = plan.params[i];
    const arg a = i < nargs ? args[i] : arg{};
    c.in_seq[i] = c.out_seq[i] = -1;
    if (q.k == corvane::remote::kind::mbufd) {
      memcpy(prim + q.in_off, &a.desc, 36);
    } else if (q.k == corvane::remote::kind::border) {
      memcpy(prim + q.in_off, a.border, 32);
    } else if (corvane::remote::is_sequence(q.k)) {
      const size_t bytes = static_cast<size_t>(a.count > 0 ? a.count : 0) * static_cast<size_t>(unit_size(q.k));
      if (q.in_off >= 0) {
        put_le(prim + q.in_off, static_cast<uint32_t>(a.count), 4);
        if (q.in_buf >= 0 && q.out_buf >= 0) put_le(prim + q.in_off + 4, static_cast<uint32_t>(a.count), 4);
      }
      if (q.in_buf >= 0) {
        uint8_t* p = take(bytes);
        for (size_t k = 0; k < bytes; k += 8) put_le(p + k, next(random), bytes - k < 8 ? int(bytes - k) : 8);
        c.in_seq[i] = in_seq_base + q.in_buf;
        c.pra[c.in_seq[i]].buf = {p, bytes};
      }
      if (q.out_buf >= 0) {
        uint8_t* p = take(bytes);
        memset(p, 0xcd, bytes);
        c.out_seq[i] = out_seq_base + q.out_buf;
        c.pra[c.out_seq[i]].buf = {p, bytes};
      }
    } else if (q.in_off >= 0) {
      put_le(prim + q.in_off, a.bits, unit_size(q.k));
    }
  }
}

int invoke(call& c) { return corvane_skel_invoke(c.sc, c.pra); }

}  // namespace wire
