// What the history of ten busy minutes costs in memory.
#include <gtest/gtest.h>

#include <memory>

#include "history/History.h"
#include "messages/lte_serving.h"
#include "metrics/MetricValidator.h"
#include "support/CountedMemory.h"
#include "support/RecordingSink.h"

namespace qel {
namespace {

constexpr std::uint64_t kStart = 1'500'000'000'000;
constexpr std::uint64_t kEvents = 60'000;  // ten minutes, 100 a second
constexpr std::size_t kMegabyte = 1'000'000;

struct SteppingClock final : Clock {
  std::uint64_t nowMs() const override { return timeMs; }
  std::uint64_t timeMs = kStart;
};

// Three curves have a point for each event.
Bytes signalReport() {
  KCellularLteRsrpRsrqSinr report;
  report.setTimestamp(kStart);
  auto values = std::make_shared<RsrpRsrqSinr>();
  values->setPhyCellId(100);
  for (auto set : {&RsrpRsrqSinr::setRsrp0, &RsrpRsrqSinr::setRsrp1}) ((*values).*set)(-95);
  for (auto set : {&RsrpRsrqSinr::setRsrq0, &RsrpRsrqSinr::setRsrq1}) ((*values).*set)(-11);
  for (auto set : {&RsrpRsrqSinr::setSinr0, &RsrpRsrqSinr::setSinr1}) ((*values).*set)(20);
  report.setAvgValues(values);
  for (int i = 0; i < 2; ++i) report.addInstValues(values);
  return report.data();
}

TEST(HistoryMemory, OfTenMinutesAtAHundredEventsASecondIsUnderEightMegabytes) {
  const testing::CapturedSystemLog systemLog;
  setStandardOutput(nullptr);
  SteppingClock clock;
  const auto validator = MetricValidator::create(nullptr);
  const Dictionary event = {{"kKeyMetricID", MetricValidator::K_LTE_RSRP_RSRQ_SINR},
                            {"kKeyPayload", signalReport()}};
  validator->processMetric(event);
  const testing::CountedMemory memory;
  const auto history = std::make_unique<History>();
  validator->setObserver(history.get(), clock);
  for (std::uint64_t i = 0; i < 2 * kEvents; ++i) {
    clock.timeMs += 10;
    validator->processMetric(event);
  }
  const std::size_t most = memory.most();
  std::size_t points = 0;
  for (const auto& run : history->series(Quantity::lteRsrp).between(0, History::kLatest)) {
    points += run.size();
  }
  EXPECT_GE(points, kEvents);
  EXPECT_LT(most, 8 * kMegabyte);
  RecordProperty("bytes", static_cast<int>(most));
}

}  // namespace
}  // namespace qel
