// PNG files to and from client images, through libpng.
//
// Reading keeps the file's channels (grey, grey + alpha, RGB, RGBA; a palette becomes
// RGB or RGBA, grey below 8 bits becomes 8 bits) and its sample size: an 8-bit file gives
// a U8 image, a 16-bit file a U16 image with the samples in host byte order.
// Writing takes a U8 image (8-bit PNG) or a U16 or I16 image (16-bit PNG, the bits of
// each sample as they are) of 1 to 4 channels, and replaces the file only once the
// whole PNG is written: it goes to a temporary file beside it that is then renamed.
// Failures throw png_error with a message that names the file.
#ifndef CORVANE_TOOLS_PNG_IO_H
#define CORVANE_TOOLS_PNG_IO_H

#include <stdexcept>
#include <string>

#include "client/image.h"

namespace corvane {
namespace tools {

struct png_error : std::runtime_error {
  using std::runtime_error::runtime_error;
};

client::Image read_png(const std::string& path);
void write_png(const std::string& path, const client::Image& image);

}  // namespace tools
}  // namespace corvane

#endif
