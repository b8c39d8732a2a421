// The control surface: load, init, power levels, deinit and the two no-op kernels.
#include "HAP.h"
#include "core/dispatch.h"
#include "core/log.h"

namespace {

enum power_level : uint32_t {
  HEXAGON_OFF = 0xFFFFFFFFu,
  HEXAGON_MINSVS = 0,
  HEXAGON_LOWSVS = 1,
  HEXAGON_SVS = 2,
  HEXAGON_NOMINAL = 3,
  HEXAGON_TURBO = 4,
};

struct power_request {
  int clock_percent;
  int bus_percent;
  int latency_tolerance;
};

// The request of a power level; false for an unknown level.
bool request_for(uint32_t mode, power_request& r) {
  switch (mode) {
    case HEXAGON_TURBO:
      r = {100, 100, 1000};
      return true;
    case HEXAGON_MINSVS:
    case HEXAGON_LOWSVS:
    case HEXAGON_SVS:
    case HEXAGON_NOMINAL:
      r = {75, 75, 1000};
      return true;
    case HEXAGON_OFF:
      r = {0, 0, -1};
      return true;
    default:
      return false;
  }
}

}  // namespace

extern "C" {

CORVANE_API AEEResult corvane_load(void) {
  LOG_LINE(2, "[Lumivar] corvane_load..");
  return hvx::RESULT_OK;
}

CORVANE_API AEEResult corvane_setmode(uint32_t mode) {
  LOG_LINE(2, "[Lumivar] corvane_setmode: %u..", mode);
  power_request r;
  if (!request_for(mode, r)) return hvx::RESULT_NOT_IMPLEMENTED;
  return HAP_power_request(r.clock_percent, r.bus_percent, r.latency_tolerance) == 0 ? hvx::RESULT_OK
                                                                                      : hvx::RESULT_NOT_READY;
}

CORVANE_API AEEResult corvane_init(uint32_t mode) {
  LOG_LINE(2, "[Lumivar] corvane_init:%u..", mode);
  if (!hvx::IsInitialized()) return hvx::RESULT_NOT_READY;
  if (mode == HEXAGON_NOMINAL) return hvx::RESULT_OK;
  return corvane_setmode(mode);
}

CORVANE_API AEEResult corvane_deinit(void) {
  LOG_LINE(2, "[Lumivar] corvane_deinit..");
  return hvx::RESULT_OK;
}

CORVANE_API AEEResult corvane_get_kernel_execution_time(uint64_t*, uint64_t*, char*, int, uint8_t) {
  return hvx::RESULT_NOT_IMPLEMENTED;
}

CORVANE_API AEEResult corvane_DoesNothing_ButLooksCool(void) {
  if (!hvx::IsInitialized()) return hvx::RESULT_NOT_READY;
  LOG_LINE(2, "Did nothing..., and it worked \\o/");
  return hvx::RESULT_OK;
}

CORVANE_API AEEResult corvane_DoesNothing_ButLooksCool_ProEdition(void) {
  if (!hvx::IsInitialized()) return hvx::RESULT_NOT_READY;
  hvx::scoped_reservation reservation = hvx::reserve_all();
  if (!hvx::scoped_reservation::num_reserved<1>()) return hvx::RESULT_NOT_READY;
  hvx::mode_lock guard = hvx::lock(hvx::mode_c<hvx::SingleHVX>::instance);
  LOG_LINE(2, "(HVX lock) Did nothing..., and it worked \\o/");
  return hvx::RESULT_OK;
}

}  // extern "C"
