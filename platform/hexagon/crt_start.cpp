// Program start-up and exit of the static test programs: the C side of _start.
#include "rt.h"

typedef void (*init_fn)();

extern "C" {
extern init_fn __preinit_array_start[] __attribute__((weak, visibility("hidden")));
extern init_fn __preinit_array_end[] __attribute__((weak, visibility("hidden")));
extern init_fn __init_array_start[] __attribute__((weak, visibility("hidden")));
extern init_fn __init_array_end[] __attribute__((weak, visibility("hidden")));
extern init_fn __fini_array_start[] __attribute__((weak, visibility("hidden")));
extern init_fn __fini_array_end[] __attribute__((weak, visibility("hidden")));

int main(int argc, char** argv);

void exit(int status) __attribute__((noreturn, visibility("hidden")));
void exit(int status) {
  rt::run_exit_handlers();
  for (init_fn* f = __fini_array_end; f != __fini_array_start;) (*--f)();
  rt::exit_process(status);
}

// sp points at argc, then argv[] and a null, then envp[] and a null, then auxv.
[[noreturn]] __attribute__((visibility("hidden"))) void corvane_rt_start(long* sp) {
  rt::set_main_context();
  const int argc = static_cast<int>(sp[0]);
  char** argv = reinterpret_cast<char**>(sp + 1);
  char** envp = argv + argc + 1;
  // Options are read before the static initialisers: the library's start-up reads them.
  rt::set_start_arguments(argc, argv, envp);
  for (init_fn* f = __preinit_array_start; f != __preinit_array_end; ++f) (*f)();
  for (init_fn* f = __init_array_start; f != __init_array_end; ++f) (*f)();
  exit(main(argc, argv));
}
}
