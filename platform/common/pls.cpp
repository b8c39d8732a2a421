// Process-local storage: one record per (type, key), made by its constructor on first
// add and destroyed with its destructor when the process ends.
#include "HAP.h"
#include "libc.h"
#include "sim.h"

namespace {

constexpr int kMaxRecords = 16;
constexpr int kRecordBytes = 64;

struct pls_record {
  uintptr_t type;
  uintptr_t key;
  void (*dtor)(void*);
  bool used;
  alignas(16) unsigned char data[kRecordBytes];
};

pls_record records[kMaxRecords];
bool exit_hook_registered = false;

pls_record* find(uintptr_t type, uintptr_t key) {
  for (pls_record& r : records)
    if (r.used && r.type == type && r.key == key) return &r;
  return nullptr;
}

// Last made, first destroyed.
void destroy_all() {
  for (int i = kMaxRecords - 1; i >= 0; --i) {
    pls_record& r = records[i];
    if (r.used && r.dtor != nullptr) r.dtor(r.data);
    r.used = false;
  }
}

}  // namespace

extern "C" {

int HAP_pls_add(uintptr_t type, uintptr_t key, int size, int (*ctor)(void*, void*), void* context,
                void (*dtor)(void*), void** record) {
  pls_record* r;
  {
    sim::guard g;
    r = find(type, key);
    if (r != nullptr) {
      *record = r->data;
      return 0;
    }
    if (size < 0 || size > kRecordBytes) return -1;
    for (pls_record& candidate : records)
      if (!candidate.used) {
        r = &candidate;
        break;
      }
    if (r == nullptr) return -1;
    r->used = true;
    r->type = type;
    r->key = key;
    r->dtor = dtor;
    memset(r->data, 0, sizeof(r->data));
    if (!exit_hook_registered) {
      exit_hook_registered = true;
      atexit(destroy_all);
    }
  }
  // The constructor runs outside the platform's lock: it may call the platform.
  if (ctor != nullptr) ctor(context, r->data);
  *record = r->data;
  return 0;
}

int HAP_pls_lookup(uintptr_t type, uintptr_t key, void** record) {
  sim::guard g;
  pls_record* r = find(type, key);
  if (r == nullptr) return -1;
  *record = r->data;
  return 0;
}

}  // extern "C"
