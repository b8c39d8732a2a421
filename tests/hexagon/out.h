// Text output of the freestanding test programs, on both builds: formatted with the
// platform's vsnprintf, written to stdout.
#ifndef CORVANE_TESTS_HEXAGON_OUT_H
#define CORVANE_TESTS_HEXAGON_OUT_H

namespace out {
void print(const char* format, ...) __attribute__((format(printf, 1, 2)));
}

#endif
