// The in-process transport: a call to a method, given exactly the arguments of its
// exported function corvane_<name>, is marshalled into remote_args as the wire format
// says and run through corvane_skel_invoke. Every buffer travels by pointer to the
// caller's own memory, input or output: several methods read what the caller left in an
// output buffer. Rout and inrout scalars are written back only when the call succeeds.
//
//   call<method::identity>(&src.descriptor(), &src.mbuf(), &dst.mbuf());
//
// An inrout sequence travels in one buffer for both directions, so the skeleton copies
// nothing.
#ifndef CORVANE_CLIENT_CALL_H
#define CORVANE_CLIENT_CALL_H

#include <stddef.h>
#include <stdint.h>

#include <cstring>
#include <type_traits>
#include <utility>

#include "remote/method_table.h"
#include "remote/signature.h"

namespace corvane {
namespace client {

namespace method = remote::method;

// One argument of an exported function with its type erased: a pointer, or the bits of a
// value (an integer widened, a float or double by its bit pattern).
struct c_arg {
  void* ptr;
  uint64_t bits;
};

// What carries a marshalled call: corvane_skel_invoke, or a stand-in that looks at the call.
using transport = int (*)(uint32_t sc, remote_arg* pra);

// Marshals method `number` and hands it to `via`; `args` holds the exported function's
// arguments in order.
AEEResult invoke(int number, const c_arg* args, transport via = &corvane_skel_invoke);

namespace detail {

template <class T> c_arg pack(T value) {
  if constexpr (std::is_pointer_v<T>) {
    return c_arg{const_cast<void*>(static_cast<const void*>(value)), 0};
  } else if constexpr (std::is_floating_point_v<T>) {
    c_arg a{nullptr, 0};
    std::memcpy(&a.bits, &value, sizeof(T));
    return a;
  } else {
    return c_arg{nullptr, uint64_t(int64_t(value))};
  }
}

// Converts as a call to the exported function would.
template <class T> T as_parameter(T value) { return value; }

template <int N, size_t... J, class... A>
AEEResult call(transport via, std::index_sequence<J...>, A&&... args) {
  const c_arg packed[] = {pack(as_parameter<remote::c_arg_t<N, J>>(std::forward<A>(args)))..., c_arg{nullptr, 0}};
  return invoke(N, packed, via);
}

}  // namespace detail

template <int N, class... A> AEEResult call_via(transport via, A&&... args) {
  static_assert(N >= 0 && N < remote::kMethodCount, "no such method");
  static_assert(sizeof...(A) == size_t(remote::kPlans[N].num_args),
                "a call takes the arguments of the method's exported function");
  return detail::call<N>(via, std::index_sequence_for<A...>{}, std::forward<A>(args)...);
}

template <int N, class... A> AEEResult call(A&&... args) {
  return call_via<N>(&corvane_skel_invoke, std::forward<A>(args)...);
}

}  // namespace client
}  // namespace corvane

#endif
