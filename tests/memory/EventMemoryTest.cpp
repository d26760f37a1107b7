// What an event costs in memory on its way through a client: from the thread that it arrives on to
// the client's queue, to the main queue and into the store.
#include <gtest/gtest.h>

#include <chrono>

#include "base/DispatchQueue.h"
#include "messages/lte_serving.h"
#include "metrics/MetricValidator.h"
#include "support/CountedMemory.h"
#include "support/FakeTransport.h"
#include "support/Sanitized.h"
#include "tesk/Constants.h"

namespace qel {
namespace {

class CountingObserver final : public MetricObserver {
 public:
  void metricWasStored(const StoredMetric&) override { ++stored; }
  std::size_t stored = 0;
};

Bytes signalReport() {
  KCellularLteRsrpRsrqSinr report;
  report.setTimestamp(1500000000000);
  for (int i = 0; i < 5; ++i) {
    auto sample = std::make_shared<RsrpRsrqSinr>();
    sample->setRsrp0(-90 - i);
    report.addInstValues(std::move(sample));
  }
  return report.data();
}

Dictionary eventOf(const Bytes& payload) {
  return {{tesk::kKeyMetricID, MetricValidator::K_LTE_RSRP_RSRQ_SINR},
          {tesk::kKeyProfileID, 0},
          {tesk::kKeyPayload, payload}};
}

// Every hop took blocks that another thread gave back, and a closure for each: some twenty times.
TEST(EventMemory, isUsedAgainOnTheWayToTheStore) {
  constexpr std::size_t kEvents = 4000;
  constexpr std::size_t kUnderWay = 10;
  setStandardOutput(nullptr);
  setSystemLog(nullptr);
  const auto service = testing::installFakeService();
  CountingObserver observer;
  MetricValidator::shared()->setObserver(&observer);
  const Bytes payload = signalReport();
  SerialQueue bus("bus");
  const auto send = [&](std::size_t count) {
    const std::size_t end = observer.stored + count;
    while (observer.stored < end) {
      bus.async([&] {
        for (std::size_t i = 0; i < kUnderWay; ++i) {
          service->send(tesk::kEventMetric, eventOf(payload));
        }
      });
      const std::size_t wanted = observer.stored + kUnderWay;
      ASSERT_TRUE(MainQueue::shared().runUntil([&] { return observer.stored >= wanted; },
                                               std::chrono::seconds(10)));
    }
  };
  send(kEvents);
  const testing::CountedMemory counted;
  send(kEvents);
  MetricValidator::shared()->setObserver(nullptr);
  if (testing::kIsSanitized) GTEST_SKIP() << "every block is the heap's";
  EXPECT_LT(counted.times(), kEvents / 20);
}

}  // namespace
}  // namespace qel
