// PNG files to client images and back: samples, channels and sizes survive a round trip;
// a failed write leaves the target as it was.
#include "tools/png_io.h"

#include <gtest/gtest.h>
#include <stdlib.h>
#include <unistd.h>

#include <cstdio>
#include <cstring>
#include <fstream>
#include <iterator>
#include <string>

namespace {

using corvane::client::Image;
using corvane::tools::png_error;
using corvane::tools::read_png;
using corvane::tools::write_png;

std::string temp_dir() {
  std::string dir = testing::TempDir() + "corvane_png_XXXXXX";
  EXPECT_NE(nullptr, mkdtemp(&dir[0]));
  return dir + "/";
}

std::string file_bytes(const std::string& path) {
  std::ifstream f(path, std::ios::binary);
  return std::string(std::istreambuf_iterator<char>(f), {});
}

// Whether the pixels of the rows (not the padding) agree.
void expect_same_pixels(const Image& a, const Image& b) {
  ASSERT_EQ(a.cols(), b.cols());
  ASSERT_EQ(a.rows(), b.rows());
  ASSERT_EQ(a.channels(), b.channels());
  ASSERT_EQ(a.depth(), b.depth());
  for (int y = 0; y < a.rows(); ++y)
    ASSERT_EQ(0, std::memcmp(a.row(y), b.row(y), a.row_bytes())) << "row " << y;
}

struct shape {
  int cols, rows, channels;
  int32_t depth;
};

TEST(PngIo, RoundTripKeepsEverySample) {
  const std::string dir = temp_dir();
  const shape shapes[] = {{1, 1, 1, corvane::client::U8},    {641, 37, 1, corvane::client::U8},
                          {129, 5, 3, corvane::client::U8},   {33, 9, 4, corvane::client::U8},
                          {65, 7, 2, corvane::client::U8},    {130, 6, 1, corvane::client::U16},
                          {17, 11, 3, corvane::client::U16},  {5, 3, 2, corvane::client::U16}};
  uint32_t seed = 1;
  for (const shape& s : shapes) {
    SCOPED_TRACE(std::to_string(s.cols) + "x" + std::to_string(s.rows) + "x" + std::to_string(s.channels) +
                 " depth " + std::to_string(s.depth));
    Image original(s.cols, s.rows, s.channels, s.depth);
    original.fill_random(seed++);
    const std::string path = dir + "round.png";
    write_png(path, original);
    expect_same_pixels(original, read_png(path));
  }
}

TEST(PngIo, SixteenBitSamplesAreBigEndianInTheFile) {
  // 0x0102 written as one grey sample: the file's sample bytes are 01 02, so a reader
  // that skipped the byte swap would read 0x0201.
  const std::string dir = temp_dir();
  Image one(1, 1, 1, corvane::client::U16);
  const uint16_t value = 0x0102;
  std::memcpy(one.data(), &value, 2);
  write_png(dir + "a.png", one);
  const Image back = read_png(dir + "a.png");
  uint16_t read;
  std::memcpy(&read, back.data(), 2);
  EXPECT_EQ(0x0102, read);
  // Signed samples keep their bits.
  Image negative(2, 1, 1, corvane::client::I16);
  const int16_t samples[2] = {-1, -32768};
  std::memcpy(negative.data(), samples, 4);
  write_png(dir + "b.png", negative);
  const Image bits = read_png(dir + "b.png");
  EXPECT_EQ(corvane::client::U16, bits.depth());
  EXPECT_EQ(0, std::memcmp(bits.data(), samples, 4));
}

TEST(PngIo, ReadingReportsTheFileAndWhatIsWrong) {
  const std::string dir = temp_dir();
  try {
    read_png(dir + "missing.png");
    FAIL() << "no error";
  } catch (const png_error& e) {
    EXPECT_NE(std::string::npos, std::string(e.what()).find("missing.png"));
  }
  std::ofstream(dir + "text.png") << "not an image at all";
  EXPECT_THROW(read_png(dir + "text.png"), png_error);

  // A PNG cut short after its header.
  Image img(64, 64, 1, corvane::client::U8);
  img.fill_random(3);
  write_png(dir + "whole.png", img);
  const std::string bytes = file_bytes(dir + "whole.png");
  std::ofstream(dir + "cut.png", std::ios::binary) << bytes.substr(0, 60);
  EXPECT_THROW(read_png(dir + "cut.png"), png_error);
}

TEST(PngIo, AFailedWriteLeavesTheTargetAndNoTemporaryFile) {
  const std::string dir = temp_dir();
  const std::string target = dir + "keep.png";
  std::ofstream(target) << "old contents";
  EXPECT_THROW(write_png(target, Image(4, 4, 1, corvane::client::F32)), png_error);
  EXPECT_THROW(write_png(target, Image(4, 4, 5, corvane::client::U8)), png_error);
  EXPECT_THROW(write_png(target, Image(0, 4, 1, corvane::client::U8)), png_error);
  EXPECT_THROW(write_png(dir + "no/such/dir.png", Image(4, 4, 1, corvane::client::U8)), png_error);
  EXPECT_EQ("old contents", file_bytes(target));

  // A successful write replaces the target and leaves only it.
  write_png(target, Image(4, 4, 1, corvane::client::U8));
  EXPECT_NE("old contents", file_bytes(target));
  int files = 0;
  for (const char* pattern : {"keep.png", "keep.png.*"}) {
    const std::string cmd = "ls " + dir + pattern + " 2>/dev/null | wc -l";
    FILE* p = popen(cmd.c_str(), "r");
    int n = 0;
    ASSERT_EQ(1, std::fscanf(p, "%d", &n));
    pclose(p);
    files += n;
  }
  EXPECT_EQ(1, files);
}

}  // namespace
