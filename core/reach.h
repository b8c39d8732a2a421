// What a kernel reads and writes, stated as a function of its arguments, and the one
// check that every exported function makes before a kernel runs: each region lies inside
// the memory record it belongs to, with the alignment the mode's vector loads and stores
// need. A call that fails it answers 14 and touches nothing.
//
// A kernel declares its reach next to its run, as
//   static hvx::reach reach(<the arguments of run, without the mode>);
// listing one region per buffer it touches: `rows` runs of `row_bytes` bytes, `pitch`
// bytes apart, from the buffer's first byte. Sizes are 64-bit and saturate, so no
// descriptor can overflow them; a negative size, or arguments that describe no image the
// kernel can walk (refuse_if), fail the check whatever the buffers are.
#ifndef CORVANE_CORE_REACH_H
#define CORVANE_CORE_REACH_H

#include <stdint.h>

#include "core/hvx_modes.h"
#include "core/membuf.h"

namespace hvx {

// Saturating arithmetic on sizes: a result that does not fit is INT64_MAX, which no
// buffer holds. Negative operands are the caller's to refuse first.
inline int64_t sat_add(int64_t a, int64_t b) {
  int64_t r;
  return __builtin_add_overflow(a, b, &r) ? INT64_MAX : r;
}
inline int64_t sat_mul(int64_t a, int64_t b) {
  int64_t r;
  return __builtin_mul_overflow(a, b, &r) ? INT64_MAX : r;
}
// ceil(a / b) for a >= 0, b > 0.
inline int64_t div_up(int64_t a, int64_t b) { return a / b + (a % b != 0 ? 1 : 0); }

// The bytes that a view's rows span, stride * rows; -1, which no region fits, when
// either is negative.
inline int64_t image_bytes(const InOutPtrBase& view) {
  return view.stride_bytes() < 0 || view.rows() < 0 ? -1 : sat_mul(view.stride_bytes(), view.rows());
}

// A memory record for a buffer given as a pointer and a length in bytes (functions over
// flat buffers), so that its reach is checked like an image's. A length past the int
// range is held at INT32_MAX; a negative one stays negative, which no region fits.
inline corvane_mbuf flat_buffer(const void* p, int64_t bytes) {
  return corvane_mbuf{static_cast<unsigned char*>(const_cast<void*>(p)),
                      static_cast<int>(bytes > INT32_MAX ? INT32_MAX : bytes < INT32_MIN ? INT32_MIN : bytes)};
}

// The alignment of a mode's vector loads and stores; 1 in Scalar.
template <mode_enum M> constexpr int64_t mode_align = M == Scalar ? 1 : static_cast<int64_t>(mode_vector_bytes<M>);

// One buffer's part of a reach.
struct region {
  const corvane_mbuf* buffer;
  int64_t rows;       // runs of bytes
  int64_t pitch;      // [bytes] from the start of one run to the next
  int64_t row_bytes;  // [bytes] in each run
  int64_t align;      // of the buffer's first byte and of the pitch, when more than one run
};

class reach {
 public:
  static constexpr int kMaxRegions = 8;

  // `rows` runs of `row_bytes` bytes, `pitch` bytes apart.
  reach& rows(const corvane_mbuf* buffer, int64_t rows, int64_t pitch, int64_t row_bytes, int64_t align = 1) {
    if (_count == kMaxRegions) {
      _absurd = true;  // a kernel that declares more than it can be checked for is refused
    } else {
      _regions[_count++] = region{buffer, rows, pitch, row_bytes, align};
    }
    return *this;
  }
  // `rows` rows of an image view, `row_bytes` from each row's start, a stride apart.
  reach& image_rows(const InOutPtrBase& view, int64_t rows, int64_t row_bytes, int64_t align = 1) {
    return this->rows(view.buffer, rows, view.stride_bytes(), row_bytes, align);
  }
  // The first `bytes` bytes.
  reach& bytes(const corvane_mbuf* buffer, int64_t bytes, int64_t align = 1) {
    return rows(buffer, 1, 0, bytes, align);
  }
  // The arguments describe nothing the kernel can walk: refused whatever the buffers.
  reach& refuse_if(bool absurd) {
    _absurd = _absurd || absurd;
    return *this;
  }

  // Whether every region lies inside its buffer with its alignment. A region that
  // touches nothing (no rows, or rows of no bytes) asks nothing of its buffer.
  bool fits() const {
    if (_absurd) return false;
    for (int i = 0; i < _count; ++i) {
      const region& r = _regions[i];
      if (r.rows < 0 || r.pitch < 0 || r.row_bytes < 0 || r.align < 1 || r.align > 4096) return false;
      if (r.rows == 0 || r.row_bytes == 0) continue;
      if (r.buffer == nullptr || r.buffer->mem == nullptr) return false;
      const int64_t end = sat_add(sat_mul(r.rows - 1, r.pitch), r.row_bytes);
      if (end > static_cast<int64_t>(r.buffer->memLen)) return false;
      if (reinterpret_cast<uintptr_t>(r.buffer->mem) % static_cast<uintptr_t>(r.align) != 0) return false;
      if (r.rows > 1 && r.pitch % r.align != 0) return false;
    }
    return true;
  }

 private:
  region _regions[kMaxRegions] = {};
  int _count = 0;
  bool _absurd = false;
};

}  // namespace hvx

#endif
