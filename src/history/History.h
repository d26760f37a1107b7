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

// A neighbour: a cell that the phone measures and is not on. At least one of channel and code is
// known.
struct Neighbour {
  Technology technology = Technology::lte;
  std::optional<std::uint32_t> channel;  // as of a serving cell
  std::optional<std::uint32_t> code;
  std::optional<float> levelDbm;
  std::optional<float> qualityDb;
  std::uint64_t timeMs = 0;  // of the report

  bool isSameCellAs(const Neighbour& other) const {
    return technology == other.technology && channel == other.channel && code == other.code;
  }
};

// Main thread only. Told of every metric, by the same call from a live service, from a recording
// and from a test. Everything is asked for as of a moment, so that one history of a whole recording
// answers for each of its moments. A time of reception that goes back counts as the one before it;
// a happening keeps its own.
class History final : public MetricObserver {
 public:
  struct Limits {
    Series::Limits series;
    Journal::Limits journal;
    std::size_t mostHappenings = 10000;  // beyond them the oldest go
    // Of a metric, that curves of neighbours are made of: the newest of the time asked for.
    std::size_t mostNeighbourReports = 20'000;
  };

  History();
  explicit History(const Limits& limits);
  ~History() override;

  void metricWasStored(const StoredMetric& metric) override;
  void metricWasPassedOver(const PassedMetric& metric) override;
  // What no report tells: service and modem lost and found, gaps in delivery, marks.
  void add(Happening happening);

  // Grows with everything that is told: who saw this number has seen all.
  std::uint64_t version() const;

  // Oldest first; a page counts from the end.
  const std::deque<Happening>& happenings() const;
  // How many older ones went: the number of the first one here, counted from 0 of all ever.
  std::uint64_t happeningsGone() const;
  // How many of them are not after this time.
  std::size_t happeningsUntil(std::uint64_t atMs) const;

  const Series& series(Quantity quantity) const;
  // As in the newest report of the technology in use; nothing when that has reported none.
  std::optional<Cell> servingCell(std::uint64_t atMs) const;
  // As the last serving-cell or RRC report told; nothing before one and after one that says that
  // its technology is not in use.
  std::optional<Technology> technology(std::uint64_t atMs) const;

  // Those of the technology in use, then the others, each strongest first: what the reports of the
  // ten seconds before the newest one named.
  std::vector<Neighbour> neighbours(std::uint64_t atMs) const;
  // The levels of one of them within both times.
  std::vector<Run> levels(const Neighbour& cell, std::uint64_t fromMs, std::uint64_t toMs) const;

  // The newest report of a metric (as events carry it) that is not after this time.
  std::optional<JournalEntry> lastReport(std::int64_t metric, std::uint64_t atMs) const;
  // How long it is from report to report, as seen last before this time; nothing before two have
  // come.
  std::optional<std::uint64_t> periodMs(std::int64_t metric, std::uint64_t atMs = kLatest) const;
  // When anything at all came last.
  std::optional<std::uint64_t> lastReceivedMs(std::uint64_t atMs) const;

  // Payloads as they came, for the curve of any field.
  const Journal& journal() const;

  static constexpr std::uint64_t kLatest = ~std::uint64_t{0};

 private:
  struct State;
  const std::unique_ptr<State> _state;
};

}  // namespace qel
