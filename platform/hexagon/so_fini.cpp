// The shared object has no _start: its exit handlers run when it is unloaded.
#include "rt.h"

namespace {
__attribute__((destructor)) void run_at_unload() { rt::run_exit_handlers(); }
}  // namespace
