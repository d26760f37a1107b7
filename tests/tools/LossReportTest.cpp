#include "tools/LossReport.h"

#include <gtest/gtest.h>

#include <vector>

namespace qel::tools {
namespace {

using namespace std::chrono_literals;

class LossReportTest : public ::testing::Test {
 protected:
  std::vector<std::string> said;
  LossReport report{[this](const std::string& text) { said.push_back(text); }};
  LossReport::Clock::time_point start = LossReport::Clock::now();
};

TEST_F(LossReportTest, saysTheFirstLossAtOnceAndThenEveryTenSecondsAtMost) {
  report.note(3, start);
  report.note(40, start + 9s);
  report.note(500, start + 10s);
  report.note(600, start + 19s);
  EXPECT_EQ(said, (std::vector<std::string>{
                      "3 events left out, which came faster than they were taken",
                      "500 events left out, which came faster than they were taken"}));
}

TEST_F(LossReportTest, saysAtTheEndWhatIsUnsaid) {
  report.note(3, start);
  report.note(40, start + 1s);
  report.end(40);
  report.end(40);
  EXPECT_EQ(said.size(), 2U);
  EXPECT_EQ(said.back(), "40 events left out, which came faster than they were taken");
}

TEST_F(LossReportTest, saysNothingOfNoLoss) {
  report.end(0);
  EXPECT_TRUE(said.empty());
}

}  // namespace
}  // namespace qel::tools
