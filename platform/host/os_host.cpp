// The host's primitives under the simulated platform: a std::mutex with a condition
// variable per signal, thread_local thread state, getenv, stderr, the steady clock.
#include <chrono>
#include <condition_variable>
#include <cstdio>
#include <cstdlib>
#include <mutex>
#include <system_error>
#include <thread>

#include "sim.h"

namespace sim {

void run_tls_destructors(thread_state* t);

namespace {

// Never destroyed: the worker pool's threads wait on them until the process is gone.
std::mutex& state_mutex() {
  static std::mutex* m = new std::mutex;
  return *m;
}
std::condition_variable& signalled(signal s) {
  static std::condition_variable* cv = new std::condition_variable[kSignalCount];
  return cv[s];
}
// The lock held by the current thread, so that waiting can release it.
thread_local std::unique_lock<std::mutex> held;

struct host_thread {
  thread_state state = {};
  ~host_thread() { run_tls_destructors(&state); }
};

}  // namespace

thread_state* current_thread() {
  thread_local host_thread t;
  return &t.state;
}

void lock_state() { held = std::unique_lock<std::mutex>(state_mutex()); }

void unlock_state() { held.unlock(); }

void wait_signal(signal s) { signalled(s).wait(held); }

void raise_signal(signal s, int sleepers) {
  if (sleepers >= kWakeAll) return signalled(s).notify_all();
  for (int i = 0; i < sleepers; ++i) signalled(s).notify_one();
}

const char* env(const char* name) { return std::getenv(name); }

int hardware_threads() {
  const unsigned n = std::thread::hardware_concurrency();
  return n > 0 ? static_cast<int>(n) : 1;
}

void write_log(const char* text, size_t length) { std::fwrite(text, 1, length, stderr); }

uint64_t now_us() {
  using namespace std::chrono;
  return static_cast<uint64_t>(duration_cast<microseconds>(steady_clock::now().time_since_epoch()).count());
}

void yield_thread() { std::this_thread::yield(); }

bool start_thread(void (*fn)(void*), void* arg) {
  try {
    std::thread(fn, arg).detach();
    return true;
  } catch (const std::system_error&) {
    return false;
  }
}

}  // namespace sim
