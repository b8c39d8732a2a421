// The C signature that a method row gives its exported function: a memory record or a
// descriptor by pointer, a sequence as pointer and int length in elements (the pointer
// const for an input), an input scalar by value, a rout or inrout scalar by pointer. The
// skeleton checks every declaration in corvane.h against it at compile time, and the
// client converts a call's arguments to it.
#ifndef CORVANE_REMOTE_SIGNATURE_H
#define CORVANE_REMOTE_SIGNATURE_H

#include <stddef.h>
#include <stdint.h>

#include "core/nstd.h"
#include "remote/corvane.h"
#include "remote/wire_plan.h"

namespace corvane {
namespace remote {

template <kind K> struct value_c;
template <> struct value_c<kind::u8> { using type = uint8_t; };
template <> struct value_c<kind::i32> { using type = int32_t; };
template <> struct value_c<kind::u32> { using type = uint32_t; };
template <> struct value_c<kind::u64> { using type = uint64_t; };
template <> struct value_c<kind::f32> { using type = float; };
template <> struct value_c<kind::f64> { using type = double; };
template <> struct value_c<kind::seq_u8> { using type = uint8_t; };
template <> struct value_c<kind::seq_i16> { using type = int16_t; };
template <> struct value_c<kind::seq_i32> { using type = int32_t; };
template <> struct value_c<kind::seq_u32> { using type = uint32_t; };
template <> struct value_c<kind::seq_f32> { using type = float; };
template <> struct value_c<kind::seq_line> { using type = fcvLine; };
template <> struct value_c<kind::string> { using type = char; };
template <kind K> using value_t = typename value_c<K>::type;

template <class T> struct type_c { using type = T; };

template <kind K, dir D, int Part> constexpr auto c_arg_of() {
  if constexpr (K == kind::mbufd) return type_c<const corvane_mbufd*>{};
  else if constexpr (K == kind::imbuf) return type_c<const corvane_mbuf*>{};
  else if constexpr (K == kind::ombuf) return type_c<corvane_mbuf*>{};
  else if constexpr (K == kind::border) return type_c<const corvane_border_value_info*>{};
  else if constexpr (is_sequence(K) && Part == 1) return type_c<int>{};
  else if constexpr (is_sequence(K) && D == dir::in) return type_c<const value_t<K>*>{};
  else if constexpr (is_sequence(K)) return type_c<value_t<K>*>{};
  else if constexpr (D == dir::in) return type_c<value_t<K>>{};
  else return type_c<value_t<K>*>{};
}

template <int N, size_t J> constexpr param_plan param_of_arg() { return kPlans[N].params[kPlans[N].args[J].param]; }

template <int N, size_t J>
using c_arg_t = typename decltype(c_arg_of<param_of_arg<N, J>().k, param_of_arg<N, J>().d,
                                           kPlans[N].args[J].part>())::type;

template <int N, class... A, size_t... J>
constexpr bool signature_matches(AEEResult (*)(A...), nstd::integer_sequence<size_t, J...>) {
  return (nstd::is_same_c<A, c_arg_t<N, J>>::value && ...);
}

template <int N, class... A> constexpr bool signature_matches(AEEResult (*fn)(A...)) {
  if constexpr (sizeof...(A) != size_t(kPlans[N].num_args)) return false;
  else return signature_matches<N>(fn, nstd::make_integer_sequence<size_t, sizeof...(A)>{});
}

}  // namespace remote
}  // namespace corvane

#endif
