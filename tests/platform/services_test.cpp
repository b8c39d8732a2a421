// Process-local records, thread-specific keys and log lines of the simulated platform.
#include <gtest/gtest.h>

#include <thread>

#include "HAP.h"
#include "qurt.h"
#include "support/platform.h"

namespace {

int constructed = 0;
int make_record(void* context, void* data) {
  ++constructed;
  *static_cast<int*>(data) = *static_cast<int*>(context);
  return 0;
}

TEST(ProcessLocalStorage, RecordIsMadeOncePerTypeAndKey) {
  int seven = 7, eight = 8;
  void* first = nullptr;
  void* again = nullptr;
  void* other_key = nullptr;
  ASSERT_EQ(0, HAP_pls_add(0x1234, 1, 4, make_record, &seven, nullptr, &first));
  ASSERT_EQ(0, HAP_pls_add(0x1234, 1, 4, make_record, &eight, nullptr, &again));
  EXPECT_EQ(first, again);
  EXPECT_EQ(1, constructed);
  EXPECT_EQ(7, *static_cast<int*>(first));
  ASSERT_EQ(0, HAP_pls_add(0x1234, 2, 4, make_record, &eight, nullptr, &other_key));
  EXPECT_NE(first, other_key);

  void* found = nullptr;
  EXPECT_EQ(0, HAP_pls_lookup(0x1234, 2, &found));
  EXPECT_EQ(other_key, found);
  EXPECT_NE(0, HAP_pls_lookup(0x9999, 1, &found)) << "another type is another record";
}

TEST(ThreadKeys, EachThreadSeesItsOwnValue) {
  int key = -1;
  ASSERT_EQ(0, qurt_tls_create_key(&key, nullptr));
  int mine = 1, theirs = 2;
  qurt_tls_set_specific(key, &mine);
  std::thread t([&] {
    EXPECT_EQ(nullptr, qurt_tls_get_specific(key));
    qurt_tls_set_specific(key, &theirs);
    EXPECT_EQ(&theirs, qurt_tls_get_specific(key));
  });
  t.join();
  EXPECT_EQ(&mine, qurt_tls_get_specific(key));
  EXPECT_EQ(0, qurt_tls_delete_key(key));
}

TEST(Logging, LinesReachTheSinkWithLevelFileAndLine) {
  test::LogCapture log;
  HAP_debug_v2(2, "a.cpp", 12, "value %d, text %s", 42, "x");
  HAP_debug("plain", 3, "b.cpp", 7);
  const auto lines = log.lines();
  ASSERT_EQ(2u, lines.size());
  EXPECT_EQ("value 42, text x", lines[0].text);
  EXPECT_EQ(2, lines[0].level);
  EXPECT_EQ("a.cpp", lines[0].file);
  EXPECT_EQ(12, lines[0].line);
  EXPECT_EQ("plain", lines[1].text);
  EXPECT_EQ(3, lines[1].level);
}

}  // namespace
