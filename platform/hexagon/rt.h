// The freestanding runtime of the hexagon build: Linux system calls as qemu-hexagon
// provides them, futexes, threads and the program's start-up options. Everything here
// is hidden inside the programs and the shared object; nothing of it is exported.
#ifndef CORVANE_PLATFORM_HEXAGON_RT_H
#define CORVANE_PLATFORM_HEXAGON_RT_H

#include <stddef.h>
#include <stdint.h>

namespace rt {

// ---- system calls: trap0(#1), number in r6, arguments in r0..r5, result in r0 ----
enum sysno : int {
  SYS_write = 64,
  SYS_exit = 93,
  SYS_exit_group = 94,
  SYS_futex = 98,
  SYS_clock_gettime = 113,
  SYS_sched_yield = 124,
  SYS_gettid = 178,
  SYS_munmap = 215,
  SYS_clone = 220,
  SYS_mmap2 = 222,
};

inline long syscall6(long n, long a, long b, long c, long d, long e, long f) {
  register long r0 __asm__("r0") = a;
  register long r1 __asm__("r1") = b;
  register long r2 __asm__("r2") = c;
  register long r3 __asm__("r3") = d;
  register long r4 __asm__("r4") = e;
  register long r5 __asm__("r5") = f;
  register long r6 __asm__("r6") = n;
  __asm__ volatile("trap0(#1)" : "+r"(r0) : "r"(r1), "r"(r2), "r"(r3), "r"(r4), "r"(r5), "r"(r6) : "memory");
  return r0;
}
inline long syscall(long n, long a = 0, long b = 0, long c = 0, long d = 0) { return syscall6(n, a, b, c, d, 0, 0); }

// Writes all of text to a file descriptor (1 stdout, 2 stderr).
void write_all(int fd, const char* text, size_t length);
[[noreturn]] void exit_process(int status);

// Anonymous private memory, whole pages; null on failure.
void* map_pages(size_t bytes);
void unmap_pages(void* p, size_t bytes);

// ---- futexes ----
void futex_wait(volatile int* word, int expected);  // sleeps while *word == expected
void futex_wake(volatile int* word, int count);

// A mutex of one word: 0 free, 1 held, 2 held with waiters.
struct mutex {
  volatile int word;
  void lock();
  void unlock();
};

// ---- threads ----
// A thread of the process, with its own 1 MiB stack; its context is reached through
// the ugp register, which holds the thread's context on every runtime thread.
struct thread;
// Starts fn(arg) on a new thread; null if no thread could be made.
thread* thread_start(void (*fn)(void*), void* arg);
// Waits for the thread to end and releases its stack.
void thread_join(thread* t);
// Makes the main thread's context current (ugp); the first thing a program does.
void set_main_context();

// ---- start-up options ----
// Options of the program's command line that configure the simulated platform before
// any static initialiser runs: --units=N (CORVANE_UNITS) and --fault-startup=init|power
// (CORVANE_FAULT_STARTUP). They override the environment of the same names.
const char* option(const char* name);
void set_start_arguments(int argc, char** argv, char** envp);

// Runs the functions registered with atexit and __cxa_atexit, last registered first.
void run_exit_handlers();

}  // namespace rt

#endif
