// Reports as the dispatcher of a window's process gets them.
#pragma once

#include <QtTest/QTest>
#include <cstdint>
#include <memory>
#include <string>

#include "messages/lte_serving.h"
#include "metrics/MetricValidator.h"
#include "ui/Window.h"

namespace qel::testing {

template <typename Message>
void report(std::int64_t identifier, const Message& message) {
  MetricValidator::shared()->processMetric(
      {{"kKeyMetricID", identifier}, {"kKeyPayload", message.data()}});
}

inline void reportCell(std::uint32_t pci) {
  KCellularLteScellInfo info;
  info.setPhyCellId(pci);
  info.setDlFreq(1300);
  info.setFreqBandInd(3);
  info.setNumMncDigits(2);
  info.setSelPlmnMcc(1);
  info.setSelPlmnMnc(1);
  report(MetricValidator::K_LTE_SCELL_INFO, info);
}

inline void reportLevel(std::int32_t rsrpDbm) {
  auto average = std::make_shared<RsrpRsrqSinr>();
  average->setRsrp0(rsrpDbm);
  average->setRsrq0(-9);
  average->setSinr0(20);
  KCellularLteRsrpRsrqSinr signal;
  signal.setAvgValues(average);
  report(MetricValidator::K_LTE_RSRP_RSRQ_SINR, signal);
}

// What was reported is seen a moment later.
inline bool comesToShow(const Window& window, const std::string& text) {
  window.navigation().pages()->look();
  return QTest::qWaitFor([&] {
    window.settle();
    return window.shows(text);
  });
}

}  // namespace qel::testing
