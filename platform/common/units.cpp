// HVX units and contexts. A process reserves units; a thread binds a context of 64 bytes
// (one unit) or 128 bytes (two units) within what the process holds. A waiting lock
// sleeps while the held contexts use up the reservation, and gives up (-1) once the
// reservation can no longer hold it.
#include "HAP.h"
#include "dspCV.h"
#include "libc.h"
#include "sim.h"

namespace sim {
namespace {

int parse_int(const char* s, int fallback) {
  if (s == nullptr || *s == 0) return fallback;
  int v = 0;
  for (; *s >= '0' && *s <= '9'; ++s) v = v * 10 + (*s - '0');
  return v;
}

bool same(const char* a, const char* b) {
  if (a == nullptr) return false;
  while (*a && *a == *b) ++a, ++b;
  return *a == *b;
}

state make_state() {
  state s = {};
  s.total_units = parse_int(env("CORVANE_UNITS"), kDefaultUnits);
  return s;
}

// Start-up faults come from the environment, read on the first start-up call, which
// happens before main through the library's static initialisers.
void check_startup_faults(state& s) {
  if (s.startup_checked) return;
  s.startup_checked = true;
  const char* fault = env("CORVANE_FAULT_STARTUP");
  s.startup_fault = same(fault, "init") ? 1 : same(fault, "power") ? 2 : 0;
}

void release_context(guard& g, state& s, thread_state* t) {
  if (t->locked_units == 0) return;
  s.used -= t->locked_units;
  t->locked_units = 0;
  t->locked_vlen = 0;
  if (s.lock_waiters > 0) g.wake_all(kUnitsChanged);
}

}  // namespace

state& the_state() {
  static state s = make_state();
  return s;
}

}  // namespace sim

using sim::guard;
using sim::the_state;

extern "C" {

int dspCV_initQ6_with_attributes(const dspCV_Attribute* attributes, unsigned int count) {
  guard g;
  sim::state& s = the_state();
  sim::check_startup_faults(s);
  for (unsigned i = 0; i < count; ++i) {
    const int id = static_cast<int>(attributes[i].ID);
    if (id >= 0 && id < 4) s.init_attributes[id] = attributes[i].value;
  }
  if (s.startup_fault == 1) return -1;
  ++s.initialised;
  return 0;
}

int dspCV_deinitQ6(void) {
  guard g;
  --the_state().initialised;
  return 0;
}

int dspCV_hvx_power_on(void) {
  guard g;
  sim::state& s = the_state();
  sim::check_startup_faults(s);
  if (s.startup_fault == 2) {
    s.startup_fault = 0;  // only the start-up's power-on fails
    return -1;
  }
  if (s.fail_hvx_power_on) return -1;
  ++s.hvx_powered;
  return 0;
}

int dspCV_hvx_power_off(void) {
  guard g;
  --the_state().hvx_powered;
  return 0;
}

int dspCV_hvx_num_reserved(void) {
  guard g;
  return the_state().reserved;
}

int dspCV_hvx_reserve(int num_units) {
  guard g;
  sim::state& s = the_state();
  ++s.counters.reserve_calls;
  if (s.reserved > 0) return s.reserved;
  int grant = num_units == 0 ? s.total_units : (num_units < s.total_units ? num_units : s.total_units);
  if (grant <= 0) return 0;
  s.reserved = grant;
  return grant;
}

int dspCV_hvx_unreserve(void) {
  guard g;
  sim::state& s = the_state();
  ++s.counters.unreserve_calls;
  s.reserved = 0;
  g.wake_all(sim::kUnitsChanged);  // waiting locks re-check against the smaller reservation
  return 0;
}

int dspCV_hvx_lock(dspCV_hvx_mode_t mode, unsigned int wait) {
  guard g;
  sim::state& s = the_state();
  ++s.counters.lock_calls;
  if (s.forced_lock_result != 0) return s.forced_lock_result;
  sim::thread_state* t = sim::current_thread();
  sim::release_context(g, s, t);  // a thread holds at most one context
  for (;;) {
    const int need = (mode == DSPCV_HVX_MODE_64B) ? 1 : (mode == DSPCV_HVX_MODE_128B || s.reserved >= 2) ? 2 : 1;
    if (s.reserved < need) return -1;
    if (s.used + need <= s.reserved) {
      s.used += need;
      t->locked_units = need;
      t->locked_vlen = need == 2 ? 128 : 64;
      return t->locked_vlen;
    }
    if (!wait) return -1;
    ++s.lock_waiters;
    g.wait(sim::kUnitsChanged);
    --s.lock_waiters;
  }
}

// Accepts a thread that holds nothing.
int dspCV_hvx_unlock(void) {
  guard g;
  sim::state& s = the_state();
  ++s.counters.unlock_calls;
  sim::release_context(g, s, sim::current_thread());
  return 0;
}

int HAP_power_request(int clock, int bus, int latency) {
  guard g;
  sim::state& s = the_state();
  ++s.counters.power_requests;
  s.counters.last_clock = clock;
  s.counters.last_bus = bus;
  s.counters.last_latency = latency;
  return s.fail_power_requests ? 1 : 0;
}

uint64_t HAP_perf_get_time_us(void) { return sim::now_us(); }
// The simulated core runs at 1 GHz: one cycle a nanosecond.
uint64_t HAP_perf_get_pcycles(void) { return sim::now_us() * 1000u; }

// ---- controls ----

void corvane_platform_set_units(int units) {
  guard g;
  the_state().total_units = units < 0 ? 0 : units;
}

int corvane_platform_units(void) {
  guard g;
  return the_state().total_units;
}

void corvane_platform_force_lock_result(int result) {
  guard g;
  the_state().forced_lock_result = result;
}

void corvane_platform_fail_power_requests(int on) {
  guard g;
  the_state().fail_power_requests = on != 0;
}

void corvane_platform_fail_hvx_power_on(int on) {
  guard g;
  the_state().fail_hvx_power_on = on != 0;
}

void corvane_platform_set_compute_not_ok(int on) {
  guard g;
  the_state().compute_not_ok = on != 0;
}

void corvane_platform_reset(void) {
  guard g;
  sim::state& s = the_state();
  s.total_units = sim::kDefaultUnits;
  s.forced_lock_result = 0;
  s.fail_power_requests = false;
  s.fail_hvx_power_on = false;
  s.compute_not_ok = false;
}

void corvane_platform_get_counters(corvane_platform_counters* out) {
  guard g;
  *out = the_state().counters;
}

void corvane_platform_clear_counters(void) {
  guard g;
  memset(&the_state().counters, 0, sizeof(corvane_platform_counters));
}

}  // extern "C"
