// hvx_sum in SingleHVX: jobs of 128 vectors (96 for three channels) on the pool, each
// summed by a block routine into sixteen 32-bit lanes that carry fixed channels, and the
// workers' vectors added up in the epilog.
//
// A block routine adds groups of G vectors into 32-bit accumulators that wrap; the last
// partial group is padded with zeros (the tail vector is copied, so that nothing past
// the data is read) and goes through the same group body. Then the accumulators are
// folded once into the result lanes:
//   cn 1: every lane channel 0;  cn 2: lanes 0-7 channel 0, 8-15 channel 1;
//   cn 3: lane j channel j mod 3 (8-bit) or (2j) mod 3 (16-bit);  cn 4: lanes 4c-4c+3 channel c.
#include "core/parallel_loop.h"
#include "core/vector/ops.h"
#include "core/vector/prefetch.h"
#include "kernels/pixelwise/sum.h"

namespace hvx {
namespace sum {
namespace {

constexpr mode_enum M = SingleHVX;
constexpr int N = static_cast<int>(mode_vector_bytes<M>);  // 64
typedef gen_vec<M> vec;
typedef vu8_t<M> vu8;
typedef vi32_t<M> vi32;
typedef uint32_t lanes16[16];  // folded on the scalar core, where unsigned sums wrap as the lanes do

// Bytes from p in the first `bytes` bytes of v, zeros after.
inline vec partial(const vec* p, size_t bytes) {
  vec v = vzero<vec>();
  __builtin_memcpy(&v, p, bytes);
  return v;
}

inline void store(const vi32& v, void* out) { __builtin_memcpy(out, &v, sizeof(v)); }

// ---- 8-bit groups ----------------------------------------------------------------------

struct sum1c_u8 {
  typedef uint8_t lane;
  static constexpr int G = 2;
  vi32 acc = vzero<vi32>();
  void add(const vec* in) {
    const auto h = vadd_w(vu8(in[0]), vu8(in[1]));
    const auto w = vadd_w(hi(h), lo(h));
    acc = vadd(acc, vadd(hi(w), lo(w)));
  }
  void fold(uint32_t* out) const { store(acc, out); }
};

struct sum2c_u8 {
  typedef uint8_t lane;
  static constexpr int G = 2;
  vi32 first = vzero<vi32>(), second = vzero<vi32>();
  void add(const vec* in) {
    const auto h = vadd_w(vu8(in[0]), vu8(in[1]));  // lo: channel 0, hi: channel 1
    const auto c0 = vunpack(lo(h)), c1 = vunpack(hi(h));
    first = vadd(first, vadd(hi(c0), lo(c0)));
    second = vadd(second, vadd(hi(c1), lo(c1)));
  }
  void fold(uint32_t* out) const {
    lanes16 f, s;
    store(first, f);
    store(second, s);
    for (int j = 0; j < 8; ++j) {
      out[j] = f[j] + f[j + 8];
      out[j + 8] = s[j] + s[j + 8];
    }
  }
};

// Three vectors are 64 pixels; in1 and in2 are first brought to in0's channel phase, so
// that byte position p of A, B, C and D holds channel p mod 3.
struct sum3c_u8 {
  typedef uint8_t lane;
  static constexpr int G = 3;
  vi32 acc1 = vzero<vi32>(), acc2 = vzero<vi32>(), acc3 = vzero<vi32>();
  void add(const vec* in) {
    const vu8 zero = vzero<vu8>(), in1 = vu8(in[1]), in2 = vu8(in[2]);
    const vu8 A = vu8(in[0]);
    const vu8 B = vlalign(in1, zero, 1);                                      // 0, in1[0..62]
    const vu8 C = vlalign(in2, vmux(vsetq<M>(N - 1), zero, in1), 2);          // 0, in1[63], in2[0..61]
    const vu8 D = vlalign(zero, vmux(vsetq<M>(N - 2), zero, in2), 3);         // 0, in2[62], in2[63], 0...
    const auto h1 = vadd_w(A, B), h2 = vadd_w(C, D);
    const auto wa = vadd_w(hi(h1), hi(h2)), wb = vadd_w(lo(h1), lo(h2));
    acc3 = vadd(acc3, vadd(hi(wa), lo(wb)));  // positions 4k and 4k + 3: channel k mod 3
    acc1 = vadd(acc1, lo(wa));                // 4k + 1: channel (k + 1) mod 3
    acc2 = vadd(acc2, hi(wb));                // 4k + 2: channel (k + 2) mod 3
  }
  void fold(uint32_t* out) const {
    lanes16 a1, a2, a3;
    store(acc1, a1);
    store(acc2, a2);
    store(acc3, a3);
    for (int j = 0; j < 16; ++j) out[j] = a3[j] + (j < 15 ? a2[j + 1] : 0) + (j >= 1 ? a1[j - 1] : 0);
    out[14] += a2[0];
    out[1] += a1[15];
  }
};

// Quarter c of the result: the four quarters of acc[c] added, lane by lane.
inline void fold_quarters(const vi32 (&acc)[4], uint32_t* out) {
  for (int c = 0; c < 4; ++c) {
    lanes16 a;
    store(acc[c], a);
    for (int l = 0; l < 4; ++l)
      out[4 * c + l] = a[l] + a[4 + l] + a[8 + l] + a[12 + l];
  }
}

struct sum4c_u8 {
  typedef uint8_t lane;
  static constexpr int G = 4;
  vi32 acc[4] = {vzero<vi32>(), vzero<vi32>(), vzero<vi32>(), vzero<vi32>()};
  void add(const vec* in) {
    const auto h1 = vadd_w(vu8(in[0]), vu8(in[1])), h2 = vadd_w(vu8(in[2]), vu8(in[3]));
    const auto even = vadd_w(lo(h1), lo(h2)), odd = vadd_w(hi(h1), hi(h2));
    acc[0] = vadd(acc[0], lo(even));
    acc[2] = vadd(acc[2], hi(even));
    acc[1] = vadd(acc[1], lo(odd));
    acc[3] = vadd(acc[3], hi(odd));
  }
  void fold(uint32_t* out) const { fold_quarters(acc, out); }
};

// ---- 16-bit groups: T is uint16_t or int16_t, which widen with zeros or the sign -------

template <class T> using v16 = vector_type<T, N>;

template <class T> struct sum1c_16 {
  typedef T lane;
  static constexpr int G = 2;
  vi32 acc = vzero<vi32>();
  void add(const vec* in) {
    const auto w = vadd_w(v16<T>(in[0]), v16<T>(in[1]));
    acc = vadd(acc, vadd(hi(w), lo(w)));
  }
  void fold(uint32_t* out) const { store(acc, out); }
};

template <class T> struct sum2c_16 {
  typedef T lane;
  static constexpr int G = 2;
  sum2c_u8 halves;  // the same accumulators and fold
  void add(const vec* in) {
    const auto w = vadd_w(v16<T>(in[0]), v16<T>(in[1]));  // lo: channel 0, hi: channel 1
    halves.first = vadd(halves.first, lo(w));
    halves.second = vadd(halves.second, hi(w));
  }
  void fold(uint32_t* out) const { halves.fold(out); }
};

// Three vectors are 96 elements; element position p of A, B, C and D holds channel p mod 3.
template <class T> struct sum3c_16 {
  typedef T lane;
  static constexpr int G = 3;
  vi32 acc1 = vzero<vi32>(), acc2 = vzero<vi32>();
  void add(const vec* in) {
    typedef v16<T> V;
    const V zero = vzero<V>(), in1 = V(in[1]), in2 = V(in[2]);
    const V A = V(in[0]);
    const V B = vlalign(in1, zero, 4);  // two zero elements, in1[0..29]
    const V C = vlalign(in2, zero, 2);  // one zero element, in2[0..30]
    // in2[31] at element 2, in1[30] and in1[31] at elements 5 and 6.
    const V D = vor(vlalign(zero, vmux(vsetq<M>(N - 2), zero, in2), 6),
                    vlalign(zero, vmux(vsetq<M>(N - 4), zero, in1), 14));
    const auto w1 = vadd_w(A, B), w2 = vadd_w(C, D);
    acc1 = vadd(acc1, vadd(lo(w1), lo(w2)));  // word lane k: position 2k
    acc2 = vadd(acc2, vadd(hi(w1), hi(w2)));  // position 2k + 1
  }
  void fold(uint32_t* out) const {
    lanes16 a1, a2;
    store(acc1, a1);
    store(acc2, a2);
    for (int j = 0; j < 16; ++j)
      out[j] = a1[j] + (j < 15 ? a2[j + 1] : 0);
    out[14] += a2[0];
  }
};

template <class T> struct sum4c_16 {
  typedef T lane;
  static constexpr int G = 4;
  vi32 acc01 = vzero<vi32>(), acc23 = vzero<vi32>();  // channels 0 | 1 and 2 | 3, eight lanes each
  void add(const vec* in) {
    typedef v16<T> V;
    const auto w1 = vadd_w(vdeal(V(in[0])), vdeal(V(in[1]))), w2 = vadd_w(vdeal(V(in[2])), vdeal(V(in[3])));
    acc01 = vadd(acc01, vadd(lo(w1), lo(w2)));
    acc23 = vadd(acc23, vadd(hi(w1), hi(w2)));
  }
  void fold(uint32_t* out) const {
    lanes16 a, b;
    store(acc01, a);
    store(acc23, b);
    for (int l = 0; l < 4; ++l) {
      out[l] = a[l] + a[4 + l];
      out[4 + l] = a[8 + l] + a[12 + l];
      out[8 + l] = b[l] + b[4 + l];
      out[12 + l] = b[8 + l] + b[12 + l];
    }
  }
};

// ---- the block routine and the table ---------------------------------------------------

typedef int HvxSumFunc(const uint8_t* src, int srcLen, int32_t* dst);

template <class Group> CORVANE_FLAT int block_sum(const uint8_t* src, int srcLen, int32_t* dst) {
  constexpr size_t E = sizeof(typename Group::lane), per_vector = N / E, per_group = Group::G * per_vector;
  const size_t n = E == 1 ? static_cast<unsigned>(srcLen) : static_cast<unsigned>(srcLen) >> 1;
  const vec* v = reinterpret_cast<const vec*>(src);
  Group g;
  for (size_t k = n / per_group; k != 0; --k, v += Group::G) g.add(v);
  if (const size_t rem = n % per_group) {
    vec last[Group::G];
    const size_t full = rem / per_vector;
    for (size_t i = 0; i < size_t(Group::G); ++i) last[i] = i < full ? v[i] : vzero<vec>();
    if (const size_t tail = rem % per_vector) last[full] = partial(v + full, tail * E);
    g.add(last);
  }
  lanes16 folded;
  g.fold(folded);
  __builtin_memcpy(dst, folded, sizeof(folded));
  return 0;
}

struct table {
  HvxSumFunc* f[4][4];
};
constexpr table sumHvxFuncTab = {{
    {&block_sum<sum1c_u8>, &block_sum<sum2c_u8>, &block_sum<sum3c_u8>, &block_sum<sum4c_u8>},
    {nullptr, nullptr, nullptr, nullptr},
    {&block_sum<sum1c_16<uint16_t>>, &block_sum<sum2c_16<uint16_t>>, &block_sum<sum3c_16<uint16_t>>,
     &block_sum<sum4c_16<uint16_t>>},
    {&block_sum<sum1c_16<int16_t>>, &block_sum<sum2c_16<int16_t>>, &block_sum<sum3c_16<int16_t>>,
     &block_sum<sum4c_16<int16_t>>},
}};

class SumLoop : public cv::adsp::ParallelLoop {
 public:
  SumLoop(const uint8_t* src, int srcLen, int32_t* dst, int cn, HvxSumFunc* fun)
      : ParallelLoop(mode_c<M>::instance), src(src), srcLen(srcLen), dst(dst),
        vecNumForChunk(static_cast<uint8_t>(cn == 3 ? 96 : 128)), fun(fun) {}

  int prolog(unsigned) override {
    mode_lock guard = hvx::lock(mode_c<M>::instance);
    if (!guard.owns_mode()) return 1;
    for (vi32& o : outs) o = vzero<vi32>();
    return 0;
  }

  bool body(unsigned worker_id, unsigned job_id) override {
    const unsigned size = vecNumForChunk * static_cast<unsigned>(N), offset = size * job_id;
    if (!(static_cast<unsigned>(srcLen) > offset)) return true;
    const unsigned len = (job_id + 1) * size > static_cast<unsigned>(srcLen) ? srcLen - offset : size;
    fetch_linear<uint8_t, N>(src + offset, static_cast<uint8_t>(len / N));
    vi32 partial_sum;
    fun(src + offset, static_cast<int>(len), reinterpret_cast<int32_t*>(&partial_sum));
    outs[worker_id] = vadd(outs[worker_id], partial_sum);
    return false;
  }

  int epilog(unsigned numberOfWorkers) override {
    mode_lock guard = hvx::lock(mode_c<M>::instance);
    if (!guard.owns_mode()) return 1;
    vi32 total = vzero<vi32>();
    for (unsigned i = 0; i < numberOfWorkers; ++i) total = vadd(total, outs[i]);
    store(total, dst);
    return 0;
  }

 private:
  const uint8_t* src;
  const int srcLen;
  int32_t* dst;
  const uint8_t vecNumForChunk;
  vi32 outs[4];
  HvxSumFunc* fun;
};

}  // namespace

template <int Isa> AEEResult run(const uint8_t* src, int32_t* dst, int32_t dataSize, int depth, int cn) {
  SumLoop loop(src, dataSize, dst, cn, sumHvxFuncTab.f[depth][cn - 1]);
  return loop.run(0);
}

template AEEResult run<this_isa>(const uint8_t*, int32_t*, int32_t, int, int);

}  // namespace sum
}  // namespace hvx
