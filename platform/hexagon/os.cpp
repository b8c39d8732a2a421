// The hexagon build's primitives: system calls, futexes, threads with an explicit
// per-thread context in ugp, and what the simulated platform (platform/common) needs of
// a build: a mutex with a change signal, per-thread state, the environment, a log
// writer and a clock.
#include "rt.h"
#include "sim.h"

extern "C" int corvane_rt_clone(unsigned flags, void* stack, volatile int* parent_tid, volatile int* child_tid,
                                void* tls);

namespace sim {
void run_tls_destructors(thread_state* t);
}

namespace rt {

// ---- output, exit, memory ----

void write_all(int fd, const char* text, size_t length) {
  while (length > 0) {
    const long n = syscall(SYS_write, fd, reinterpret_cast<long>(text), static_cast<long>(length));
    if (n <= 0) return;
    text += n;
    length -= static_cast<size_t>(n);
  }
}

void exit_process(int status) {
  for (;;) syscall(SYS_exit_group, status);
}

void* map_pages(size_t bytes) {
  constexpr long kProtReadWrite = 3, kMapPrivateAnonymous = 0x22;
  const long p = syscall6(SYS_mmap2, 0, static_cast<long>(bytes), kProtReadWrite, kMapPrivateAnonymous, -1, 0);
  if (p < 0 && p > -4096) return nullptr;  // -errno
  return reinterpret_cast<void*>(p);
}

void unmap_pages(void* p, size_t bytes) { syscall(SYS_munmap, reinterpret_cast<long>(p), static_cast<long>(bytes)); }

// ---- futexes and the mutex ----

void futex_wait(volatile int* word, int expected) {
  constexpr long kFutexWait = 0;
  syscall(SYS_futex, reinterpret_cast<long>(word), kFutexWait, expected, 0);
}

void futex_wake(volatile int* word, int count) {
  constexpr long kFutexWake = 1;
  syscall(SYS_futex, reinterpret_cast<long>(word), kFutexWake, count, 0);
}

void mutex::lock() {
  int c = 0;
  if (__atomic_compare_exchange_n(&word, &c, 1, false, __ATOMIC_ACQUIRE, __ATOMIC_RELAXED)) return;
  if (c != 2) c = __atomic_exchange_n(&word, 2, __ATOMIC_ACQUIRE);
  while (c != 0) {
    futex_wait(&word, 2);
    c = __atomic_exchange_n(&word, 2, __ATOMIC_ACQUIRE);
  }
}

void mutex::unlock() {
  if (__atomic_fetch_sub(&word, 1, __ATOMIC_RELEASE) != 1) {
    __atomic_store_n(&word, 0, __ATOMIC_RELEASE);
    futex_wake(&word, 1);
  }
}

// ---- threads ----

struct thread {
  sim::thread_state state;  // what the simulated platform keeps per thread
  volatile int tid;         // set by clone, cleared (and woken) by the kernel at exit
  void (*fn)(void*);
  void* arg;
  void* region;
  size_t region_bytes;
};

namespace {

constexpr size_t kStackBytes = 1u << 20;
constexpr unsigned kCloneFlags = 0x3d0f00;  // VM|FS|FILES|SIGHAND|THREAD|SYSVSEM|SETTLS|PARENT_SETTID|CHILD_CLEARTID

// The main thread's context. A shared object loaded by another runtime finds ugp 0 on
// threads it did not start, and uses this one.
thread main_context;

thread* context() {
  thread* t;
  __asm__ volatile("%0 = ugp" : "=r"(t));
  return t != nullptr ? t : &main_context;
}

// Runs on the new thread's stack: the body, then the thread's TLS destructors.
void thread_main(thread* t) {
  t->fn(t->arg);
  sim::run_tls_destructors(&t->state);
}

}  // namespace

void set_main_context() {
  thread* t = &main_context;
  __asm__ volatile("ugp = %0" : : "r"(t));
}

thread* thread_start(void (*fn)(void*), void* arg) {
  const size_t bytes = kStackBytes + 4096;
  char* region = static_cast<char*>(map_pages(bytes));
  if (region == nullptr) return nullptr;
  // The context sits at the top of the region, the stack grows down from below it.
  thread* t = reinterpret_cast<thread*>(region + bytes - ((sizeof(thread) + 127) & ~size_t{127}));
  t->fn = fn;
  t->arg = arg;
  t->region = region;
  t->region_bytes = bytes;
  void** stack = reinterpret_cast<void**>(reinterpret_cast<char*>(t) - 128);
  stack[0] = reinterpret_cast<void*>(&thread_main);
  stack[1] = t;
  if (corvane_rt_clone(kCloneFlags, stack, &t->tid, &t->tid, t) < 0) {
    unmap_pages(region, bytes);
    return nullptr;
  }
  return t;
}

void thread_join(thread* t) {
  for (int tid; (tid = __atomic_load_n(&t->tid, __ATOMIC_ACQUIRE)) != 0;) futex_wait(&t->tid, tid);
  unmap_pages(t->region, t->region_bytes);
}

// ---- start-up options and the environment ----

namespace {

int start_argc;
char** start_argv;
char** start_envp;

struct option_name {
  const char* option;  // "--units="
  const char* env;     // "CORVANE_UNITS"
};
constexpr option_name kOptions[] = {{"--units=", "CORVANE_UNITS"}, {"--fault-startup=", "CORVANE_FAULT_STARTUP"}};

// The rest of `text` after `prefix`, or null.
const char* after(const char* text, const char* prefix) {
  for (; *prefix != 0; ++prefix, ++text)
    if (*text != *prefix) return nullptr;
  return text;
}

}  // namespace

void set_start_arguments(int argc, char** argv, char** envp) {
  start_argc = argc;
  start_argv = argv;
  start_envp = envp;
}

const char* option(const char* name) {
  for (const option_name& o : kOptions) {
    if (after(o.env, name) == nullptr || *after(o.env, name) != 0) continue;
    for (int i = 1; i < start_argc; ++i)
      if (const char* value = after(start_argv[i], o.option)) return value;
  }
  return nullptr;
}

}  // namespace rt

namespace sim {

namespace {
rt::mutex state_mutex;
volatile int raised[kSignalCount];  // bumped each time a signal is raised; waiters sleep on it
}  // namespace

thread_state* current_thread() { return &rt::context()->state; }

void lock_state() { state_mutex.lock(); }
void unlock_state() { state_mutex.unlock(); }

void wait_signal(signal s) {
  const int seen = __atomic_load_n(&raised[s], __ATOMIC_ACQUIRE);
  state_mutex.unlock();
  rt::futex_wait(&raised[s], seen);
  state_mutex.lock();
}

void raise_signal(signal s, int sleepers) {
  __atomic_fetch_add(&raised[s], 1, __ATOMIC_RELEASE);
  rt::futex_wake(&raised[s], sleepers);
}

void yield_thread() { rt::syscall(rt::SYS_sched_yield, 0, 0); }

// The DSP runs four hardware threads; under the emulator, the host's threads stand in.
int hardware_threads() { return 4; }

const char* env(const char* name) {
  if (const char* value = rt::option(name)) return value;
  if (rt::start_envp == nullptr) return nullptr;
  for (char** e = rt::start_envp; *e != nullptr; ++e) {
    const char* value = rt::after(*e, name);
    if (value != nullptr && *value == '=') return value + 1;
  }
  return nullptr;
}

void write_log(const char* text, size_t length) { rt::write_all(2, text, length); }

// The thread lives as long as the process: it is never joined, its stack never unmapped.
bool start_thread(void (*fn)(void*), void* arg) { return rt::thread_start(fn, arg) != nullptr; }

uint64_t now_us() {
  struct {
    int32_t sec;
    int32_t nsec;
  } ts = {0, 0};
  constexpr long kClockMonotonic = 1;
  rt::syscall(rt::SYS_clock_gettime, kClockMonotonic, reinterpret_cast<long>(&ts));
  return static_cast<uint64_t>(ts.sec) * 1000000u + static_cast<uint64_t>(ts.nsec) / 1000u;
}

}  // namespace sim
