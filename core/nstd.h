// The few standard-library pieces that DSP code uses, written for a build without the
// C++ library: moves, tags, type selectors, a fixed array and integer sequences.
#ifndef CORVANE_CORE_NSTD_H
#define CORVANE_CORE_NSTD_H

#include <stddef.h>
#include <stdint.h>

#if defined(__hexagon__)
inline void* operator new(size_t, void* p) noexcept { return p; }
#else
#include <new>
#endif

namespace nstd {

template <class T> struct remove_reference_c { using type = T; };
template <class T> struct remove_reference_c<T&> { using type = T; };
template <class T> struct remove_reference_c<T&&> { using type = T; };
template <class T> using remove_reference_t = typename remove_reference_c<T>::type;

template <class T> constexpr remove_reference_t<T>&& move(T&& t) noexcept {
  return static_cast<remove_reference_t<T>&&>(t);
}
template <class T> constexpr T&& forward(remove_reference_t<T>& t) noexcept { return static_cast<T&&>(t); }
template <class T> constexpr T&& forward(remove_reference_t<T>&& t) noexcept { return static_cast<T&&>(t); }

template <class T> inline void swap(T& a, T& b) noexcept {
  T t = move(a);
  a = move(b);
  b = move(t);
}

template <class T> constexpr const T& min(const T& a, const T& b) { return b < a ? b : a; }
template <class T> constexpr const T& max(const T& a, const T& b) { return a < b ? b : a; }

// Target type with the constness of the source type.
template <class Src, class Dst> struct copy_const_c { using type = Dst; };
template <class Src, class Dst> struct copy_const_c<const Src, Dst> { using type = const Dst; };

// Enables a template for a condition (the library's enable_if).
template <bool On, class T = void> struct on_if_c {};
template <class T> struct on_if_c<true, T> { using type = T; };
template <bool On, class T = void> using on_if_t = typename on_if_c<On, T>::type;

template <class A, class B> struct is_same_c { static constexpr bool value = false; };
template <class A> struct is_same_c<A, A> { static constexpr bool value = true; };

template <class T, size_t N> constexpr size_t array_size(const T (&)[N]) { return N; }

template <class T, size_t N> struct array {
  T items[N];
  constexpr T& operator[](size_t i) { return items[i]; }
  constexpr const T& operator[](size_t i) const { return items[i]; }
  static constexpr size_t size() { return N; }
};

template <class A, class B> struct pair {
  A first;
  B second;
};

// tie(a, b) = pair: assigns the two members to two variables.
template <class A, class B> struct tied_pair {
  A& first;
  B& second;
  template <class C, class D> tied_pair& operator=(const pair<C, D>& p) {
    first = p.first;
    second = p.second;
    return *this;
  }
};
template <class A, class B> tied_pair<A, B> tie(A& a, B& b) { return {a, b}; }

template <class T, T... I> struct integer_sequence {};
#if defined(__clang__)
template <class T, T N> using make_integer_sequence = __make_integer_seq<integer_sequence, T, N>;
#else
template <class T, T N> using make_integer_sequence = integer_sequence<T, __integer_pack(N)...>;
#endif

// Lock tags.
struct try_lock_c {};
struct defer_lock_c {};
struct adopt_lock_c {};

}  // namespace nstd

#endif
