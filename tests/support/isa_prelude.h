// Included first by the lane tests of a higher level: the test framework and the
// standard library stay baseline code, the frame too (core/vector/isa_prelude.h), and the
// rest of the unit, the vector layer and the tests' own lane loops, is compiled for the
// level.
#ifndef CORVANE_TESTS_SUPPORT_ISA_PRELUDE_H
#define CORVANE_TESTS_SUPPORT_ISA_PRELUDE_H

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <random>
#include <set>
#include <string>
#include <vector>

#include "core/vector/isa_prelude.h"

#endif
