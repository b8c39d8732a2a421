// Views over an image: whole units, tails, strides and arrays of views.
#include <gtest/gtest.h>

#include "core/membuf.h"
#include "core/vector/gen_vec.h"

namespace {

typedef hvx::gen_vec<hvx::SingleHVX> vec64;

TEST(Views, UnitsTailAndStrideOfAVectorView) {
  alignas(128) uint8_t bytes[1024] = {};
  corvane_mbuf buf = {bytes, 1000};
  corvane_mbufd desc = {100, 30, 3, 1, 0, 0, 0, 0, 0};  // 300 bytes of rows
  in<vec64> view(gen_in(&desc, &buf));
  EXPECT_EQ(300u, view.byte_size());
  EXPECT_EQ(4u, view.vector_size());
  EXPECT_EQ(44u, view.scalar_tail_bytes());
  EXPECT_EQ(bytes + 256, view.scalar_begin_ptr());
  EXPECT_EQ(bytes + 300, view.scalar_end_ptr());
  EXPECT_EQ(1u, view.stride_vectors()) << "a stride that is not a whole vector is rounded down";
  EXPECT_EQ(reinterpret_cast<const vec64*>(bytes + 1000), view.allocated_end());
}

TEST(Views, BelowOneVectorEverythingIsTail) {
  alignas(128) uint8_t bytes[64] = {};
  corvane_mbuf buf = {bytes, 0};
  corvane_mbufd desc = {20, 20, 2, 1, 0, 0, 0, 0, 0};
  out<vec64> view(gen_out(&desc, &buf));
  EXPECT_EQ(0u, view.vector_size());
  EXPECT_EQ(view.begin(), view.vector_end());
  EXPECT_EQ(40u, view.scalar_tail_bytes());
  EXPECT_EQ(view.begin(), view.allocated_end()) << "memLen 0";
}

TEST(Views, ExactMultipleHasNoTail) {
  alignas(128) uint8_t bytes[256] = {};
  corvane_mbuf buf = {bytes, 256};
  corvane_mbufd desc = {128, 100, 2, 1, 0, 0, 0, 0, 0};
  in<vec64> view(gen_in(&desc, &buf));
  EXPECT_EQ(0u, view.scalar_tail_bytes());
  EXPECT_EQ(view.scalar_begin_ptr(), view.scalar_end_ptr());
  EXPECT_EQ(2u, view.stride_vectors());
}

TEST(Views, TypedElementsWalkRowsByStride) {
  alignas(128) uint16_t words[4 * 8] = {};
  words[2 * 8 + 5] = 77;  // row 2, element 5, stride 16 bytes
  corvane_mbuf buf = {reinterpret_cast<unsigned char*>(words), sizeof(words)};
  corvane_mbufd desc = {16, 6, 4, 1, 2, 1, 1, 0, 0};
  in<uint16_t> view(gen_in(&desc, &buf));
  EXPECT_EQ(77, view.begin()[2 * view.stride_vectors() + 5]);
  EXPECT_EQ(6, view.cols());
  EXPECT_EQ(1, view.border_left());
}

TEST(Views, ArraysShareTheDescriptorAndKeepTheirRecords) {
  uint8_t a[8], b[8], c[8];
  corvane_mbuf ra = {a, 8}, rb = {b, 8}, rc = {c, 8};
  corvane_mbufd desc = {8, 8, 1, 1, 0, 0, 0, 0, 0};
  GenInOutArray<false, 3> views(&desc, &ra, &rb, &rc);
  ASSERT_EQ(3u, views.size());
  EXPECT_EQ(c, views[2].ptr());
  InOutArray<uint8_t, 3> typed(views);
  EXPECT_EQ(b, typed[1].begin());
  EXPECT_EQ(&desc, typed[0].descriptor);
}

}  // namespace
