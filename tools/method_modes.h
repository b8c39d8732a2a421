// The modes each method of the remote interface can run in once built, by method
// number, and how a caller forces one of them on the host. The CLI prints this table,
// the benchmarks take their modes from it and a test holds the README's status table
// against it. The modes here are the allowed set of the method's exported function;
// the mode of one call is settled by the HVX units the process can reserve (none:
// Scalar, one: SingleHVX, two or more: DualHVX, among the allowed ones).
#ifndef CORVANE_TOOLS_METHOD_MODES_H
#define CORVANE_TOOLS_METHOD_MODES_H

#include <cstdlib>
#include <string>

#include "remote/method_table.h"

namespace corvane {
namespace tools {

enum mode : int { Scalar = 0, SingleHVX = 1, DualHVX = 2 };
constexpr mode kAllModes[] = {Scalar, SingleHVX, DualHVX};

// Sets of modes, as bits (1 << mode).
enum mode_set : unsigned { NONE = 0, SCALAR = 1, SHVX = 2, DHVX = 4, HVX = SHVX | DHVX, ALL = 7 };
constexpr bool has(unsigned set, mode m) { return (set >> m) & 1u; }

// What a method runs as: a kernel with a set of modes, a control call that runs on no
// vector unit, or an entry that answers a fixed code without running anything.
enum class runs_as : int { kernel, control, answers_0, answers_4 };

struct method_modes {
  int number;
  runs_as what;
  unsigned modes;  // for runs_as::kernel
};

namespace modes_row {
namespace m = remote::method;
constexpr method_modes k(int n, unsigned set) { return {n, runs_as::kernel, set}; }
constexpr method_modes control(int n) { return {n, runs_as::control, NONE}; }
constexpr method_modes answers(int n, int code) { return {n, code == 0 ? runs_as::answers_0 : runs_as::answers_4, NONE}; }
}  // namespace modes_row

// One row per method, in method-number order.
constexpr method_modes kMethodModes[] = {
    modes_row::k(modes_row::m::identity, ALL),
    modes_row::k(modes_row::m::vadd_mm, SHVX),
    modes_row::k(modes_row::m::vsub_mm, SHVX),
    modes_row::k(modes_row::m::vmul_mm, SHVX),
    modes_row::k(modes_row::m::vmul_scale, SHVX),
    modes_row::k(modes_row::m::vdiv_mm, SCALAR),
    modes_row::k(modes_row::m::vdiv_scale, SCALAR),
    modes_row::k(modes_row::m::hvx_sum, SHVX),
    modes_row::k(modes_row::m::deinterleave2C, SHVX),
    modes_row::answers(modes_row::m::deinterleave3C, 4),
    modes_row::answers(modes_row::m::deinterleave4C, 4),
    modes_row::k(modes_row::m::convertScaleAbs, ALL),
    modes_row::control(modes_row::m::get_kernel_execution_time),
    modes_row::control(modes_row::m::DoesNothing_ButLooksCool),
    modes_row::control(modes_row::m::DoesNothing_ButLooksCool_ProEdition),
    modes_row::control(modes_row::m::load),
    modes_row::control(modes_row::m::init),
    modes_row::control(modes_row::m::deinit),
    modes_row::control(modes_row::m::setmode),
    modes_row::k(modes_row::m::sobel8u, DHVX),
    modes_row::k(modes_row::m::sobel16s, DHVX),
    modes_row::k(modes_row::m::sobel32f, DHVX),
    modes_row::k(modes_row::m::conv3x3a328u, DHVX),
    modes_row::k(modes_row::m::cornerMinEigenVal, DHVX),
    modes_row::k(modes_row::m::houghlines, SCALAR),
    modes_row::k(modes_row::m::median3x3, SCALAR),
    modes_row::k(modes_row::m::warp_perspective, SCALAR),
    modes_row::k(modes_row::m::warp_affine, SHVX),
    modes_row::k(modes_row::m::remap, SCALAR),
    modes_row::k(modes_row::m::resize, HVX),  // cubic interpolation: SingleHVX only
    modes_row::k(modes_row::m::ppht_lines, SCALAR),
    modes_row::k(modes_row::m::cvtColor, ALL),  // the grey codes: SingleHVX and DualHVX only
    modes_row::k(modes_row::m::cornerMinEigenVal_v2, SCALAR),
    modes_row::k(modes_row::m::cornerMinEigenValFP, HVX),
    modes_row::k(modes_row::m::cornerHarris, ALL),
    modes_row::k(modes_row::m::gaussianBlur, SHVX),
    modes_row::k(modes_row::m::goodFeaturesToTrack, HVX),
    modes_row::k(modes_row::m::LSC, DHVX),
    modes_row::k(modes_row::m::morphOp, DHVX),
    modes_row::k(modes_row::m::morphologyEx, DHVX),
    modes_row::k(modes_row::m::boxfilter, ALL),  // the Scalar variant writes nothing
    modes_row::k(modes_row::m::median_blur_3x3, SHVX),
    modes_row::k(modes_row::m::pyrDown, SCALAR | SHVX),  // Scalar for 32-bit float input only
    modes_row::k(modes_row::m::pyrUp, SHVX),
    modes_row::k(modes_row::m::clearHist, SHVX),
    modes_row::k(modes_row::m::calcHist_8u1d, SHVX),
    modes_row::k(modes_row::m::calcHist, HVX),
    modes_row::k(modes_row::m::thresh, DHVX),
    modes_row::k(modes_row::m::integrate, DHVX),
    modes_row::answers(modes_row::m::filter2D, 0),
    modes_row::answers(modes_row::m::sobel, 0),  // no kernel behind the descriptor form
    modes_row::k(modes_row::m::trackLK, SCALAR),
    modes_row::k(modes_row::m::opticalFlow, SHVX),
};

constexpr bool modes_table_is_complete() {
  if (sizeof(kMethodModes) / sizeof(kMethodModes[0]) != size_t(remote::kMethodCount)) return false;
  for (int i = 0; i < remote::kMethodCount; ++i)
    if (kMethodModes[i].number != i) return false;
  return true;
}
static_assert(modes_table_is_complete(), "one row per method, numbered 0 to 52 in order");

constexpr const char* mode_name(mode m) {
  return m == Scalar ? "Scalar" : m == SingleHVX ? "SingleHVX" : "DualHVX";
}
// The short name the CLI and the benchmarks take: scalar, shvx, dhvx.
constexpr const char* mode_key(mode m) { return m == Scalar ? "scalar" : m == SingleHVX ? "shvx" : "dhvx"; }

// Reads a short mode name; false if it is not one.
inline bool parse_mode(const std::string& text, mode& out) {
  for (mode m : kAllModes)
    if (text == mode_key(m)) {
      out = m;
      return true;
    }
  return false;
}

// The mode CORVANE_MODE names, if it is set: false if it names none.
inline bool mode_from_environment(bool& given, mode& m) {
  const char* env = std::getenv("CORVANE_MODE");
  given = env != nullptr && *env != '\0';
  return !given || parse_mode(env, m);
}

// "Scalar, SingleHVX, DualHVX", "control", "none (answers 4)": the README's wording.
inline std::string describe_modes(const method_modes& row) {
  switch (row.what) {
    case runs_as::control: return "control";
    case runs_as::answers_0: return "none (answers 0)";
    case runs_as::answers_4: return "none (answers 4)";
    case runs_as::kernel: break;
  }
  std::string text;
  for (mode m : kAllModes)
    if (has(row.modes, m)) text += (text.empty() ? "" : ", ") + std::string(mode_name(m));
  return text;
}

// HVX units to give the simulated platform so that a method allowing `allowed` runs in
// `m`: none for Scalar, one for SingleHVX where DualHVX would otherwise be taken, and
// otherwise the platform's default of four, so that parallel loops get their whole team.
constexpr int units_for(mode m, unsigned allowed) {
  return m == Scalar ? 0 : (m == SingleHVX && has(allowed, DualHVX)) ? 1 : 4;
}

}  // namespace tools
}  // namespace corvane

#endif
