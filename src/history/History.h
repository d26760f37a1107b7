// What was reported before the newest report: curves, happenings, and when each metric came.
#pragma once

#include <array>
#include <cstdint>
#include <deque>
#include <memory>
#include <optional>
#include <vector>

#include "history/Cell.h"
#include "history/Happening.h"
#include "history/Journal.h"
#include "history/Quantity.h"
#include "history/Series.h"
#include "metrics/MetricObserver.h"

namespace qel {

// A neighbour: a cell that the phone measures and is not on.
struct Neighbour {
  Technology technology = Technology::lte;
  std::uint32_t channel = 0;
  std::uint32_t code = 0;
  std::optional<float> levelDbm;
  std::optional<float> qualityDb;
  std::uint64_t timeMs = 0;  // of the report
};

// Main thread only. Told of every stored metric, by the same call from a live service, from a
// recording and from a test. Everything is asked for as of a moment, so that one history of a whole
// recording answers for each of its moments.
class History final : public MetricObserver {
 public:
  struct Limits {
    Series::Limits series;
    Journal::Limits journal;
    std::size_t mostHappenings = 10000;  // beyond them the oldest go
    std::size_t mostNeighbours = 64;     // cells with a curve; the one silent for longest goes
  };

  History();
  explicit History(const Limits& limits);
  ~History() override;

  void metricWasStored(const StoredMetric& metric) override;
  // What no report tells: service and modem lost and found, gaps in delivery, marks.
  void add(Happening happening);

  // Grows with everything that is told: who saw this number has seen all.
  std::uint64_t version() const;

  // Oldest first; a page counts from the end.
  const std::deque<Happening>& happenings() const;
  // How many of them are not after this time.
  std::size_t happeningsUntil(std::uint64_t atMs) const;

  const Series& series(Quantity quantity) const;
  std::optional<Cell> servingCell(std::uint64_t atMs) const;
  std::optional<Technology> technology(std::uint64_t atMs) const;

  // The cells of the newest lists of the technology in use, strongest first.
  std::vector<Neighbour> neighbours(std::uint64_t atMs) const;
  // The levels of one cell; null: never measured.
  const Series* levels(Technology technology, std::uint32_t channel, std::uint32_t code) const;

  // The newest report of a metric (as events carry it) that is not after this time.
  std::optional<JournalEntry> lastReport(std::int64_t metric, std::uint64_t atMs) const;
  // How long it is from report to report, as seen lately; nothing before two have come.
  std::optional<std::uint64_t> periodMs(std::int64_t metric) const;
  // When anything at all came last.
  std::optional<std::uint64_t> lastReceivedMs(std::uint64_t atMs) const;

  // Payloads as they came, for the curve of any field.
  const Journal& journal() const;

 private:
  struct State;
  const std::unique_ptr<State> _state;
};

}  // namespace qel
