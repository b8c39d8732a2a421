// Functions to run at exit (atexit, and __cxa_atexit for the destructors of static
// objects) and the other pieces of the C++ ABI that freestanding code still needs.
#include "rt.h"

extern "C" {
void* __dso_handle = &__dso_handle;
}

namespace {

constexpr int kMaxHandlers = 64;

struct exit_handler {
  void (*fn)(void*);
  void* arg;
};
exit_handler handlers[kMaxHandlers];
int handler_count;
rt::mutex handlers_mutex;

void call_plain(void* fn) { reinterpret_cast<void (*)()>(fn)(); }

int add_handler(void (*fn)(void*), void* arg) {
  handlers_mutex.lock();
  const bool room = handler_count < kMaxHandlers;
  if (room) handlers[handler_count++] = {fn, arg};
  handlers_mutex.unlock();
  return room ? 0 : -1;
}

}  // namespace

extern "C" {

int __cxa_atexit(void (*fn)(void*), void* arg, void* /*dso*/) { return add_handler(fn, arg); }

int atexit(void (*fn)()) { return add_handler(call_plain, reinterpret_cast<void*>(fn)); }

void __cxa_pure_virtual() {
  static const char text[] = "pure virtual function called\n";
  rt::write_all(2, text, sizeof(text) - 1);
  rt::exit_process(134);
}

}  // extern "C"

// Objects with a virtual destructor reference the deletes even if nothing is ever
// deleted (there is no heap for new). The shared object's version script keeps them
// local: operator delete cannot be declared hidden.
void operator delete(void*) noexcept {}
void operator delete(void*, size_t) noexcept {}

namespace rt {

void run_exit_handlers() {
  for (;;) {
    handlers_mutex.lock();
    if (handler_count == 0) {
      handlers_mutex.unlock();
      return;
    }
    const exit_handler h = handlers[--handler_count];
    handlers_mutex.unlock();
    h.fn(h.arg);  // may register more handlers
  }
}

}  // namespace rt
