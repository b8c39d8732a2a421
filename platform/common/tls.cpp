// Thread-specific storage keys: a value slot per thread and key.
#include "qurt.h"
#include "sim.h"

namespace {

struct tls_key {
  bool used;
  void (*destructor)(void*);
};
tls_key keys[sim::kMaxTlsKeys];

bool valid(int key) { return key >= 0 && key < sim::kMaxTlsKeys && keys[key].used; }

}  // namespace

namespace sim {
// Runs the key destructors for a thread that ends, for its values that are set.
void run_tls_destructors(thread_state* t) {
  for (int k = 0; k < kMaxTlsKeys; ++k) {
    void* value = t->tls[k];
    t->tls[k] = nullptr;
    if (value != nullptr && keys[k].used && keys[k].destructor != nullptr) keys[k].destructor(value);
  }
}
}  // namespace sim

extern "C" {

int qurt_tls_create_key(int* key, void (*destructor)(void*)) {
  sim::guard g;
  for (int k = 0; k < sim::kMaxTlsKeys; ++k)
    if (!keys[k].used) {
      keys[k].used = true;
      keys[k].destructor = destructor;
      *key = k;
      return 0;
    }
  return -1;
}

int qurt_tls_delete_key(int key) {
  sim::guard g;
  if (!valid(key)) return -1;
  keys[key].used = false;
  keys[key].destructor = nullptr;
  return 0;
}

void* qurt_tls_get_specific(int key) {
  if (key < 0 || key >= sim::kMaxTlsKeys) return nullptr;
  return sim::current_thread()->tls[key];
}

int qurt_tls_set_specific(int key, const void* value) {
  if (key < 0 || key >= sim::kMaxTlsKeys) return -1;
  sim::current_thread()->tls[key] = const_cast<void*>(value);
  return 0;
}

}  // extern "C"
