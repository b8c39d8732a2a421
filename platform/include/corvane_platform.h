// Controls of the simulated DSP platform, for tests and outside tools: how many HVX
// units exist, which platform calls fail, and where log lines go. Plain C, exported
// from libcorvane_skel.so. The start-up can also be made to fail before any static
// initialiser runs, through the environment: CORVANE_FAULT_STARTUP=init makes
// dspCV_initQ6_with_attributes fail, CORVANE_FAULT_STARTUP=power makes the first
// dspCV_hvx_power_on fail. CORVANE_UNITS=n sets the initial number of units.
#ifndef CORVANE_PLATFORM_CONTROLS_H
#define CORVANE_PLATFORM_CONTROLS_H

#ifdef __cplusplus
extern "C" {
#endif

#if defined(__GNUC__)
#define CORVANE_EXPORT __attribute__((visibility("default")))
#else
#define CORVANE_EXPORT
#endif

// HVX units the platform has (default 4, or CORVANE_UNITS); a reservation of "all"
// grants this many. Takes effect for the next reservation.
CORVANE_EXPORT void corvane_platform_set_units(int units);
CORVANE_EXPORT int corvane_platform_units(void);

// dspCV_hvx_lock answers `result` instead of locking, for every call until cleared
// with 0 (for example -1 to refuse, or 128 to answer a 64-byte request wrongly).
CORVANE_EXPORT void corvane_platform_force_lock_result(int result);

// HAP_power_request fails (answers 1) while `on` is not 0.
CORVANE_EXPORT void corvane_platform_fail_power_requests(int on);
// dspCV_hvx_power_on fails while `on` is not 0.
CORVANE_EXPORT void corvane_platform_fail_hvx_power_on(int on);
// dspCV_concurrency_query recommends against compute while `on` is not 0.
CORVANE_EXPORT void corvane_platform_set_compute_not_ok(int on);

// Back to a healthy platform with the default number of units (the start-up state
// is kept: it happened once, at load).
CORVANE_EXPORT void corvane_platform_reset(void);

// Calls seen by the platform, for tests that check what was (not) asked of it.
typedef struct {
  int reserve_calls;
  int unreserve_calls;
  int lock_calls;
  int unlock_calls;
  int power_requests;
  int last_clock, last_bus, last_latency;  // arguments of the last HAP_power_request
  int prepare_mt_job_calls;
  int cleanup_mt_job_calls;
  int jobs_submitted;
} corvane_platform_counters;
CORVANE_EXPORT void corvane_platform_get_counters(corvane_platform_counters* out);
CORVANE_EXPORT void corvane_platform_clear_counters(void);

// Log lines go to `sink` instead of stderr while it is set (null restores stderr).
typedef void (*corvane_log_sink)(void* context, int level, const char* file, int line,
                                 const char* text);
CORVANE_EXPORT void corvane_platform_set_log_sink(corvane_log_sink sink, void* context);

#ifdef __cplusplus
}
#endif
#endif
