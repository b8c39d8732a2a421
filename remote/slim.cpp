// The description record corvane_slim, built at compile time from the method table.
// Identical records share storage: methods whose parameters, buffer counts and primary
// sizes agree have one Method record; parameters and types are kept once each; a method's
// parameter list reuses a run already present in the shared pointer array, or overlaps its
// tail; names are kept once in the string blob. All tables are constant data with
// constant initialisers: nothing runs at load time.
#include <stddef.h>
#include <stdint.h>

#include "core/nstd.h"
#include "remote/corvane.h"
#include "remote/slim_tables.h"
#include "remote/wire_plan.h"

namespace corvane {
namespace remote {
namespace slim {

// ---- What the records describe ----

// Types that a record refers to by pointer: sequence elements, structure members, array items.
enum class shape : int8_t { i32, u8, i16, u32, f32, seq_u8, bytes32, point2f, line, count };
// Structures.
enum class record : int8_t { mbufd, mbuf, border, point2f, line, none, count = none };

struct record_desc {
  int n_members;
  shape members[9];
  const char* names[9];
  int in_size, rout_prim_in, rout_prim_rout;
  uint8_t in_align, rout_prim_in_align, rout_prim_rout_align;
};

constexpr shape I = shape::i32;
constexpr record_desc kRecords[] = {
    {9, {I, I, I, I, I, I, I, I, I},
     {"stride", "cols", "rows", "channels", "depth", "border_left", "border_right", "border_top", "border_bottom"},
     36, 0, 36, 4, 1, 4},
    // A memory record holds one byte sequence: its length word travels, its bytes have a buffer.
    {1, {shape::seq_u8}, {"mem"}, 4, 4, 0, 4, 4, 1},
    {1, {shape::bytes32}, {"val"}, 32, 0, 32, 1, 1, 1},
    {2, {shape::f32, shape::f32}, {"x", "y"}, 8, 0, 8, 4, 1, 4},
    {2, {shape::point2f, shape::point2f}, {"start", "end"}, 16, 0, 16, 4, 1, 4},
};

// A counted sequence in an exported function: a pointer and an int.
struct native_sequence {
  void* data;
  int len;
};

constexpr record record_of(kind k) {
  switch (k) {
    case kind::mbufd: return record::mbufd;
    case kind::imbuf: case kind::ombuf: return record::mbuf;
    case kind::border: return record::border;
    default: return record::none;
  }
}

constexpr record record_of(shape s) {
  return s == shape::point2f ? record::point2f : s == shape::line ? record::line : record::none;
}

constexpr shape element_of(kind k) {
  switch (k) {
    case kind::seq_i16: return shape::i16;
    case kind::seq_i32: return shape::i32;
    case kind::seq_u32: return shape::u32;
    case kind::seq_f32: return shape::f32;
    case kind::seq_line: return shape::line;
    default: return shape::u8;
  }
}

// Parameters are told apart by what they carry and which way it goes; the records of two
// parameters agree exactly when these agree.
struct param_key {
  kind k;
  dir d;
};

// ---- The plan: which records exist and how they refer to each other ----

constexpr int kCapParams = 64, kCapParamRefs = 512, kCapTypes = 16, kCapTypeRefs = 32, kCapStructs = 8;
constexpr int kCapEntries = 2048, kCapChars = 4096;

struct plan_t {
  int n_methods;
  int method_number[kMethodCount];  // per record: the first method number it describes
  int method_params_at[kMethodCount];  // per record: offset of its list in param_refs
  int record_of_method[kMethodCount];
  int n_params;
  param_key params[kCapParams];
  int n_param_refs;
  int8_t param_refs[kCapParamRefs];
  int n_types;
  shape types[kCapTypes];
  int n_structs;
  record structs[kCapStructs];
  int struct_members_at[kCapStructs];
  int n_type_refs;
  int8_t type_refs[kCapTypeRefs];
  int n_entries;
  uint16_t entries[kCapEntries];
  uint16_t method_entries_at[kMethodCount];
  int n_chars;
  char chars[kCapChars];
};

constexpr bool same_text(const char* a, const char* b) {
  while (*a != 0 && *a == *b) ++a, ++b;
  return *a == *b;
}

constexpr int index_of_type(const plan_t& p, shape s) {
  for (int i = 0; i < p.n_types; ++i)
    if (p.types[i] == s) return i;
  return -1;
}

constexpr int index_of_struct(const plan_t& p, record r) {
  for (int i = 0; i < p.n_structs; ++i)
    if (p.structs[i] == r) return i;
  return -1;
}

constexpr int index_of_param(const plan_t& p, param_key k) {
  for (int i = 0; i < p.n_params; ++i)
    if (p.params[i].k == k.k && p.params[i].d == k.d) return i;
  return -1;
}

constexpr void use_struct(plan_t& p, record r);

constexpr void use_type(plan_t& p, shape s) {
  if (index_of_type(p, s) >= 0) return;
  p.types[p.n_types++] = s;
  if (record_of(s) != record::none) use_struct(p, record_of(s));
  if (s == shape::seq_u8 || s == shape::bytes32) use_type(p, shape::u8);
}

constexpr void use_struct(plan_t& p, record r) {
  if (index_of_struct(p, r) >= 0) return;
  p.structs[p.n_structs++] = r;
  const record_desc& d = kRecords[int(r)];
  for (int i = 0; i < d.n_members; ++i) use_type(p, d.members[i]);
}

constexpr void use_param(plan_t& p, param_key k) {
  if (index_of_param(p, k) >= 0) return;
  p.params[p.n_params++] = k;
  if (record_of(k.k) != record::none) use_struct(p, record_of(k.k));
  else if (is_sequence(k.k) && k.k != kind::string) use_type(p, element_of(k.k));
}

constexpr bool same_method(const plan_t& p, int a, int b) {
  const method_plan &x = kPlans[a], &y = kPlans[b];
  if (x.in_bufs != y.in_bufs || x.out_bufs != y.out_bufs || x.prim_in_size != y.prim_in_size ||
      x.prim_out_size != y.prim_out_size || x.prim_in_align != y.prim_in_align ||
      x.prim_out_align != y.prim_out_align || x.num_args != y.num_args || x.count != y.count)
    return false;
  for (int i = 0; i < x.count; ++i)
    if (index_of_param(p, {x.params[i].k, x.params[i].d}) != index_of_param(p, {y.params[i].k, y.params[i].d}))
      return false;
  return true;
}

// Places a method's parameter list in the shared array: where it already runs, or behind
// the longest tail of the array that starts it.
constexpr int place_params(plan_t& p, const method_plan& m) {
  int8_t list[kMaxParams] = {};
  for (int i = 0; i < m.count; ++i) list[i] = int8_t(index_of_param(p, {m.params[i].k, m.params[i].d}));
  for (int at = 0; at + m.count <= p.n_param_refs; ++at) {
    int i = 0;
    while (i < m.count && p.param_refs[at + i] == list[i]) ++i;
    if (i == m.count) return at;
  }
  int overlap = m.count < p.n_param_refs ? m.count : p.n_param_refs;
  for (; overlap > 0; --overlap) {
    int i = 0;
    while (i < overlap && p.param_refs[p.n_param_refs - overlap + i] == list[i]) ++i;
    if (i == overlap) break;
  }
  const int at = p.n_param_refs - overlap;
  for (int i = overlap; i < m.count; ++i) p.param_refs[p.n_param_refs++] = list[i];
  return at;
}

constexpr uint16_t use_string(plan_t& p, const char* s) {
  for (int at = 0; at < p.n_chars; at += 1) {
    if (same_text(p.chars + at, s)) return uint16_t(at);
    while (p.chars[at] != 0) ++at;
  }
  const int at = p.n_chars;
  while (*s != 0) p.chars[p.n_chars++] = *s++;
  p.chars[p.n_chars++] = 0;
  return uint16_t(at);
}

// A method's names: its own, then each parameter's, each structure followed by its members.
constexpr void add_names(plan_t& p, const method_info& m) {
  p.method_entries_at[m.number] = uint16_t(p.n_entries);
  p.entries[p.n_entries++] = use_string(p, m.name);
  for (int i = 0; i < m.params.count; ++i) {
    const param& q = m.params.items[i];
    p.entries[p.n_entries++] = use_string(p, q.name);
    const record r = record_of(q.k);
    if (r == record::none) continue;
    for (int k = 0; k < kRecords[int(r)].n_members; ++k) p.entries[p.n_entries++] = use_string(p, kRecords[int(r)].names[k]);
  }
}

constexpr plan_t make_plan() {
  plan_t p{};
  for (int m = 0; m < kMethodCount; ++m)
    for (int i = 0; i < kPlans[m].count; ++i) use_param(p, {kPlans[m].params[i].k, kPlans[m].params[i].d});
  for (int s = 0; s < p.n_structs; ++s) {
    const record_desc& d = kRecords[int(p.structs[s])];
    p.struct_members_at[s] = p.n_type_refs;
    for (int i = 0; i < d.n_members; ++i) p.type_refs[p.n_type_refs++] = int8_t(index_of_type(p, d.members[i]));
  }
  for (int m = 0; m < kMethodCount; ++m) {
    int r = 0;
    while (r < p.n_methods && !same_method(p, p.method_number[r], m)) ++r;
    if (r == p.n_methods) {
      p.method_number[r] = m;
      p.method_params_at[r] = place_params(p, kPlans[m]);
      ++p.n_methods;
    }
    p.record_of_method[m] = r;
  }
  for (int m = 0; m < kMethodCount; ++m) add_names(p, kMethods[m]);
  return p;
}

constexpr plan_t kPlan = make_plan();

// ---- The records ----

extern const nstd::array<corvane_slim_type, kPlan.n_types> types;
extern const nstd::array<const corvane_slim_type*, kPlan.n_type_refs> typeArrays;
extern const nstd::array<corvane_slim_struct_type, kPlan.n_structs> structTypes;
extern const nstd::array<corvane_slim_parameter, kPlan.n_params> parameters;
extern const nstd::array<const corvane_slim_parameter*, kPlan.n_param_refs> parameterArrays;
extern const nstd::array<corvane_slim_method, kPlan.n_methods> methods;
extern const nstd::array<const corvane_slim_method*, kMethodCount> methodArrays;

constexpr const corvane_slim_struct_type* struct_ptr(record r) { return &structTypes[index_of_struct(kPlan, r)]; }
constexpr const corvane_slim_type* type_ptr(shape s) { return &types[index_of_type(kPlan, s)]; }

constexpr corvane_slim_type_param prim(bool floating, bool is_signed) {
  return corvane_slim_type_param(uint8_t(floating), uint8_t(is_signed));
}

constexpr corvane_slim_type type_record(shape s) {
  using P = corvane_slim_type_param;
  switch (s) {
    case shape::i32: return {4, prim(false, true), CORVANE_SLIM_PRIMITIVE, 4};
    case shape::u8: return {1, prim(false, false), CORVANE_SLIM_PRIMITIVE, 1};
    case shape::i16: return {2, prim(false, true), CORVANE_SLIM_PRIMITIVE, 2};
    case shape::u32: return {4, prim(false, false), CORVANE_SLIM_PRIMITIVE, 4};
    case shape::f32: return {4, prim(true, true), CORVANE_SLIM_PRIMITIVE, 4};
    case shape::seq_u8:
      return {int32_t(sizeof(native_sequence)), P(P::sequence_tag{}, type_ptr(shape::u8), 0), CORVANE_SLIM_SEQUENCE,
              uint8_t(alignof(native_sequence))};
    case shape::bytes32: return {32, P(P::array_tag{}, type_ptr(shape::u8), 32), CORVANE_SLIM_ARRAY, 1};
    case shape::point2f:
      return {int32_t(sizeof(corvane_point2f)), P(struct_ptr(record::point2f)), CORVANE_SLIM_STRUCT,
              uint8_t(alignof(corvane_point2f))};
    default:
      return {int32_t(sizeof(fcvLine)), P(struct_ptr(record::line)), CORVANE_SLIM_STRUCT, uint8_t(alignof(fcvLine))};
  }
}

constexpr corvane_slim_parameter parameter_record(param_key key) {
  using P = corvane_slim_type_param;
  const uint8_t mode = uint8_t(key.d);
  switch (key.k) {
    case kind::mbufd:
      return {36, P(struct_ptr(record::mbufd)), CORVANE_SLIM_STRUCT, alignof(corvane_mbufd), mode, 0};
    case kind::imbuf: case kind::ombuf:
      return {int32_t(sizeof(corvane_mbuf)), P(struct_ptr(record::mbuf)), CORVANE_SLIM_STRUCT_WITH_SEQUENCE,
              alignof(corvane_mbuf), mode, 0};
    case kind::border: return {32, P(struct_ptr(record::border)), CORVANE_SLIM_STRUCT, 1, mode, 0};
    case kind::u8: return {1, prim(false, false), CORVANE_SLIM_PRIMITIVE, 1, mode, 0};
    case kind::i32: return {4, prim(false, true), CORVANE_SLIM_PRIMITIVE, 4, mode, 0};
    case kind::u32: return {4, prim(false, false), CORVANE_SLIM_PRIMITIVE, 4, mode, 0};
    case kind::u64: return {8, prim(false, false), CORVANE_SLIM_PRIMITIVE, alignof(uint64_t), mode, 0};
    case kind::f32: return {4, prim(true, true), CORVANE_SLIM_PRIMITIVE, 4, mode, 0};
    case kind::f64: return {8, prim(true, true), CORVANE_SLIM_PRIMITIVE, alignof(double), mode, 0};
    case kind::string:
      return {int32_t(sizeof(native_sequence)), P(), CORVANE_SLIM_STRING, alignof(native_sequence), mode, 0};
    default:
      return {int32_t(sizeof(native_sequence)), P(P::sequence_tag{}, type_ptr(element_of(key.k)), 0),
              CORVANE_SLIM_SEQUENCE, alignof(native_sequence), mode, 0};
  }
}

constexpr corvane_slim_struct_type struct_record(int s) {
  const record_desc& d = kRecords[int(kPlan.structs[s])];
  return {d.n_members, &typeArrays[kPlan.struct_members_at[s]], d.in_size, d.rout_prim_in, d.rout_prim_rout,
          d.in_align, d.rout_prim_in_align, d.rout_prim_rout_align};
}

constexpr corvane_slim_method method_record(int r) {
  const method_plan& m = kPlans[kPlan.method_number[r]];
  const uint32_t scalars = REMOTE_SCALARS_MAKE(0, m.in_bufs, m.out_bufs);
  return {scalars,
          m.prim_in_size,
          m.prim_out_size,
          m.num_args,
          m.count,
          &parameterArrays[kPlan.method_params_at[r]],
          uint8_t(m.prim_in_align),
          uint8_t(m.prim_out_align)};
}

template <size_t... I>
constexpr nstd::array<corvane_slim_type, sizeof...(I)> make_types(nstd::integer_sequence<size_t, I...>) {
  return {{type_record(kPlan.types[I])...}};
}
template <size_t... I>
constexpr nstd::array<const corvane_slim_type*, sizeof...(I)> make_type_arrays(nstd::integer_sequence<size_t, I...>) {
  return {{&types[kPlan.type_refs[I]]...}};
}
template <size_t... I>
constexpr nstd::array<corvane_slim_struct_type, sizeof...(I)> make_structs(nstd::integer_sequence<size_t, I...>) {
  return {{struct_record(int(I))...}};
}
template <size_t... I>
constexpr nstd::array<corvane_slim_parameter, sizeof...(I)> make_parameters(nstd::integer_sequence<size_t, I...>) {
  return {{parameter_record(kPlan.params[I])...}};
}
template <size_t... I>
constexpr nstd::array<const corvane_slim_parameter*, sizeof...(I)> make_parameter_arrays(
    nstd::integer_sequence<size_t, I...>) {
  return {{&parameters[kPlan.param_refs[I]]...}};
}
template <size_t... I>
constexpr nstd::array<corvane_slim_method, sizeof...(I)> make_methods(nstd::integer_sequence<size_t, I...>) {
  return {{method_record(int(I))...}};
}
template <size_t... I>
constexpr nstd::array<const corvane_slim_method*, sizeof...(I)> make_method_arrays(
    nstd::integer_sequence<size_t, I...>) {
  return {{&methods[kPlan.record_of_method[I]]...}};
}
template <class T, size_t N, class Src> constexpr nstd::array<T, N> copy_of(const Src& src) {
  nstd::array<T, N> out{};
  for (size_t i = 0; i < N; ++i) out[i] = T(src[i]);
  return out;
}

template <int N> using seq = nstd::make_integer_sequence<size_t, size_t(N)>;

constexpr nstd::array<corvane_slim_type, kPlan.n_types> types = make_types(seq<kPlan.n_types>{});
constexpr nstd::array<const corvane_slim_type*, kPlan.n_type_refs> typeArrays =
    make_type_arrays(seq<kPlan.n_type_refs>{});
constexpr nstd::array<corvane_slim_struct_type, kPlan.n_structs> structTypes = make_structs(seq<kPlan.n_structs>{});
constexpr nstd::array<corvane_slim_parameter, kPlan.n_params> parameters = make_parameters(seq<kPlan.n_params>{});
constexpr nstd::array<const corvane_slim_parameter*, kPlan.n_param_refs> parameterArrays =
    make_parameter_arrays(seq<kPlan.n_param_refs>{});
constexpr nstd::array<corvane_slim_method, kPlan.n_methods> methods = make_methods(seq<kPlan.n_methods>{});
constexpr nstd::array<const corvane_slim_method*, kMethodCount> methodArrays = make_method_arrays(seq<kMethodCount>{});
constexpr nstd::array<uint16_t, kMethodCount> methodStringArray =
    copy_of<uint16_t, kMethodCount>(kPlan.method_entries_at);
constexpr nstd::array<uint16_t, kPlan.n_entries> methodStrings = copy_of<uint16_t, kPlan.n_entries>(kPlan.entries);
constexpr nstd::array<char, kPlan.n_chars> strings = copy_of<char, kPlan.n_chars>(kPlan.chars);

const table_sizes kSizes = {kPlan.n_methods,    kPlan.n_params,  kPlan.n_param_refs, kPlan.n_types,
                            kPlan.n_type_refs,  kPlan.n_structs, kPlan.n_entries,    kPlan.n_chars};

}  // namespace slim
}  // namespace remote
}  // namespace corvane

extern "C" CORVANE_API const corvane_slim_interface corvane_slim = {
    corvane::remote::kMethodCount,
    &corvane::remote::slim::methodArrays[0],
    0,
    nullptr,
    &corvane::remote::slim::methodStringArray[0],
    &corvane::remote::slim::methodStrings[0],
    &corvane::remote::slim::strings[0],
};
