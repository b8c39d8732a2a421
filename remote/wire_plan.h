// Where each parameter of a method travels, derived from its row of the method table:
// its offset in the primary input and output buffers, the buffer that carries its data,
// and which arguments of the exported function it becomes. The skeleton unmarshals by
// this plan and the client marshals by it.
//
// The primary input (the first input buffer) holds, in parameter order from offset 0, or
// from 4 behind the method word of escaped methods, every input scalar and descriptor and
// every sequence length; the primary output (the first output buffer) holds the rout and
// inrout scalars. Each sequence has a buffer of its own: input sequences from _pra[1],
// output sequences behind the primary output. An inrout sequence has one of each.
#ifndef CORVANE_REMOTE_WIRE_PLAN_H
#define CORVANE_REMOTE_WIRE_PLAN_H

#include "remote/method_table.h"

namespace corvane {
namespace remote {

constexpr int kMaxArgs = 32;

struct param_plan {
  kind k;
  dir d;
  int16_t in_off;   // [bytes] in the primary input, method word included; -1 if none
  int16_t out_off;  // [bytes] in the primary output; -1 if none
  int8_t in_buf;    // input sequence buffer, 0 being _pra[1]; -1 if none
  int8_t out_buf;   // output sequence buffer, 0 being the first behind the primary output; -1 if none
};

// One argument of the exported function: which parameter, and for a sequence whether it
// is the pointer (part 0) or the length (part 1).
struct arg_ref {
  int8_t param;
  int8_t part;
};

struct method_plan {
  int number;
  int count;  // parameters
  param_plan params[kMaxParams];
  int base;            // [bytes] before the first parameter: 4 for an escaped method's word
  bool has_prim_in;    // any input scalar, descriptor or sequence
  bool has_prim_out;   // any rout or inrout scalar
  int prim_in_size;    // [bytes] without the method word
  int prim_in_align;   // largest alignment in the primary input, 0 without one
  int prim_out_size;   // [bytes]
  int prim_out_align;  // largest alignment in the primary output, 0 without one
  int in_bufs;         // input buffers, the primary one included
  int out_bufs;        // output buffers, the primary one included
  int num_args;        // arguments of the exported function
  arg_ref args[kMaxArgs];
};

// Bytes and alignment that a parameter takes in the primary input.
struct footprint {
  int size;
  int align;
};

constexpr footprint prim_in_footprint(const param& p) {
  if (p.k == kind::mbufd) return {36, 4};
  if (p.k == kind::border) return {32, 1};
  if (is_sequence(p.k)) return {p.d == dir::inrout ? 8 : 4, 4};  // lengths in elements
  if (p.d == dir::rout) return {0, 1};
  return {unit_size(p.k), unit_size(p.k)};
}

constexpr footprint prim_out_footprint(const param& p) {
  if (is_scalar(p.k) && p.d != dir::in) return {unit_size(p.k), unit_size(p.k)};
  return {0, 1};
}

constexpr int align_up(int offset, int align) { return (offset + align - 1) / align * align; }

constexpr method_plan plan_of(const method_info& m) {
  method_plan plan{};
  plan.number = m.number;
  plan.count = m.params.count;
  plan.base = m.number >= kFirstEscapedMethod ? 4 : 0;
  int in_off = plan.base, out_off = 0, in_seq = 0, out_seq = 0;
  for (int i = 0; i < m.params.count; ++i) {
    const param& p = m.params.items[i];
    param_plan& q = plan.params[i];
    q.k = p.k;
    q.d = p.d;
    q.in_off = q.out_off = -1;
    q.in_buf = q.out_buf = -1;

    const footprint fin = prim_in_footprint(p);
    if (fin.size > 0) {
      in_off = align_up(in_off, fin.align);
      q.in_off = int16_t(in_off);
      in_off += fin.size;
      plan.has_prim_in = true;
      plan.prim_in_align = plan.prim_in_align > fin.align ? plan.prim_in_align : fin.align;
    }
    const footprint fout = prim_out_footprint(p);
    if (fout.size > 0) {
      out_off = align_up(out_off, fout.align);
      q.out_off = int16_t(out_off);
      out_off += fout.size;
      plan.has_prim_out = true;
      plan.prim_out_align = plan.prim_out_align > fout.align ? plan.prim_out_align : fout.align;
    }
    if (is_sequence(p.k)) {
      if (p.d != dir::rout) q.in_buf = int8_t(in_seq++);
      if (p.d != dir::in) q.out_buf = int8_t(out_seq++);
      plan.args[plan.num_args++] = arg_ref{int8_t(i), 0};
      // A memory record travels as one pointer; other sequences as pointer and length.
      if (p.k != kind::imbuf && p.k != kind::ombuf) plan.args[plan.num_args++] = arg_ref{int8_t(i), 1};
    } else {
      plan.args[plan.num_args++] = arg_ref{int8_t(i), 0};
    }
  }
  plan.prim_in_size = plan.has_prim_in ? in_off - plan.base : 0;
  plan.prim_out_size = out_off;
  plan.in_bufs = in_seq + (plan.has_prim_in ? 1 : 0);
  plan.out_bufs = out_seq + (plan.has_prim_out ? 1 : 0);
  return plan;
}

struct method_plans {
  method_plan items[kMethodCount];
  constexpr const method_plan& operator[](int i) const { return items[i]; }
};

constexpr method_plans make_plans() {
  method_plans plans{};
  for (int m = 0; m < kMethodCount; ++m) plans.items[m] = plan_of(kMethods[m]);
  return plans;
}

inline constexpr method_plans kPlans = make_plans();

}  // namespace remote
}  // namespace corvane

#endif
