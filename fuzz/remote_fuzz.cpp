// libFuzzer target of the remote entry, corvane_skel_invoke.
//
// One input is one call: a method, the platform's HVX units (0, 1, 2 or 4, so that
// Scalar, SingleHVX and DualHVX all run), now and then a platform fault, and the call's
// arguments laid out by the method's wire plan as the client lays them out, with values
// biased toward small plausible images. One call in eight has one thing damaged: a
// length word, a buffer count, a descriptor field, the method, or a primary buffer's
// size. The transport stays honest: every buffer is a heap block of exactly the length
// the call gives it, so ASan reports any access past its end, and the bytes past a
// buffer's declared length (an image's memLen, a sequence's element count) are poisoned
// as well.
//
// Besides the sanitizers, two promises are checked: a call that answers non-zero leaves
// every buffer as it was, and no call writes a buffer it was given as input (the box
// filter's ring, written as scratch, excepted when the call succeeds).
#include <fuzzer/FuzzedDataProvider.h>
#include <sanitizer/asan_interface.h>
#include <stdint.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>

#include <algorithm>
#include <vector>

#include "corvane_platform.h"
#include "remote.h"
#include "remote/corvane.h"
#include "remote/wire_plan.h"

namespace {

using namespace corvane::remote;

constexpr int64_t kMaxBuffer = 64 * 1024;  // keeps a call cheap
constexpr int kMaxSide = 70;               // cols and rows of a plausible image
constexpr uint8_t kCanary = 0xA5;          // what output buffers hold before the call

// One transport buffer as the call describes it, then as allocated.
struct buffer {
  int param = -1;           // the parameter it belongs to; -1 for the primary buffers and extras
  int slot = 0;             // its index in the remote_arg array
  int64_t len = 0;          // nLen
  int len_off = -1;         // where its length word is in the primary input; -1 none
  int unit = 1;             // bytes of an element, for that length word
  int64_t declared = -1;    // bytes the length word gives, when fewer than len; -1 all of them
  bool output = false;      // filled with the canary; else with data
  bool primary_in = false;  // holds the primary input's bytes
  bool scratch = false;     // an input the method may write when it succeeds
  int inrout_source = -1;   // for the output half of an inrout sequence: its input buffer
  void* block = nullptr;
  uint8_t* p = nullptr;
  std::vector<uint8_t> before;
};

int64_t round_up(int64_t n, int64_t to) { return (n + to - 1) / to * to; }

int32_t clamp_i32(int64_t v) { return int32_t(std::min<int64_t>(std::max<int64_t>(v, INT32_MIN), INT32_MAX)); }

// Any int32, edges often.
int32_t wild(FuzzedDataProvider& in) {
  static const int32_t edges[] = {-1, -64, -128, INT32_MIN, INT32_MAX, 1 << 16, 1 << 30, 0x7fffff80};
  return in.ConsumeBool() ? in.PickValueInArray(edges) : in.ConsumeIntegral<int32_t>();
}

// Mostly lo..hi, one time in eight anything.
int32_t small_or_wild(FuzzedDataProvider& in, int32_t lo, int32_t hi) {
  return in.ConsumeIntegralInRange(0, 7) != 0 ? in.ConsumeIntegralInRange(lo, hi) : wild(in);
}

int element_bytes(int32_t depth) { return depth == 2 || depth == 3 ? 2 : depth == 4 || depth == 5 ? 4 : 1; }

// Samples in a row, bounded so that wild descriptors give no overflow here.
int64_t row_samples(const corvane_mbufd& d) {
  return std::min<int64_t>(std::max(d.cols, 0), 4096) * std::min<int64_t>(std::max(d.channels, 1), 16);
}

int64_t row_bytes(const corvane_mbufd& d) { return row_samples(d) * element_bytes(d.depth); }

// A stride for rows of `bytes`: usually whole 128-byte vectors, sometimes 64-byte ones,
// packed, padded, or anything.
int32_t make_stride(FuzzedDataProvider& in, int64_t bytes) {
  switch (in.ConsumeIntegralInRange(0, 9)) {
    case 0: return clamp_i32(round_up(bytes, 64));
    case 1: return clamp_i32(bytes);
    case 2: return clamp_i32(round_up(bytes, 128) + 128 * in.ConsumeIntegralInRange(1, 2));
    case 3: return wild(in);
    default: return clamp_i32(round_up(bytes, 128));
  }
}

// A descriptor; later ones in a call usually share the first one's geometry.
corvane_mbufd make_descriptor(FuzzedDataProvider& in, const corvane_mbufd* first) {
  corvane_mbufd d{};
  const bool same = first != nullptr && in.ConsumeIntegralInRange(0, 3) != 0;
  d.cols = same ? first->cols : small_or_wild(in, 0, kMaxSide);
  d.rows = same ? first->rows : small_or_wild(in, 0, kMaxSide);
  d.channels = same && in.ConsumeBool() ? first->channels : small_or_wild(in, 1, 4);
  d.depth = same && in.ConsumeBool() ? first->depth : small_or_wild(in, 0, 6);
  d.stride = make_stride(in, row_bytes(d));
  if (in.ConsumeIntegralInRange(0, 3) == 0) {
    d.border_left = small_or_wild(in, 0, 8);
    d.border_right = small_or_wild(in, 0, 8);
    d.border_top = small_or_wild(in, 0, 8);
    d.border_bottom = small_or_wild(in, 0, 8);
  }
  return d;
}

// The box filter's ring and output follow from its input and scalars: the ring holds
// 2 * H rows of twice the input row's vectors, the output the input's image in the
// element that ddepth names.
void shape_boxfilter(FuzzedDataProvider& in, const char* name, const corvane_mbufd& input, const int32_t* scalars,
                     corvane_mbufd& d) {
  if (in.ConsumeIntegralInRange(0, 3) == 0) return;
  const int32_t ddepth = scalars[2], kernel_height = scalars[4];
  const int64_t input_row = row_samples(input) * (input.depth == 0 ? 1 : 2);  // depth 0 is 8-bit, others 16-bit
  if (strcmp(name, "temp_desc") == 0) {
    d = corvane_mbufd{};
    d.stride = clamp_i32(2 * round_up(input_row, 128));
    d.cols = d.channels = 1;
    d.rows = clamp_i32(2 * (int64_t(kernel_height) | 1));
  } else if (strcmp(name, "output_desc") == 0) {
    static const int32_t depth_of[] = {0, 0, 3, 3, 5, 5};
    d = input;
    d.depth = ddepth >= 0 && ddepth <= 5 ? depth_of[ddepth] : input.depth;
    if (input.depth != 0 && d.depth == 5) d.depth = 4;
    d.stride = make_stride(in, row_bytes(d));
  }
}

// Bytes of an image buffer for its descriptor: usually stride * rows plus 0 to 2
// vectors, sometimes fewer, sometimes unrelated.
int64_t image_bytes(FuzzedDataProvider& in, const corvane_mbufd& d) {
  const int64_t implied = d.stride > 0 && d.rows > 0 ? std::min<int64_t>(int64_t(d.stride) * d.rows, kMaxBuffer) : 0;
  switch (in.ConsumeIntegralInRange(0, 7)) {
    case 0: return implied > 0 ? in.ConsumeIntegralInRange<int64_t>(0, implied - 1) : 0;
    case 1: return in.ConsumeIntegralInRange<int64_t>(0, 4096);
    default: return std::min(implied + 128 * in.ConsumeIntegralInRange(0, 2), kMaxBuffer);
  }
}

// A length word for a buffer of `bytes` holding `unit`-byte elements: usually all of it,
// sometimes fewer, sometimes negative or anything.
int32_t length_word(FuzzedDataProvider& in, int64_t bytes, int unit) {
  switch (in.ConsumeIntegralInRange(0, 15)) {
    case 0: return clamp_i32(in.ConsumeIntegralInRange<int64_t>(0, bytes / unit));
    case 1: return wild(in);
    default: return clamp_i32(bytes / unit);
  }
}

void store_le(uint8_t* p, uint64_t value, int bytes) {
  for (int b = 0; b < bytes; ++b, value >>= 8) p[b] = uint8_t(value);
}

uint32_t load_u32(const uint8_t* p) { return uint32_t(p[0] | p[1] << 8 | p[2] << 16 | uint32_t(p[3]) << 24); }

uint64_t next_random(uint64_t& state) {  // splitmix64
  uint64_t z = (state += 0x9e3779b97f4a7c15ull);
  z = (z ^ (z >> 30)) * 0xbf58476d1ce4e5b9ull;
  z = (z ^ (z >> 27)) * 0x94d049bb133111ebull;
  return z ^ (z >> 31);
}

// Platform state for the call: units, and one time in eight a fault.
void set_up_platform(FuzzedDataProvider& in) {
  static const int units[] = {0, 1, 2, 4};
  corvane_platform_reset();
  corvane_platform_set_units(in.PickValueInArray(units));
  if (in.ConsumeIntegralInRange(0, 7) != 0) return;
  switch (in.ConsumeIntegralInRange(0, 4)) {
    case 0: corvane_platform_force_lock_result(-1); break;
    case 1: corvane_platform_force_lock_result(128); break;
    case 2: corvane_platform_fail_power_requests(1); break;
    case 3: corvane_platform_fail_hvx_power_on(1); break;
    default: corvane_platform_set_compute_not_ok(1); break;
  }
}

[[noreturn]] void fail(int number, int result, const buffer& b, const char* what) {
  const char* name = b.param >= 0 ? kMethods[number].params.items[b.param].name : "(primary or extra)";
  size_t at = 0;
  while (at < b.before.size() && b.p[at] == b.before[at]) ++at;
  fprintf(stderr, "\n%s %s: method %d (%s) answered %d; buffer %d (%s, %lld bytes) changed at byte %zu\n",
          b.output ? "output" : "input", what, number, kMethods[number].name, result, b.slot, name,
          static_cast<long long>(b.len), at);
  abort();
}

void quiet_log(void*, int, const char*, int, const char*) {}

// With CORVANE_FUZZ_TRACE set (to rerun one input): the call as it is made.
void trace(int number, uint32_t sc, const std::vector<uint8_t>& prim, const std::vector<buffer>& bufs) {
  fprintf(stderr, "method %d (%s), units %d, sc 0x%08x\nprimary input:", number, kMethods[number].name,
          corvane_platform_units(), sc);
  for (size_t i = 0; i < prim.size(); ++i) fprintf(stderr, "%s%02x", i % 4 == 0 ? " " : "", prim[i]);
  fprintf(stderr, "\n");
  for (const buffer& b : bufs)
    fprintf(stderr, "  slot %d %s %s: %lld bytes, declared %lld, at 128-byte boundary + %td\n", b.slot,
            b.output ? "out" : "in", b.param >= 0 ? kMethods[number].params.items[b.param].name : "-",
            static_cast<long long>(b.len), static_cast<long long>(b.declared),
            b.p - static_cast<uint8_t*>(b.block));
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
  corvane_platform_set_log_sink(quiet_log, nullptr);
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  FuzzedDataProvider in(data, size);
  const int number = in.ConsumeIntegralInRange(0, kMethodCount - 1);
  const method_plan& plan = kPlans[number];
  const method_info& info = kMethods[number];
  set_up_platform(in);
  uint64_t random = in.ConsumeIntegral<uint64_t>();

  // The primary input, and one buffer record per transport buffer.
  const int64_t prim_in_size = plan.has_prim_in ? plan.base + plan.prim_in_size : 0;
  std::vector<uint8_t> prim(size_t(prim_in_size), 0);
  if (plan.base > 0) store_le(prim.data(), uint64_t(number), 4);
  int n_in = plan.in_bufs, n_out = plan.out_bufs;
  const int first_out = n_in + (plan.has_prim_out ? 1 : 0);
  std::vector<buffer> bufs;
  if (plan.has_prim_in) {
    bufs.push_back(buffer{});
    bufs.back().len = prim_in_size;
    bufs.back().primary_in = true;
  }
  if (plan.has_prim_out) {
    bufs.push_back(buffer{});
    bufs.back().slot = n_in;
    bufs.back().len = plan.prim_out_size;
    bufs.back().output = true;
  }

  // Every parameter, in order: its value in the primary input, its buffers. An image
  // buffer is sized by the first descriptor not yet used by a buffer, else the last one.
  corvane_mbufd descs[kMaxParams] = {};
  int32_t scalars[kMaxParams] = {};
  int n_descs = 0, next_desc = 0;
  for (int i = 0; i < plan.count; ++i) {
    const param_plan& q = plan.params[i];
    uint8_t* field = q.in_off >= 0 ? prim.data() + q.in_off : nullptr;
    const int unit = unit_size(q.k);
    if (q.k == kind::mbufd) {
      corvane_mbufd& d = descs[n_descs];
      d = make_descriptor(in, n_descs > 0 ? &descs[0] : nullptr);
      if (number == method::boxfilter && n_descs > 0)
        shape_boxfilter(in, info.params.items[i].name, descs[0], scalars, d);
      const int32_t words[9] = {d.stride, d.cols, d.rows, d.channels, d.depth,
                                d.border_left, d.border_right, d.border_top, d.border_bottom};
      for (int w = 0; w < 9; ++w) store_le(field + 4 * w, uint32_t(words[w]), 4);
      ++n_descs;
    } else if (q.k == kind::border) {
      for (int b = 0; b < 32; ++b) field[b] = in.ConsumeIntegral<uint8_t>();
    } else if (q.k == kind::imbuf || q.k == kind::ombuf) {
      const corvane_mbufd& d = descs[next_desc < n_descs ? next_desc++ : std::max(n_descs - 1, 0)];
      buffer b;
      b.param = i;
      b.len = image_bytes(in, d);
      b.len_off = q.in_off;
      store_le(field, uint32_t(length_word(in, b.len, 1)), 4);
      b.output = q.k == kind::ombuf;
      b.slot = b.output ? first_out + q.out_buf : 1 + q.in_buf;
      b.scratch = number == method::boxfilter && strcmp(info.params.items[i].name, "temp") == 0;
      bufs.push_back(b);
    } else if (is_sequence(q.k)) {
      // Sequences: up to 256 elements, the buffer usually exactly that long.
      const int64_t count = in.ConsumeIntegralInRange<int64_t>(0, std::min<int64_t>(256, kMaxBuffer / unit));
      int source = -1;
      for (int half = 0; half < (q.d == dir::inrout ? 2 : 1); ++half) {
        buffer b;
        b.param = i;
        b.len = count * unit + (in.ConsumeIntegralInRange(0, 7) == 0 ? in.ConsumeIntegralInRange(0, 64) : 0);
        b.len_off = q.in_off + 4 * half;
        b.unit = unit;
        store_le(field + 4 * half, uint32_t(length_word(in, b.len, unit)), 4);
        b.output = q.d == dir::rout || half == 1;
        b.slot = b.output ? first_out + q.out_buf : 1 + q.in_buf;
        b.inrout_source = half == 1 ? source : -1;
        source = int(bufs.size());
        bufs.push_back(b);
      }
    } else if (q.in_off >= 0) {  // an input scalar
      uint64_t bits;
      if (q.k == kind::i32 || q.k == kind::u32) bits = uint32_t(small_or_wild(in, 0, 15));
      else bits = in.ConsumeIntegral<uint64_t>();
      scalars[i] = int32_t(uint32_t(bits));
      store_le(field, bits, unit);
    }
  }

  // One call in eight: damage one thing.
  int method_field = number < kFirstEscapedMethod ? number : kFirstEscapedMethod;
  bool plan_kept = true;  // false: the entry reads the buffers by another method's plan
  if (in.ConsumeIntegralInRange(0, 7) == 0) {
    const int damage = in.ConsumeIntegralInRange(0, 5);
    switch (damage) {
      case 0:    // a length word
      case 1: {  // a descriptor field: a little larger, or anything
        std::vector<int> offsets;
        for (int i = 0; i < plan.count; ++i) {
          const param_plan& q = plan.params[i];
          if (q.k == kind::mbufd && damage == 1) for (int w = 0; w < 9; ++w) offsets.push_back(q.in_off + 4 * w);
          if (is_sequence(q.k) && damage == 0)
            offsets.push_back(q.in_off + (q.d == dir::inrout ? 4 * in.ConsumeIntegralInRange(0, 1) : 0));
        }
        if (offsets.empty()) break;
        uint8_t* word = prim.data() + offsets[in.ConsumeIntegralInRange<size_t>(0, offsets.size() - 1)];
        store_le(word, in.ConsumeBool() ? load_u32(word) + in.ConsumeIntegralInRange(1, 130) : uint32_t(wild(in)), 4);
        break;
      }
      case 2:  // the buffer counts of the scalars word
        n_in = std::max(0, n_in + in.ConsumeIntegralInRange(-2, 2));
        n_out = std::max(0, n_out + in.ConsumeIntegralInRange(-2, 2));
        plan_kept = n_in == plan.in_bufs && n_out == plan.out_bufs;
        break;
      case 3:  // the method
        if (plan.base > 0 && in.ConsumeBool()) store_le(prim.data(), uint32_t(small_or_wild(in, 0, 63)), 4);
        else method_field = in.ConsumeIntegralInRange(0, 31);
        plan_kept = false;
        break;
      default:  // a primary buffer shorter than its plan
        for (buffer& b : bufs)
          if (b.param < 0 && b.len > 0 && in.ConsumeBool()) b.len = in.ConsumeIntegralInRange<int64_t>(0, b.len - 1);
        break;
    }
  }
  // The bytes past each buffer's length word, damaged or not, are poisoned below. Another
  // method, or other buffer counts, give the buffers other roles: then only ASan watches
  // the call.
  for (buffer& b : bufs) {
    if (b.len_off < 0 || !plan_kept) continue;
    const int64_t n = int32_t(load_u32(prim.data() + b.len_off));
    if (n >= 0 && n * b.unit < b.len) b.declared = n * b.unit;
  }

  // The remote_arg array holds as many entries as the scalars word counts; entries that
  // no parameter fills are short buffers of their own.
  const int total = n_in + n_out;
  std::vector<bool> filled(size_t(std::max(total, 0)), false);
  for (buffer& b : bufs)
    if (b.slot < total) filled[size_t(b.slot)] = true;
  for (int s = 0; s < total; ++s)
    if (!filled[size_t(s)]) {
      buffer b;
      b.slot = s;
      b.len = in.ConsumeIntegralInRange(0, 256);
      b.output = s >= n_in;
      bufs.push_back(b);
    }

  // Allocate, fill, snapshot, poison.
  std::vector<remote_arg> pra(size_t(std::max(total, 1)));
  for (buffer& b : bufs) {
    const size_t offset = in.ConsumeIntegralInRange(0, 7) == 0 ? in.ConsumeIntegralInRange(1, 127) : 0;
    if (posix_memalign(&b.block, 128, offset + size_t(b.len)) != 0) abort();
    b.p = static_cast<uint8_t*>(b.block) + offset;
    if (b.len == 0) {
      // nothing to fill
    } else if (b.primary_in) {
      memcpy(b.p, prim.data(), std::min(size_t(b.len), prim.size()));
    } else if (b.output) {
      memset(b.p, kCanary, size_t(b.len));
    } else {
      for (int64_t j = 0; j < b.len; j += 8) {
        const uint64_t r = next_random(random);
        memcpy(b.p + j, &r, size_t(std::min<int64_t>(8, b.len - j)));
      }
    }
    b.before.assign(b.p, b.p + b.len);
    if (b.declared >= 0) ASAN_POISON_MEMORY_REGION(b.p + b.declared, size_t(b.len - b.declared));
    if (b.slot < total) pra[size_t(b.slot)].buf = remote_buf{b.p, size_t(b.len)};
  }

  const uint32_t sc = REMOTE_SCALARS_MAKE(method_field, n_in, n_out);
  if (getenv("CORVANE_FUZZ_TRACE") != nullptr) trace(number, sc, prim, bufs);
  const int result = corvane_skel_invoke(sc, total > 0 ? pra.data() : nullptr);

  for (buffer& b : bufs) ASAN_UNPOISON_MEMORY_REGION(b.p, size_t(b.len));
  for (const buffer& b : bufs) {
    if (!plan_kept) break;
    if (b.len == 0 || memcmp(b.p, b.before.data(), size_t(b.len)) == 0) continue;
    if (!b.output && !(b.scratch && result == 0)) fail(number, result, b, "written");
    if (result == 0) continue;
    // A refused call leaves its outputs alone; the one exception is the output half of an
    // inrout sequence, which the skeleton starts as a copy of its input before the call.
    if (b.inrout_source >= 0) {
      const buffer& src = bufs[size_t(b.inrout_source)];
      bool copied = true;
      for (int64_t j = 0; j < b.len && copied; ++j)
        copied = b.p[j] == b.before[size_t(j)] || (j < src.len && b.p[j] == src.before[size_t(j)]);
      if (copied) continue;
    }
    fail(number, result, b, "written by a refused call");
  }
  for (buffer& b : bufs) free(b.block);
  return 0;
}
