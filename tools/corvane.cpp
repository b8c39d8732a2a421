// The corvane command-line tool: the demo pipeline on a built-in image, and the list of
// the remote interface's methods.
#include <chrono>
#include <cstdio>
#include <cstring>
#include <string>

#include "client/corvane_client.h"
#include "corvane_platform.h"
#include "remote/method_table.h"

namespace {

using corvane::client::Image;

struct mode_choice {
  const char* name;
  int units;  // HVX units the platform grants, which settles the mode
};
constexpr mode_choice kModes[] = {{"Scalar", 0}, {"SingleHVX", 1}, {"DualHVX", 2}};

// A built-in 8-bit grey image: diagonal ramps with a checker, odd sizes, a stride wider
// than the row.
Image demo_image() {
  Image img(641, 479, 1, corvane::client::U8, 768);
  for (int y = 0; y < img.rows(); ++y) {
    uint8_t* row = img.row(y);
    for (int x = 0; x < img.stride(); ++x) row[x] = uint8_t((x + 2 * y) ^ (((x / 32) + (y / 32)) & 1 ? 0x80 : 0));
  }
  return img;
}

int demo() {
  const Image src = demo_image();
  bool all_ok = true;
  for (const mode_choice& m : kModes) {
    corvane_platform_set_units(m.units);
    Image dst = corvane::client::canary_image(src.cols(), src.rows(), 1, corvane::client::U8, src.stride());
    const auto start = std::chrono::steady_clock::now();
    const AEEResult r = corvane::client::identity(src, dst);
    const double ms = std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start).count();
    const bool same = r == 0 && corvane::client::same_bytes(src, dst);
    all_ok = all_ok && same;
    std::printf("identity  %-9s  %dx%d u8, stride %d: result %d, %zu bytes %s, %.3f ms\n", m.name, src.cols(),
                src.rows(), src.stride(), r, src.byte_size(), same ? "identical" : "DIFFERENT", ms);
  }
  corvane_platform_reset();
  return all_ok ? 0 : 1;
}

int methods() {
  for (const corvane::remote::method_info& m : corvane::remote::kMethods)
    std::printf("%2d  %-36s %s\n", m.number, m.name, m.built ? "built" : "not yet built");
  return 0;
}

int usage(FILE* out, int status) {
  std::fprintf(out,
               "usage: corvane <command>\n"
               "  demo      run identity through the remote entry on a built-in image in each mode\n"
               "  methods   list the 53 methods of the remote interface and whether each is built\n");
  return status;
}

}  // namespace

int main(int argc, char** argv) {
  if (argc < 2) return usage(stderr, 2);
  const std::string command = argv[1];
  if (command == "demo" && argc == 2) return demo();
  if (command == "methods" && argc == 2) return methods();
  if (command == "help" || command == "--help" || command == "-h") return usage(stdout, 0);
  std::fprintf(stderr, "corvane: unknown command or arguments: %s\n", command.c_str());
  return usage(stderr, 2);
}
