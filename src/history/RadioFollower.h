// Follows cells, technologies and connections from report to report.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string_view>

#include "history/HappeningLog.h"
#include "history/KnownPlace.h"
#include "history/ReportedCell.h"
#include "history/Timeline.h"

namespace qel {

// Says only what reports said: a report that repeats another tells nothing new.
class RadioFollower {
 public:
  explicit RadioFollower(std::size_t mostChanges)
      : _servingCell(mostChanges), _technology(mostChanges) {}

  void followCell(const Report& report, HappeningLog& log);
  void followLteState(const Report& report, HappeningLog& log);
  void followUmtsState(const Report& report, HappeningLog& log);
  // The report that a radio link of LTE has failed; what else it says is not known.
  void followLinkFailure(const Report& report, HappeningLog& log);

  // Empty while the technology in use has reported none.
  const Timeline<std::optional<ReportedCell>>& servingCell() const { return _servingCell; }
  const Timeline<std::optional<Technology>>& technology() const { return _technology; }

 private:
  // The RRC state of one technology as it was reported last.
  struct Rrc {
    Value state;
    Value cause;
    bool isKnown = false;      // whether the phone had its own channel or none
    bool isDedicated = false;  // had one: the network decides about its cell
  };
  struct StateFacts;
  struct StateChange;

  void use(Technology technology, const Report& report, HappeningLog& log);
  void leave(Technology technology, const Report& report);
  void followState(const StateChange& change, const Report& report, HappeningLog& log);
  void addLinkFailure(Technology technology, std::string_view why, const Report& report,
                      HappeningLog& log);
  CellMove moveTo(const ReportedCell& cell, const Rrc& before) const;
  void followGsmChannel(const Dictionary& record);
  Rrc& rrcOf(Technology technology) { return _rrc[static_cast<std::size_t>(technology)]; }

  CellReader _cells;
  KnownPlace _lteState{"state"};
  KnownPlace _lteCause{"cause"};
  Timeline<std::optional<ReportedCell>> _servingCell;
  Timeline<std::optional<Technology>> _technology;
  std::optional<ReportedCell> _lastCell;  // of any technology
  std::optional<Technology> _inUse;
  std::optional<Technology> _lastTechnology;  // that was in use
  std::array<Rrc, 3> _rrc;
  std::optional<std::uint64_t> _linkFailedMs;
};

}  // namespace qel
