// Non-owning views of an image: a memory record and a descriptor, read untyped
// (gen_in, gen_out) or in units of T (in<T>, out<T>). Accessors do no checking.
#ifndef CORVANE_CORE_MEMBUF_H
#define CORVANE_CORE_MEMBUF_H

#include "core/nstd.h"
#include "remote/corvane.h"

typedef corvane_mbuf mbuf;
typedef const corvane_mbufd mbufd;
typedef const corvane_mbuf imbuf;
typedef corvane_mbuf ombuf;

struct InOutPtrBase {
  const mbuf* buffer = nullptr;
  const corvane_mbufd* descriptor = nullptr;

  InOutPtrBase() = default;
  InOutPtrBase(const corvane_mbufd* desc, const mbuf* buf) : buffer(buf), descriptor(desc) {}

  int stride_bytes() const { return descriptor->stride; }
  int cols() const { return descriptor->cols; }
  int rows() const { return descriptor->rows; }
  int channels() const { return descriptor->channels; }
  int depth() const { return descriptor->depth; }
  int border_left() const { return descriptor->border_left; }
  int border_right() const { return descriptor->border_right; }
  int border_top() const { return descriptor->border_top; }
  int border_bottom() const { return descriptor->border_bottom; }
  // The bytes that the rows span: stride * rows (not memLen).
  size_t byte_size() const {
    return static_cast<size_t>(descriptor->stride) * static_cast<size_t>(descriptor->rows);
  }
  uint8_t* ptr() const { return buffer->mem; }
};

// Untyped view that marks only direction, so an input never becomes a mutable view.
template <bool Input> struct GenInOutPtr : InOutPtrBase {
  GenInOutPtr() = default;
  GenInOutPtr(const corvane_mbufd* desc, const mbuf* buf) : InOutPtrBase(desc, buf) {}
};
typedef GenInOutPtr<true> gen_in;
typedef GenInOutPtr<false> gen_out;

template <class T> struct is_const_c { static constexpr bool value = false; };
template <class T> struct is_const_c<const T> { static constexpr bool value = true; };

// Typed view: walks the image in units of T; const T makes it an input.
template <class T> struct InOutPtr : InOutPtrBase {
  static constexpr bool input_p = is_const_c<T>::value;
  static constexpr size_t unit = sizeof(T);
  static_assert((unit & (unit - 1)) == 0, "view units are powers of two");
  typedef typename nstd::copy_const_c<T, mbuf>::type* construct_ptr_t;
  typedef typename nstd::copy_const_c<T, uint8_t>::type* byte_ptr_t;
  typedef T* iterator;
  typedef const T* const_iterator;

  InOutPtr() = default;
  InOutPtr(const GenInOutPtr<input_p>& generic) : InOutPtrBase(generic) {}
  InOutPtr(const corvane_mbufd* desc, construct_ptr_t buf) : InOutPtrBase(desc, buf) {}

  iterator begin() const { return reinterpret_cast<iterator>(ptr()); }
  const_iterator cbegin() const { return begin(); }
  size_t vector_size() const { return byte_size() / unit; }
  iterator vector_end() const { return begin() + vector_size(); }
  const_iterator vector_cend() const { return vector_end(); }
  size_t stride_vectors() const { return static_cast<unsigned>(stride_bytes()) / unit; }
  size_t scalar_tail_bytes() const { return byte_size() % unit; }
  byte_ptr_t scalar_begin_ptr() const { return reinterpret_cast<byte_ptr_t>(vector_end()); }
  byte_ptr_t scalar_end_ptr() const { return scalar_begin_ptr() + scalar_tail_bytes(); }
  iterator allocated_end() const { return reinterpret_cast<iterator>(ptr() + buffer->memLen); }
  const_iterator allocated_cend() const { return allocated_end(); }
};
template <class T> using in = InOutPtr<const T>;
template <class T> using out = InOutPtr<T>;

// N views that share one descriptor, with N memory records.
template <bool Input, size_t N> struct GenInOutArray {
  GenInOutPtr<Input> buffers[N];

  template <class... Bufs> GenInOutArray(const corvane_mbufd* desc, Bufs... bufs) {
    static_assert(sizeof...(Bufs) == N, "one memory record per view");
    const mbuf* records[N] = {bufs...};
    for (size_t i = 0; i < N; ++i) buffers[i] = GenInOutPtr<Input>(desc, records[i]);
  }
  GenInOutPtr<Input>& operator[](size_t i) { return buffers[i]; }
  const GenInOutPtr<Input>& operator[](size_t i) const { return buffers[i]; }
  static constexpr size_t size() { return N; }
};

template <class T, size_t N> struct InOutArray {
  typedef typename InOutPtr<T>::construct_ptr_t construct_ptr_t;
  InOutPtr<T> buffers[N];

  InOutArray(const GenInOutArray<InOutPtr<T>::input_p, N>& generic) {
    for (size_t i = 0; i < N; ++i) buffers[i] = InOutPtr<T>(generic[i]);
  }
  InOutArray(const corvane_mbufd* desc, const construct_ptr_t (&bufs)[N]) {
    for (size_t i = 0; i < N; ++i) buffers[i] = InOutPtr<T>(desc, bufs[i]);
  }
  InOutPtr<T>& operator[](size_t i) { return buffers[i]; }
  const InOutPtr<T>& operator[](size_t i) const { return buffers[i]; }
  static constexpr size_t size() { return N; }
};

#endif
