// Mode locks, reservations and the thread-mode records.
#include "core/hvx_modes.h"
#include "core/log.h"
#include "core/nstd_memory.h"
#include "dspCV.h"
#include "qurt.h"

namespace hvx {
namespace {

void keep_record(void*) {}  // records are never given back

struct _tls_base {
  int key;
  int ret;
};

// Records come from a static pool: a record must exist before any heap is trusted on a
// worker thread. 16 slots of which 15 can be handed out.
struct static_allocator {
  static nstd::small_mempool<mode_enum, 16> mempool;
  static mode_enum* allocate() { return mempool.allocate(); }
};
nstd::small_mempool<mode_enum, 16> static_allocator::mempool;  // before thread_current_mode

template <class T, class A> struct TLS : _tls_base, A {
  TLS() {
    key = -1;
    ret = 0;
    ret = qurt_tls_create_key(&key, keep_record);
    if (ret != 0) LOG_LINE(2, "%s: qurt_tls_create_key failed with error code %d.", __PRETTY_FUNCTION__, ret);
  }
  ~TLS() { qurt_tls_delete_key(key); }
  TLS(const TLS&) = delete;
  TLS& operator=(const TLS&) = delete;

  // The calling thread's record, made on first use; null when none can be had.
  T* get() {
    if (ret != 0) return nullptr;
    T* record = static_cast<T*>(qurt_tls_get_specific(key));
    if (record == nullptr) {
      record = A::allocate();
      if (record == nullptr) {
        LOG_LINE(2, "thread-mode records exhausted: this thread cannot take a vector mode");
        return nullptr;
      }
      qurt_tls_set_specific(key, record);
    }
    return record;
  }
};

TLS<mode_enum, static_allocator> thread_current_mode;

constexpr dspCV_hvx_mode_t platform_mode(mode_enum m) {
  return m == SingleHVX ? DSPCV_HVX_MODE_64B : DSPCV_HVX_MODE_128B;
}

}  // namespace

mode_enum get_thread_mode() {
  mode_enum* record = thread_current_mode.get();
  return record != nullptr ? *record : Scalar;
}

void set_thread_mode(mode_enum m) {
  if (mode_enum* record = thread_current_mode.get()) *record = m;
}

bool has_thread_record() { return thread_current_mode.get() != nullptr; }

template <mode_enum M> bool _lock_HVX(bool wait) {
  if (!has_thread_record()) return false;  // no record, so no context either
  const int vlen = dspCV_hvx_lock(platform_mode(M), wait ? 1 : 0);
  const bool taken = vlen == static_cast<int>(mode_vector_bytes<M>);
  if (taken) set_thread_mode(M);
  return taken;
}
template bool _lock_HVX<SingleHVX>(bool);
template bool _lock_HVX<DualHVX>(bool);

void _unlock_HVX() {
  dspCV_hvx_unlock();
  set_thread_mode(Scalar);
}

template <> void mode_c<Scalar>::lock() {}
template <> bool mode_c<Scalar>::try_lock() { return true; }
template <> void mode_c<Scalar>::unlock() {}
template <> void mode_c<SingleHVX>::lock() { (void)_lock_HVX<SingleHVX>(true); }
template <> bool mode_c<SingleHVX>::try_lock() { return _lock_HVX<SingleHVX>(false); }
template <> void mode_c<SingleHVX>::unlock() { _unlock_HVX(); }
template <> void mode_c<DualHVX>::lock() { (void)_lock_HVX<DualHVX>(true); }
template <> bool mode_c<DualHVX>::try_lock() { return _lock_HVX<DualHVX>(false); }
template <> void mode_c<DualHVX>::unlock() { _unlock_HVX(); }
template <mode_enum M> bool mode_c<M>::is_current() const { return get_thread_mode() == M; }
template struct mode_c<Scalar>;
template struct mode_c<SingleHVX>;
template struct mode_c<DualHVX>;

mode_lock lock(mode_enum m) {
  switch (m) {
    case SingleHVX:
      return mode_lock(mode_c<SingleHVX>::instance);
    case DualHVX:
      return mode_lock(mode_c<DualHVX>::instance);
    default:
      return mode_lock(mode_c<Scalar>::instance);
  }
}

scoped_reservation::~scoped_reservation() {
  if (_owns_reservation && _num_reserved != 0) dspCV_hvx_unreserve();
}

int scoped_reservation::query_reserved() { return dspCV_hvx_num_reserved(); }

scoped_reservation reserve_all() {
  const int reserved = dspCV_hvx_num_reserved();
  if (reserved != 0) return scoped_reservation(reserved, false);
  const int granted = dspCV_hvx_reserve(0);
  if (granted > 0) return scoped_reservation(granted, true);
  return scoped_reservation(0, false);
}

}  // namespace hvx
