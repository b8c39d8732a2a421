// Lane-typed vectors, vector pairs, predicates and scalar operands of both vector modes,
// and the compile-time selectors that let one kernel source serve 64 and 128 bytes.
//
// Names give lane type and count: vu8x64 is 64 unsigned bytes (one SingleHVX vector),
// vi16x64 is 64 signed half-words (one DualHVX vector). A pair of vectors is a type of
// its own, named with a leading w: wvi16x64 is the SingleHVX pair that holds 64
// half-words, wvi16x128 the DualHVX one. Both modes are compiled into one host program,
// so a pair and a plain vector of the same lane count must not be the same type.
// Kernels use the mode-relative aliases (vu8_t<M>, wvi16_t<M>, ...) instead.
//
// Byte order: lane i of a wider view holds bytes i*w .. i*w+w-1, low byte first. Both
// the DSP and the host are little-endian, and the even/odd rules of the lane operations
// are stated on that layout.
#ifndef CORVANE_CORE_VECTOR_TYPES_H
#define CORVANE_CORE_VECTOR_TYPES_H

#include <stddef.h>
#include <stdint.h>

#include "core/nstd.h"
#include "core/vector/gen_vec.h"

namespace hvx {
CORVANE_ISA_BEGIN

// ---- lanes -----------------------------------------------------------------------------

template <class L> struct lane_traits;
#define CORVANE_LANE(L, U, S, W, N, MIN, MAX)                     \
  template <> struct lane_traits<L> {                            \
    typedef U unsigned_t;                                        \
    typedef S signed_t;                                          \
    typedef W wide_t; /* twice the bits, same signedness */      \
    typedef N narrow_t; /* half the bits, same signedness */     \
    static constexpr bool is_signed = nstd::is_same_c<L, S>::value; \
    static constexpr int bits = 8 * sizeof(L);                   \
    static constexpr L min = MIN;                                \
    static constexpr L max = MAX;                                \
  };
CORVANE_LANE(uint8_t, uint8_t, int8_t, uint16_t, void, 0, UINT8_MAX)
CORVANE_LANE(int8_t, uint8_t, int8_t, int16_t, void, INT8_MIN, INT8_MAX)
CORVANE_LANE(uint16_t, uint16_t, int16_t, uint32_t, uint8_t, 0, UINT16_MAX)
CORVANE_LANE(int16_t, uint16_t, int16_t, int32_t, int8_t, INT16_MIN, INT16_MAX)
CORVANE_LANE(uint32_t, uint32_t, int32_t, uint64_t, uint16_t, 0, UINT32_MAX)
CORVANE_LANE(int32_t, uint32_t, int32_t, int64_t, int16_t, INT32_MIN, INT32_MAX)
#undef CORVANE_LANE

template <class L, class... Ok> constexpr bool lane_is_one_of = (nstd::is_same_c<L, Ok>::value || ...);

// A raw compiler vector of Bytes bytes with lanes of type L.
template <class L, size_t Bytes> struct raw_lanes_c {
  typedef L type __attribute__((vector_size(Bytes)));
};
template <class L, size_t Bytes> using raw_lanes = typename raw_lanes_c<L, Bytes>::type;

// The mode whose vectors have this many bytes.
template <size_t Bytes> constexpr mode_enum bytes_mode = Bytes == 128 ? DualHVX : Bytes == 64 ? SingleHVX : Scalar;

template <mode_enum M> struct gen_wvec;

template <bool C, class A, class B> struct select_c { typedef A type; };
template <class A, class B> struct select_c<false, A, B> { typedef B type; };

// ---- typed vectors and pairs ---------------------------------------------------------

// Vectors == 1: one register of VecBytes bytes; Vectors == 2: a pair, lo (vector 0)
// in the first VecBytes bytes, hi (vector 1) in the next.
template <class Lane, size_t VecBytes, int Vectors = 1> struct vector_type {
  typedef Lane lane_t;
  static constexpr mode_enum mode = bytes_mode<VecBytes>;
  static constexpr size_t vector_bytes = VecBytes;
  static constexpr int vectors = Vectors;
  static constexpr size_t bytes = VecBytes * Vectors;
  static constexpr size_t lanes = bytes / sizeof(Lane);
  typedef raw_lanes<Lane, bytes> raw_t;
  typedef typename select_c<Vectors == 1, gen_vec<mode>, gen_wvec<mode>>::type untyped_t;

  raw_t value;

  vector_type() = default;
  constexpr explicit vector_type(raw_t v) : value(v) {}
  // Same bytes, other lane type: through the untyped vector of the mode.
  vector_type(const untyped_t& v) : value((raw_t)v.value) {}
  operator untyped_t() const { return untyped_t{(typename untyped_t::raw_t)value}; }

  lane_t operator[](size_t i) const { return value[i]; }
};

// Untyped pair of vectors; lo is vector 0, as in a register pair.
template <mode_enum M> struct gen_wvec {
  typedef typename raw_vec_c<M>::type half_t;
  typedef int32_t raw_t __attribute__((vector_size(2 * mode_vector_bytes<M>)));
  static constexpr mode_enum mode = M;
  static constexpr size_t vector_bytes = mode_vector_bytes<M>;
  static constexpr size_t bytes = 2 * vector_bytes;
  static constexpr int vectors = 2;

  raw_t value;

  gen_wvec() = default;
  constexpr explicit gen_wvec(raw_t v) : value(v) {}
  gen_wvec(gen_vec<M> hi, gen_vec<M> lo) {
    __builtin_memcpy(reinterpret_cast<char*>(&value), &lo.value, vector_bytes);
    __builtin_memcpy(reinterpret_cast<char*>(&value) + vector_bytes, &hi.value, vector_bytes);
  }
  // first is hi, second is lo, the order of the (hi, lo) constructor and of unpack.
  gen_wvec(const nstd::pair<gen_vec<M>, gen_vec<M>>& p) : gen_wvec(p.first, p.second) {}
  explicit operator raw_t() const { return value; }
};

template <mode_enum M> inline nstd::pair<gen_vec<M>, gen_vec<M>> unpack(const gen_wvec<M>& w) {
  nstd::pair<gen_vec<M>, gen_vec<M>> p;
  __builtin_memcpy(&p.second.value, reinterpret_cast<const char*>(&w.value), w.vector_bytes);
  __builtin_memcpy(&p.first.value, reinterpret_cast<const char*>(&w.value) + w.vector_bytes, w.vector_bytes);
  return p;
}

#define CORVANE_VECTOR_NAMES(L, name, n64, n128)                           \
  typedef vector_type<L, 64> v##name##x##n64;                             \
  typedef vector_type<L, 128> v##name##x##n128;                           \
  typedef vector_type<L, 64, 2> wv##name##x##n128;
CORVANE_VECTOR_NAMES(uint8_t, u8, 64, 128)
CORVANE_VECTOR_NAMES(int8_t, i8, 64, 128)
CORVANE_VECTOR_NAMES(uint16_t, u16, 32, 64)
CORVANE_VECTOR_NAMES(int16_t, i16, 32, 64)
CORVANE_VECTOR_NAMES(uint32_t, u32, 16, 32)
CORVANE_VECTOR_NAMES(int32_t, i32, 16, 32)
#undef CORVANE_VECTOR_NAMES
typedef vector_type<uint8_t, 128, 2> wvu8x256;
typedef vector_type<int8_t, 128, 2> wvi8x256;
typedef vector_type<uint16_t, 128, 2> wvu16x128;
typedef vector_type<int16_t, 128, 2> wvi16x128;
typedef vector_type<uint32_t, 128, 2> wvu32x64;
typedef vector_type<int32_t, 128, 2> wvi32x64;
static_assert(sizeof(vu8x64) == 64 && sizeof(wvi32x64) == 256, "typed vectors are their raw bytes");

// ---- predicates ------------------------------------------------------------------------

// One flag per byte lane. The portable backend keeps each flag as a whole byte, all
// ones where set, so that vmux and the predicate logic are plain vector expressions.
// A Negated predicate holds the same flags with the sense reversed: its lane i is set
// where the held flag is clear. operator! flips the sense without touching the flags.
template <mode_enum M, bool Negated = false> struct gen_pred_vec {
  static constexpr mode_enum mode = M;
  static constexpr size_t bytes = mode_vector_bytes<M>;
  static constexpr bool negated = Negated;
  typedef raw_lanes<uint8_t, bytes> raw_t;

  raw_t value;

  gen_pred_vec<M, !Negated> operator!() const { return gen_pred_vec<M, !Negated>{value}; }
  // Whether byte lane i is selected.
  bool operator[](size_t i) const { return (value[i] != 0) != Negated; }
};

// ---- scalar operands -------------------------------------------------------------------

// One 32-bit scalar register read as lanes: four bytes, two half-words or one word,
// lane 0 in the low bits. The lane type picks the signed or unsigned form of a multiply.
template <class Lane> struct scalar_word {
  typedef Lane lane_t;
  static constexpr int lanes = 4 / sizeof(Lane);
  uint32_t value;

  constexpr explicit scalar_word(uint32_t word) : value(word) {}
  template <class... Ls, class = nstd::on_if_t<sizeof...(Ls) == lanes && (lanes > 1)>>
  constexpr scalar_word(Ls... ls) : value(pack(0, static_cast<Lane>(ls)...)) {}

  constexpr Lane operator[](int i) const { return static_cast<Lane>(value >> (8 * sizeof(Lane) * i)); }

 private:
  static constexpr uint32_t pack(int) { return 0; }
  template <class... Rest> static constexpr uint32_t pack(int i, Lane l, Rest... rest) {
    return (static_cast<uint32_t>(static_cast<typename lane_traits<Lane>::unsigned_t>(l)) << (8 * sizeof(Lane) * i)) |
           pack(i + 1, rest...);
  }
};
typedef scalar_word<int32_t> vi32x1;
typedef scalar_word<uint32_t> vu32x1;
typedef scalar_word<int16_t> vi16x2;
typedef scalar_word<uint16_t> vu16x2;
typedef scalar_word<int8_t> vi8x4;
typedef scalar_word<uint8_t> vu8x4;

// ---- compile-time selectors ------------------------------------------------------------

template <int Bytes, bool Signed> struct lane_of_c;
template <> struct lane_of_c<1, false> { typedef uint8_t type; };
template <> struct lane_of_c<1, true> { typedef int8_t type; };
template <> struct lane_of_c<2, false> { typedef uint16_t type; };
template <> struct lane_of_c<2, true> { typedef int16_t type; };
template <> struct lane_of_c<4, false> { typedef uint32_t type; };
template <> struct lane_of_c<4, true> { typedef int32_t type; };

template <mode_enum M, int LaneBytes, bool Signed> struct make_vec_c {
  typedef vector_type<typename lane_of_c<LaneBytes, Signed>::type, mode_vector_bytes<M>> type;
};
template <mode_enum M, int LaneBytes, bool Signed> struct make_wvec_c {
  typedef vector_type<typename lane_of_c<LaneBytes, Signed>::type, mode_vector_bytes<M>, 2> type;
};
template <mode_enum M, int LaneBytes, bool Signed> using make_vec_t = typename make_vec_c<M, LaneBytes, Signed>::type;
template <mode_enum M, int LaneBytes, bool Signed> using make_wvec_t = typename make_wvec_c<M, LaneBytes, Signed>::type;

// Mode-relative names for kernel templates: `typedef hvx::vu8_t<M> vu8;`.
template <mode_enum M> using vu8_t = make_vec_t<M, 1, false>;
template <mode_enum M> using vi8_t = make_vec_t<M, 1, true>;
template <mode_enum M> using vu16_t = make_vec_t<M, 2, false>;
template <mode_enum M> using vi16_t = make_vec_t<M, 2, true>;
template <mode_enum M> using vu32_t = make_vec_t<M, 4, false>;
template <mode_enum M> using vi32_t = make_vec_t<M, 4, true>;
template <mode_enum M> using wvu8_t = make_wvec_t<M, 1, false>;
template <mode_enum M> using wvi8_t = make_wvec_t<M, 1, true>;
template <mode_enum M> using wvu16_t = make_wvec_t<M, 2, false>;
template <mode_enum M> using wvi16_t = make_wvec_t<M, 2, true>;
template <mode_enum M> using wvu32_t = make_wvec_t<M, 4, false>;
template <mode_enum M> using wvi32_t = make_wvec_t<M, 4, true>;
template <mode_enum M> using vec_t = gen_vec<M>;
template <mode_enum M> using wvec_t = gen_wvec<M>;
template <mode_enum M> using qvec_t = gen_pred_vec<M, false>;
template <mode_enum M> using qnvec_t = gen_pred_vec<M, true>;

namespace detail {
template <mode_enum M, int LaneBits> struct vec_len_helper {
  static constexpr int value = static_cast<int>(mode_vector_bytes<M> * 8 / LaneBits);
};
}  // namespace detail

// Lanes of LaneBits bits in one vector of mode M.
template <mode_enum M, int LaneBits> constexpr int vlen() { return detail::vec_len_helper<M, LaneBits>::value; }
template <class V> constexpr int lane_bytes() { return static_cast<int>(sizeof(typename V::lane_t)); }
template <class V> constexpr int lane_count() { return static_cast<int>(V::lanes); }

// The wrappers return typed vectors, which convert to vec themselves; ret_vec<T> names
// such a result for a mode and checks that T is one vector (or one pair) of it.
template <mode_enum M, class T, int Vectors> struct ret_vec_c {
  static_assert(T::mode == M && T::vectors == Vectors, "result type of another mode or shape");
  typedef T type;
};
template <mode_enum M, class T> using gen_ret_vec = typename ret_vec_c<M, T, 1>::type;
template <mode_enum M, class T> using gen_ret_wvec = typename ret_vec_c<M, T, 2>::type;
// The same with the mode taken from T.
template <class T> using ret_vec = gen_ret_vec<T::mode, T>;
template <class T> using ret_wvec = gen_ret_wvec<T::mode, T>;

// ---- shapes ----------------------------------------------------------------------------

// The pair type of a plain vector type, and the vector type of a pair's halves.
template <class V> struct wide_of_c;
template <class L, size_t B> struct wide_of_c<vector_type<L, B, 1>> { typedef vector_type<L, B, 2> type; };
template <mode_enum M> struct wide_of_c<gen_vec<M>> { typedef gen_wvec<M> type; };
template <class V> using wide_of = typename wide_of_c<V>::type;

template <class W> struct half_of_c;
template <class L, size_t B> struct half_of_c<vector_type<L, B, 2>> { typedef vector_type<L, B, 1> type; };
template <mode_enum M> struct half_of_c<gen_wvec<M>> { typedef gen_vec<M> type; };
template <class W> using half_of = typename half_of_c<W>::type;

// Reinterprets the bytes of one vector (or pair) as another type of the same size.
template <class To, class From> inline To vcast(const From& v) {
  static_assert(sizeof(To) == sizeof(From), "vcast keeps the size");
  To r;
  __builtin_memcpy(&r, &v, sizeof(To));
  return r;
}

CORVANE_ISA_END
}  // namespace hvx

#endif
