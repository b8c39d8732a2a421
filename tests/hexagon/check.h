// A small test runner for the freestanding programs of the hexagon build, where there is
// no GoogleTest: TEST(group, name) registers a case, EXPECT_* record failures and go on,
// ASSERT_* end the case. check::run_all runs every case, reports like a test framework
// and gives the program's exit status.
#ifndef CORVANE_TESTS_HEXAGON_CHECK_H
#define CORVANE_TESTS_HEXAGON_CHECK_H

#include "out.h"

namespace check {

struct test {
  const char* name;
  void (*body)();
  test* next;
};

struct registrar {
  explicit registrar(test* t);
};

// Runs the cases whose name starts with `only` (all for null) and not with `except`
// (none for null), and prints the summary "N passed, N failed". Non-zero if any case
// failed or none ran.
int run_all(const char* only, const char* except = nullptr);
// The value of --only=PREFIX among the arguments, or null.
const char* only_option(int argc, char** argv);

void fail(const char* file, int line, const char* what, long long a, long long b);
bool current_failed();

}  // namespace check

#define CHECK_CAT_(a, b) a##b
#define TEST(group, name)                                                                          \
  static void CHECK_CAT_(group, _##name)();                                                        \
  static check::test CHECK_CAT_(group, _##name##_case) = {#group "." #name, CHECK_CAT_(group, _##name), nullptr}; \
  static check::registrar CHECK_CAT_(group, _##name##_reg)(&CHECK_CAT_(group, _##name##_case));    \
  static void CHECK_CAT_(group, _##name)()

#define CHECK_COMPARE_(a, op, b, on_fail)                                              \
  do {                                                                                 \
    const auto check_a_ = (a);                                                         \
    const auto check_b_ = (b);                                                         \
    if (!(check_a_ op check_b_)) {                                                     \
      check::fail(__FILE__, __LINE__, #a " " #op " " #b, (long long)check_a_, (long long)check_b_); \
      on_fail;                                                                         \
    }                                                                                  \
  } while (0)

#define EXPECT_EQ(a, b) CHECK_COMPARE_(a, ==, b, (void)0)
#define EXPECT_NE(a, b) CHECK_COMPARE_(a, !=, b, (void)0)
#define EXPECT_TRUE(a) CHECK_COMPARE_(static_cast<bool>(a), ==, true, (void)0)
#define ASSERT_EQ(a, b) CHECK_COMPARE_(a, ==, b, return)
#define ASSERT_TRUE(a) CHECK_COMPARE_(static_cast<bool>(a), ==, true, return)

#endif
