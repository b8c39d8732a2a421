// The two box filter families as lists: the axes of their members and the one formula
// that maps the arguments of a call to a member. The dispatch tables are built from
// shape_of, the exported function finds a member with index_of, and the tests, the
// benchmarks and the command line name members with member_name; nothing else spells
// the layout out.
//
//   boxfilter_    unsigned 8-bit input, 16-bit sums; out u8, i16, f32 (ddepth 0..5)
//   boxfilter16s_ signed 16-bit input, 32-bit sums;  out i16, i32      (ddepth 2..5)
//
// Index: [W / 2][H / 2][ddepth / 2 - first_out][normalize], W and H in 1, 3, ..., 15.
#ifndef CORVANE_KERNELS_FILTERS_BOXFILTER_FAMILY_H
#define CORVANE_KERNELS_FILTERS_BOXFILTER_FAMILY_H

#include <stdint.h>

namespace cv {
namespace adsp {
namespace box {

constexpr int kSizes = 8;      // W and H: 1, 3, ..., 15, found by size / 2
constexpr int kMaxSize = 15;   // largest kernel_width / kernel_height a table serves
constexpr int kNorms = 2;      // 0 the sum, 1 the mean
constexpr int kRowsToFetch = 4;

// The output element, numbered as ddepth / 2 numbers it.
enum out_kind : int { out_u8 = 0, out_i16 = 1, out_32 = 2 };

struct member_shape {
  int w, h;
  out_kind out;
  bool norm;
};

struct family {
  const char* name;
  int input_bytes;  // 1: unsigned 8-bit pixels, 2: signed 16-bit
  int first_out;    // the smallest ddepth / 2 served
  int outputs;      // output kinds served, from first_out on

  constexpr int members() const { return kSizes * kSizes * outputs * kNorms; }

  // The member for a call's arguments, or -1 where the table has none. Sizes are read
  // as size / 2, so an even size is served by the next odd one and 0 by 1.
  constexpr int index_of(int kernel_width, int kernel_height, int ddepth, bool normalize) const {
    if (kernel_width < 0 || kernel_width > kMaxSize || kernel_height < 0 || kernel_height > kMaxSize) return -1;
    if (ddepth < 2 * first_out || ddepth >= 2 * (first_out + outputs)) return -1;
    return ((kernel_width / 2 * kSizes + kernel_height / 2) * outputs + (ddepth / 2 - first_out)) * kNorms +
           (normalize ? 1 : 0);
  }

  constexpr member_shape shape_of(int index) const {
    return {index / (kNorms * outputs * kSizes) * 2 + 1, index / (kNorms * outputs) % kSizes * 2 + 1,
            static_cast<out_kind>(index / kNorms % outputs + first_out), index % kNorms == 1};
  }

  // "boxfilter/5x3_i16_mean": family, W x H, output element, sum or mean. The 32-bit
  // element is a float in the 8-bit family and an integer in the 16-bit one. Writes at
  // most 32 bytes, the terminating zero included.
  void member_name(int index, char (&text)[32]) const {
    static const char* const out_names[2][3] = {{"u8", "i16", "f32"}, {"u8", "i16", "i32"}};
    const member_shape s = shape_of(index);
    char* p = text;
    auto put = [&p](const char* s) {
      while (*s) *p++ = *s++;
    };
    auto put_int = [&p](int v) {
      if (v >= 10) *p++ = static_cast<char>('0' + v / 10);
      *p++ = static_cast<char>('0' + v % 10);
    };
    put(name);
    put("/");
    put_int(s.w);
    put("x");
    put_int(s.h);
    put("_");
    put(out_names[input_bytes - 1][s.out]);
    put(s.norm ? "_mean" : "_sum");
    *p = '\0';
  }
};

constexpr family k8u{"boxfilter", 1, out_u8, 3};     // 384 members a mode
constexpr family k16s{"boxfilter16s", 2, out_i16, 2};  // 256 members a mode

// The fixed-point reciprocal of the window, in both families:
// min(32767, round(65536 / (W * H))). An odd W * H above 1 never meets a tie.
constexpr int16_t norm_value(int w, int h) {
  const int area = w * h;
  const int q = (65536 + area / 2) / area;
  return static_cast<int16_t>(q > 32767 ? 32767 : q);
}

namespace detail {
// Decoding a member and looking its arguments up again gives the member back.
constexpr bool round_trips(const family& f) {
  for (int i = 0; i < f.members(); ++i) {
    const member_shape s = f.shape_of(i);
    if (f.index_of(s.w, s.h, 2 * s.out, s.norm) != i) return false;
  }
  return true;
}
static_assert(round_trips(k8u) && round_trips(k16s), "shape_of inverts index_of");
static_assert(k8u.members() == 384 && k16s.members() == 256, "one member per W, H, output and normalisation");
}  // namespace detail

}  // namespace box
}  // namespace adsp
}  // namespace cv

#endif
