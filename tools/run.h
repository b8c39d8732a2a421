// `corvane run <method> [options] IN.png OUT.png`: one method on an image file.
#ifndef CORVANE_TOOLS_RUN_H
#define CORVANE_TOOLS_RUN_H

#include <cstdio>

#include "tools/method_modes.h"

namespace corvane {
namespace tools {

// args: what follows "run" on the command line. Returns the exit status: 0 done, 1 the
// method or a file failed, 2 bad arguments. OUT.png is left as it was unless 0.
int run_command(int argc, char** argv);

void print_run_usage(FILE* out);

}  // namespace tools
}  // namespace corvane

#endif
