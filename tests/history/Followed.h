// A dispatcher that a history follows, with a clock that the test sets.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "history/History.h"
#include "messages/lte_rrc.h"
#include "messages/lte_serving.h"
#include "metrics/Feed.h"

namespace qel::testing {

struct SetClock final : Clock {
  std::uint64_t nowMs() const override { return timeMs; }
  std::uint64_t timeMs = 0;
};

class Followed {
 public:
  explicit Followed(const History::Limits& limits = {}) : history(limits) {
    validator->setObserver(&history, clock);
  }

  void feed(std::uint64_t timeMs, std::int64_t metric, const PBCodable& message) {
    clock.timeMs = timeMs;
    validator.feed(metric, message);
  }
  void feed(std::uint64_t timeMs, std::int64_t metric, Bytes payload) {
    clock.timeMs = timeMs;
    validator->metricsDidUpdate(metricEvent(metric, std::move(payload)));
  }
  void lteState(std::uint64_t timeMs, std::int32_t state, std::int32_t cause = 255) {
    KCellularLteRrcState message;
    message.setState(state);
    message.setCause(cause);
    feed(timeMs, MetricValidator::K_LTE_RRC_STATE, message);
  }
  void lteCell(std::uint64_t timeMs, std::uint32_t pci, std::uint32_t earfcn = 1300) {
    KCellularLteScellInfo cell;
    cell.setPhyCellId(pci);
    cell.setDlFreq(earfcn);
    feed(timeMs, MetricValidator::K_LTE_SCELL_INFO, cell);
  }

  std::vector<Happening> happenings(HappeningKind kind) const {
    std::vector<Happening> found;
    for (const Happening& one : history.happenings()) {
      if (one.kind == kind) found.push_back(one);
    }
    return found;
  }
  std::vector<std::string> texts(HappeningKind kind) const {
    std::vector<std::string> found;
    for (const Happening& one : happenings(kind)) found.push_back(one.text);
    return found;
  }

  SetClock clock;
  FedValidator validator;
  History history;
};

}  // namespace qel::testing
