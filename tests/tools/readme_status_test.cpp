// The README's status table must say, for every method, what the method table says
// about it being built and what the CLI's table says about its modes.
#include <gtest/gtest.h>

#include <fstream>
#include <sstream>
#include <string>

#include "remote/method_table.h"
#include "tools/method_modes.h"

namespace {

TEST(Readme, StatusTableAgreesWithTheMethodTable) {
  std::ifstream readme(CORVANE_README);
  ASSERT_TRUE(readme) << CORVANE_README;
  std::stringstream text;
  text << readme.rdbuf();
  const std::string all = text.str();
  for (const corvane::remote::method_info& m : corvane::remote::kMethods) {
    const std::string row = "| " + std::to_string(m.number) + " | `" + m.name + "` | " +
                            (m.built ? "built |" : "not yet built (answers 20) |") + " " +
                            corvane::tools::describe_modes(corvane::tools::kMethodModes[m.number]) + " |";
    EXPECT_NE(std::string::npos, all.find(row)) << "README lacks: " << row;
  }
}

}  // namespace
