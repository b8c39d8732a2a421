#include "tools/png_io.h"

#include <png.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <climits>
#include <csetjmp>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <vector>

namespace corvane {
namespace tools {

namespace {

// libpng reports errors by longjmp. The functions that call setjmp below hold only
// plain data, so that the jump skips no destructor; the C++ parts stay outside them.
struct error_context {
  char message[256];
};

void on_error(png_structp png, png_const_charp text) {
  error_context* ctx = static_cast<error_context*>(png_get_error_ptr(png));
  std::snprintf(ctx->message, sizeof ctx->message, "%s", text);
  png_longjmp(png, 1);
}
void on_warning(png_structp, png_const_charp) {}

bool host_is_little_endian() {
  const uint16_t one = 1;
  uint8_t first;
  std::memcpy(&first, &one, 1);
  return first == 1;
}

struct header {
  png_uint_32 width, height;
  int channels, bit_depth;
};

bool read_header(png_structp png, png_infop info, FILE* file, header* out) {
  if (setjmp(png_jmpbuf(png))) return false;
  png_init_io(png, file);
  png_set_sig_bytes(png, 8);
  png_read_info(png, info);
  // Palette to RGB(A), grey below 8 bits to 8 bits, a transparent colour to alpha.
  png_set_expand(png);
  if (png_get_bit_depth(png, info) == 16 && host_is_little_endian()) png_set_swap(png);
  png_set_interlace_handling(png);
  png_read_update_info(png, info);
  out->width = png_get_image_width(png, info);
  out->height = png_get_image_height(png, info);
  out->channels = png_get_channels(png, info);
  out->bit_depth = png_get_bit_depth(png, info);
  return true;
}

bool read_rows(png_structp png, png_bytepp rows) {
  if (setjmp(png_jmpbuf(png))) return false;
  png_read_image(png, rows);
  png_read_end(png, nullptr);
  return true;
}

bool write_rows(png_structp png, png_infop info, FILE* file, const header* h, png_bytepp rows) {
  if (setjmp(png_jmpbuf(png))) return false;
  static const int kColourTypes[] = {PNG_COLOR_TYPE_GRAY, PNG_COLOR_TYPE_GRAY_ALPHA, PNG_COLOR_TYPE_RGB,
                                     PNG_COLOR_TYPE_RGB_ALPHA};
  png_init_io(png, file);
  png_set_IHDR(png, info, h->width, h->height, h->bit_depth, kColourTypes[h->channels - 1], PNG_INTERLACE_NONE,
               PNG_COMPRESSION_TYPE_DEFAULT, PNG_FILTER_TYPE_DEFAULT);
  png_write_info(png, info);
  if (h->bit_depth == 16 && host_is_little_endian()) png_set_swap(png);
  png_write_image(png, rows);
  png_write_end(png, nullptr);
  return true;
}

struct file_closer {
  void operator()(FILE* f) const {
    if (f != nullptr) std::fclose(f);
  }
};
using file_ptr = std::unique_ptr<FILE, file_closer>;

std::string system_error(const std::string& path) { return path + ": " + std::strerror(errno); }

}  // namespace

client::Image read_png(const std::string& path) {
  file_ptr file(std::fopen(path.c_str(), "rb"));
  if (!file) throw png_error(system_error(path));
  png_byte signature[8];
  if (std::fread(signature, 1, 8, file.get()) != 8 || png_sig_cmp(signature, 0, 8) != 0)
    throw png_error(path + ": not a PNG file");

  error_context ctx{};
  png_structp png = png_create_read_struct(PNG_LIBPNG_VER_STRING, &ctx, on_error, on_warning);
  png_infop info = png ? png_create_info_struct(png) : nullptr;
  struct reader {
    png_structp* png;
    png_infop* info;
    ~reader() { png_destroy_read_struct(png, info, nullptr); }
  } cleanup{&png, &info};
  if (info == nullptr) throw png_error(path + ": out of memory");

  header h{};
  if (!read_header(png, info, file.get(), &h)) throw png_error(path + ": " + ctx.message);
  const size_t row_bytes = size_t(h.width) * size_t(h.channels) * size_t(h.bit_depth / 8);
  const size_t padded = (row_bytes + client::kRowAlignment - 1) / client::kRowAlignment * client::kRowAlignment;
  if (h.width > INT_MAX / 8 || padded * h.height > size_t(INT_MAX))
    throw png_error(path + ": image too large (" + std::to_string(h.width) + "x" + std::to_string(h.height) + ")");

  client::Image image(int(h.width), int(h.height), h.channels, h.bit_depth == 16 ? client::U16 : client::U8);
  image.fill(0);
  std::vector<png_bytep> rows(h.height);
  for (png_uint_32 y = 0; y < h.height; ++y) rows[y] = image.row(int(y));
  if (!read_rows(png, rows.data())) throw png_error(path + ": " + ctx.message);
  return image;
}

void write_png(const std::string& path, const client::Image& image) {
  const int32_t depth = image.depth();
  if (depth != client::U8 && depth != client::U16 && depth != client::I16)
    throw png_error(path + ": a PNG holds 8-bit or 16-bit samples only");
  if (image.channels() < 1 || image.channels() > 4) throw png_error(path + ": a PNG holds 1 to 4 channels");
  if (image.cols() < 1 || image.rows() < 1) throw png_error(path + ": a PNG needs at least one pixel");

  // The temporary file sits in the target's directory, so that the rename stays on one
  // file system and replaces the target in one step.
  std::string temp = path + ".XXXXXX";
  const int fd = mkstemp(&temp[0]);
  if (fd < 0) throw png_error(system_error(path));
  const mode_t mask = umask(0);
  umask(mask);
  fchmod(fd, 0666 & ~mask);
  file_ptr file(fdopen(fd, "wb"));
  if (!file) {
    const std::string why = system_error(path);
    close(fd);
    unlink(temp.c_str());
    throw png_error(why);
  }
  auto fail = [&](const std::string& why) {
    file.reset();
    unlink(temp.c_str());
    throw png_error(path + ": " + why);
  };

  error_context ctx{};
  png_structp png = png_create_write_struct(PNG_LIBPNG_VER_STRING, &ctx, on_error, on_warning);
  png_infop info = png ? png_create_info_struct(png) : nullptr;
  const header h{png_uint_32(image.cols()), png_uint_32(image.rows()), image.channels(), depth == client::U8 ? 8 : 16};
  std::vector<png_bytep> rows(h.height);
  for (png_uint_32 y = 0; y < h.height; ++y) rows[y] = const_cast<png_bytep>(image.row(int(y)));
  const bool created = info != nullptr;
  const bool written = created && write_rows(png, info, file.get(), &h, rows.data());
  png_destroy_write_struct(&png, &info);
  if (!written) fail(created ? ctx.message : "out of memory");

  if (std::fflush(file.get()) != 0 || std::ferror(file.get())) fail(std::strerror(errno));
  FILE* f = file.release();
  if (std::fclose(f) != 0) {
    const std::string why = std::strerror(errno);
    unlink(temp.c_str());
    throw png_error(path + ": " + why);
  }
  if (std::rename(temp.c_str(), path.c_str()) != 0) {
    const std::string why = std::strerror(errno);
    unlink(temp.c_str());
    throw png_error(path + ": " + why);
  }
}

}  // namespace tools
}  // namespace corvane
