// Execution modes, the reservation of HVX units for a call, the per-thread lock on a
// vector context, and the record that says which mode the calling thread holds.
#ifndef CORVANE_CORE_HVX_MODES_H
#define CORVANE_CORE_HVX_MODES_H

#include "core/nstd.h"

namespace hvx {

enum mode_enum : int { Scalar = 0, SingleHVX = 1, DualHVX = 2 };

// Vector bytes of a mode: 64 for SingleHVX, 128 for DualHVX, none for Scalar.
template <mode_enum M> constexpr size_t mode_vector_bytes = M == DualHVX ? 128 : M == SingleHVX ? 64 : 0;

template <mode_enum M> struct mode_c {
  static constexpr mode_enum value = M;
  static mode_c instance;

  void lock();      // waits for a context; the result is dropped
  bool try_lock();  // does not wait
  void unlock();    // unlocks the context and returns the thread to Scalar
  bool is_current() const;
};
template <mode_enum M> mode_c<M> mode_c<M>::instance;

template <mode_enum M> using for_mode = mode_c<M>&;

// The calling thread's mode record; a thread that never locked reads Scalar.
mode_enum get_thread_mode();
void set_thread_mode(mode_enum m);
// Whether the calling thread has (or can get) its record. Records come from a static
// pool with room for 15 threads per load of the library.
bool has_thread_record();

template <mode_enum M> bool _lock_HVX(bool wait);
void _unlock_HVX();

class mode_lock {
 public:
  template <mode_enum M> explicit mode_lock(mode_c<M>& mode) : _mode(M), _owned_mode(M) {
    if (M == Scalar) {
      (void)has_thread_record();
    } else if (!has_thread_record()) {
      _owned_mode = Scalar;  // no record to hold the mode: report it as not held
    } else {
      mode.lock();
    }
  }
  template <mode_enum M> mode_lock(mode_c<M>& mode, nstd::try_lock_c)
      : _mode(M), _owned_mode(mode.try_lock() ? M : Scalar) {}
  template <mode_enum M> mode_lock(mode_c<M>&, nstd::defer_lock_c) : _mode(M), _owned_mode(Scalar) {}
  template <mode_enum M> mode_lock(mode_c<M>&, nstd::adopt_lock_c) : _mode(M), _owned_mode(M) {}

  mode_lock(const mode_lock&) = delete;
  mode_lock& operator=(const mode_lock&) = delete;

  // Only an owned vector mode is unlocked: a deferred guard or a failed try leaves the
  // thread's context alone.
  ~mode_lock() {
    if (_mode != Scalar && owns_mode()) _unlock_HVX();
  }

  bool owns_mode() const { return _mode == _owned_mode; }
  mode_enum mode() const { return _mode; }

 private:
  mode_enum _mode;
  mode_enum _owned_mode;
};

template <mode_enum M> inline mode_lock lock(mode_c<M>& mode) { return mode_lock(mode); }
template <mode_enum M> inline mode_lock adopt_lock(mode_c<M>& mode) {
  return mode_lock(mode, nstd::adopt_lock_c{});
}
// The waiting lock of a mode known only at run time; other values than 1 and 2 are Scalar.
mode_lock lock(mode_enum m);

class scoped_reservation {
 public:
  scoped_reservation(int num_reserved, bool owns) : _num_reserved(num_reserved), _owns_reservation(owns) {}
  scoped_reservation(scoped_reservation&& o) noexcept
      : _num_reserved(o._num_reserved), _owns_reservation(o._owns_reservation) {
    o._num_reserved = 0;
    o._owns_reservation = false;
  }
  scoped_reservation& operator=(scoped_reservation&& o) noexcept {
    if (this != &o) {
      nstd::swap(_num_reserved, o._num_reserved);
      nstd::swap(_owns_reservation, o._owns_reservation);
    }
    return *this;
  }
  scoped_reservation(const scoped_reservation&) = delete;
  scoped_reservation& operator=(const scoped_reservation&) = delete;
  ~scoped_reservation();

  // Units the process holds now, not when this object was made.
  static int query_reserved();
  template <int N> static bool num_reserved() { return query_reserved() >= N; }

  int reserved_at_start() const { return _num_reserved; }
  bool owns_reservation() const { return _owns_reservation; }

 private:
  int _num_reserved;
  bool _owns_reservation;
};

// Reserves every free unit unless the process already holds some.
scoped_reservation reserve_all();

// Whether the DSP side came up when the library was loaded.
bool IsInitialized();

}  // namespace hvx

#endif
