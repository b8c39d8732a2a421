// The simulated DSP platform: what is shared by the host and hexagon builds, and the
// few primitives each build supplies (one mutex with a few signals, per-thread state,
// the environment, a log writer, a clock). Nothing here uses the C++ library, so the
// same logic runs in the freestanding hexagon runtime.
#ifndef CORVANE_PLATFORM_SIM_H
#define CORVANE_PLATFORM_SIM_H

#include <stddef.h>
#include <stdint.h>

#include "corvane_platform.h"

namespace sim {

constexpr int kMaxTlsKeys = 16;
constexpr int kDefaultUnits = 4;

// What the platform knows of one thread.
struct thread_state {
  int locked_units;  // units held by this thread's vector context, 0 if none
  int locked_vlen;   // its vector length in bytes
  void* tls[kMaxTlsKeys];
};

// What a sleeping thread waits for. Each has its own signal, so that a change wakes
// only the threads it concerns: a run of the worker pool then costs one wake-up per job
// and one for the caller, not a wake-up of every sleeper at every step.
enum signal : int {
  kUnitsChanged,  // a context was freed or the reservation changed: waiting locks re-check
  kJobQueued,     // the pool's threads take it
  kQueueChanged,  // the pool started, or a full queue freed a slot: submitters re-check
  kTokenDone,     // a completion token reached its count
  kSignalCount
};
constexpr int kWakeAll = 0x7fffffff;

// ---- supplied by each build ----
thread_state* current_thread();  // the calling thread's state, zeroed on first use
void lock_state();               // the platform's one mutex
void unlock_state();
void wait_signal(signal s);      // with the mutex held: sleep until s is raised (or
                                 // spuriously), mutex re-held
void raise_signal(signal s, int sleepers);  // wakes up to `sleepers` threads waiting on s;
                                            // the mutex need not be held
const char* env(const char* name);  // start-up configuration, null if unset
void write_log(const char* text, size_t length);
uint64_t now_us();
void yield_thread();  // lets another runnable thread have the processor
int hardware_threads();  // threads the machine runs at once, at least 1
// Starts fn(arg) on a new thread that lives as long as the process; false if none.
bool start_thread(void (*fn)(void*), void* arg);

// ---- shared state, guarded by lock_state() ----
struct state {
  int total_units;         // units the platform has
  int reserved;            // units this process holds
  int used;                // units held by locked contexts
  int lock_waiters;        // threads sleeping in a waiting dspCV_hvx_lock
  int forced_lock_result;  // 0, or what dspCV_hvx_lock answers instead of locking
  bool fail_power_requests;
  bool fail_hvx_power_on;
  bool compute_not_ok;
  bool startup_checked;  // the environment's start-up faults were read
  int startup_fault;     // 0 none, 1 init fails, 2 the first power-on fails
  int initialised;       // dspCV_initQ6 minus dspCV_deinitQ6 calls
  int hvx_powered;       // power-on minus power-off calls
  corvane_platform_counters counters;
  int init_attributes[4];  // values of the last start-up, by attribute ID
  corvane_log_sink sink;
  void* sink_context;
};
state& the_state();

// Holds the platform's mutex for a scope. Wake-ups asked for inside it are sent once the
// mutex is released, so that a woken thread does not at once block on it again.
class guard {
 public:
  guard() { lock_state(); }
  ~guard() {
    unlock_state();
    send_wakes();
  }
  guard(const guard&) = delete;
  guard& operator=(const guard&) = delete;

  void wake_one(signal s) { wakes_[s] = wakes_[s] == kWakeAll ? kWakeAll : wakes_[s] + 1; }
  void wake_all(signal s) { wakes_[s] = kWakeAll; }
  // Sleeps until s is raised; wake-ups asked for so far are sent first.
  void wait(signal s) {
    send_wakes();
    wait_signal(s);
  }

 private:
  void send_wakes() {
    for (int s = 0; s < kSignalCount; ++s)
      if (wakes_[s] != 0) {
        raise_signal(static_cast<signal>(s), wakes_[s]);
        wakes_[s] = 0;
      }
  }
  int wakes_[kSignalCount] = {};
};

// Sends one finished line to the sink or the log writer.
void emit_log(int level, const char* file, int line, const char* text);

}  // namespace sim

#endif
