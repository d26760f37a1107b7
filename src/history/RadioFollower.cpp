#include "history/RadioFollower.h"

#include <algorithm>
#include <string_view>
#include <utility>

#include "base/Rendering.h"
#include "history/ReportedCell.h"
#include "history/Words.h"

namespace qel {
namespace {

// Reports within this time speak of one failure.
constexpr std::uint64_t kOneFailureMs = 2000;
// A cell that is come to so soon after a failure was not chosen as usual.
constexpr std::uint64_t kAfterFailureMs = 5000;

// 36.331, clause 5.3.11.3.
constexpr std::array kLinkFailures = {
    NamedWords{"KLTE_RRC_CAUSE_REL_T310_EXP", "out of sync, T310 ended"},
    NamedWords{"KLTE_RRC_CAUSE_REL_RND_ACC", "random access problem"},
    NamedWords{"KLTE_RRC_CAUSE_REL_MAX_RLC_RETRANS", "most RLC retransmissions made"},
    NamedWords{"KLTE_RRC_CAUSE_REEST_OTHER_FAIL_T310_EXP", "out of sync, T310 ended"},
    NamedWords{"KLTE_RRC_CAUSE_REEST_OTHER_FAIL_RND_ACC", "random access problem"},
    NamedWords{"KLTE_RRC_CAUSE_REEST_OTHER_FAIL_MAX_RLC_RETX", "most RLC retransmissions made"},
};

bool isAnyOf(std::string_view name, std::initializer_list<std::string_view> names) {
  return std::ranges::find(names, name) != names.end();
}

std::string textAt(const Dictionary& record, std::string_view key) {
  const Value* value = record.find(key);
  return value ? cellText(*value) : std::string();
}

std::string movedText(const Cell& from, const Cell& to, CellMove move) {
  const std::string_view start = move == CellMove::handover      ? "Handover from "
                                 : move == CellMove::reselection ? "Reselected from "
                                                                 : "From ";
  return std::string(start) + textOf(from) + " to " + textOf(to);
}

bool isTheSameReport(const std::optional<Cell>& a, const Cell& b) {
  return a && a->isSameAs(b) && a->area == b.area && a->mcc == b.mcc && a->mnc == b.mnc;
}

}  // namespace

// What an RRC report says, whatever the technology.
struct RadioFollower::StateChange {
  Technology technology;
  const Value* state;
  const Value* cause;
  Connection connection;
  bool isInUse;                             // the phone has, or asks for, a connection there
  bool isLeft;                              // the technology is not in use
  std::optional<std::string_view> failure;  // of the radio link, why
};

std::optional<Technology> RadioFollower::inUse() const {
  const auto* technology = _technology.newest();
  return technology ? *technology : std::nullopt;
}

void RadioFollower::use(Technology technology, const Report& report, HappeningLog& log) {
  if (inUse() == technology) return;
  if (_lastTechnology && *_lastTechnology != technology) {
    log.add(report, HappeningKind::technology, technology,
            "Changed from " + std::string(nameOf(*_lastTechnology)) + " to " +
                std::string(nameOf(technology)));
  }
  _lastTechnology = technology;
  _technology.set(report.atMs, technology);
  const auto* cell = _servingCell.newest();
  if (cell && *cell && (*cell)->technology != technology) _servingCell.set(report.atMs, {});
}

void RadioFollower::leave(Technology technology, const Report& report) {
  if (inUse() != technology) return;
  _technology.set(report.atMs, std::nullopt);
  _servingCell.set(report.atMs, std::nullopt);
}

void RadioFollower::followCell(const Report& report, HappeningLog& log) {
  const auto cell = reportedCell(report.metric, report.record);
  if (!cell) return;
  use(cell->technology, report, log);
  if (_linkFailedMs && report.atMs - *_linkFailedMs > kAfterFailureMs) _linkFailedMs.reset();
  const Connection before = rrcOf(cell->technology).connection;
  if (cell->technology == Technology::gsm) {
    const std::string state = textAt(report.record, "state");
    rrcOf(Technology::gsm).connection = state == "DEDICATED_STATE"       ? Connection::dedicated
                                        : state == "NON_DEDICATED_STATE" ? Connection::none
                                                                         : Connection::unknown;
  }
  if (!_lastCell || !_lastCell->isSameAs(*cell)) {
    Happening happening;
    happening.timeMs = report.timeMs;
    happening.kind = HappeningKind::cell;
    happening.technology = cell->technology;
    happening.metric = report.metric;
    happening.move = moveTo(*cell, before);
    happening.text =
        _lastCell ? movedText(*_lastCell, *cell, happening.move) : "On " + textOf(*cell);
    happening.from = std::exchange(_lastCell, cell);
    happening.to = cell;
    log.add(std::move(happening), report.atMs);
  }
  const auto* known = _servingCell.newest();
  if (!known || !isTheSameReport(*known, *cell)) _servingCell.set(report.atMs, cell);
}

// Within one technology the connection tells them apart, unless it has just failed.
CellMove RadioFollower::moveTo(const Cell& cell, Connection before) const {
  const auto& rrc = _rrc[static_cast<std::size_t>(cell.technology)];
  if (!_lastCell || _lastCell->technology != cell.technology || _linkFailedMs) {
    return CellMove::unknown;
  }
  if (before != rrc.connection) return CellMove::unknown;
  if (before == Connection::dedicated) return CellMove::handover;
  return before == Connection::none ? CellMove::reselection : CellMove::unknown;
}

void RadioFollower::followState(const StateChange& change, const Report& report,
                                HappeningLog& log) {
  if (!change.state) return;
  if (change.isInUse || !_lastTechnology) {
    if (!change.isLeft) use(change.technology, report, log);
  }
  Rrc& known = rrcOf(change.technology);
  std::string state = cellText(*change.state);
  std::string cause = change.cause ? cellText(*change.cause) : std::string();
  const bool isNew = state != known.state || change.failure;
  if (isNew) {
    const std::string why = wordsOf(change.cause, "cause");
    std::string text(nameOf(change.technology));
    text += " RRC: " + wordsOf(change.state, "state");
    if (!why.empty()) text += ", " + why;
    log.add(report, HappeningKind::rrc, change.technology, std::move(text));
    if (change.failure) addLinkFailure(change.technology, *change.failure, report, log);
  }
  known = {std::move(state), std::move(cause), change.connection};
  if (change.isLeft) leave(change.technology, report);
}

void RadioFollower::followLteState(const Report& report, HappeningLog& log) {
  const Value* state = report.record.find("state");
  const Value* cause = report.record.find("cause");
  const auto name = state ? state->asText().value_or("") : "";
  const auto why = cause ? cause->asText().value_or("") : "";
  const auto connection = name == "KLTE_RRC_STATE_CONNECTED" ? Connection::dedicated
                          : name == "KLTE_RRC_STATE_IDLE"    ? Connection::none
                                                             : Connection::unknown;
  const bool isInUse =
      isAnyOf(name, {"KLTE_RRC_STATE_CONNECTED", "KLTE_RRC_STATE_ATMPT_CONNECTION"});
  const auto found = std::ranges::find(kLinkFailures, why, &NamedWords::name);
  // The cause of a failure stays in the reports until the connection ends.
  const Rrc& known = rrcOf(Technology::lte);
  const bool hasFailed = found != kLinkFailures.end() &&
                         (why != known.cause || known.connection == Connection::dedicated);
  const auto failure = hasFailed ? std::optional(found->words) : std::nullopt;
  followState(
      {Technology::lte, state, cause, connection, isInUse, name == "KLTE_RRC_STATE_NULL", failure},
      report, log);
}

void RadioFollower::followUmtsState(const Report& report, HappeningLog& log) {
  const Value* state = report.record.find("state");
  const auto name = state ? state->asText().value_or("") : "";
  const bool isFailure = name == "KWCDMA_RRC_CONN_STATE_RADIO_LINK_FAILURE";
  const bool isOver =
      isFailure || isAnyOf(name, {"KWCDMA_RRC_CONN_STATE_RELEASE", "KWCDMA_RRC_CONN_STATE_IDLE",
                                  "KWCDMA_RRC_CONN_STATE_SCRI_SENT"});
  const bool isInUse =
      isAnyOf(name, {"KWCDMA_RRC_CONN_STATE_ESTABLISH", "KWCDMA_RRC_CONN_STATE_URA_PCH",
                     "KWCDMA_RRC_CONN_STATE_CELL_PCH", "KWCDMA_RRC_CONN_STATE_CELL_FACH",
                     "KWCDMA_RRC_CONN_STATE_CELL_DCH"});
  // On shared channels and between pages the phone itself chooses its cells.
  const auto connection = name == "KWCDMA_RRC_CONN_STATE_CELL_DCH"          ? Connection::dedicated
                          : name == "KWCDMA_RRC_CONN_STATE_IDLE" || isInUse ? Connection::none
                                                                            : Connection::unknown;
  const Value* cause = report.record.find(isOver ? "release_cause" : "establishment_cause");
  const bool isLeft = name == "KWCDMA_RRC_CONN_STATE_INACTIVE";
  const bool hasFailed = isFailure && name != rrcOf(Technology::umts).state;
  const auto failure = hasFailed ? std::optional<std::string_view>("") : std::nullopt;
  followState(
      {Technology::umts, state, isLeft ? nullptr : cause, connection, isInUse, isLeft, failure},
      report, log);
}

void RadioFollower::followLinkFailure(const Report& report, HappeningLog& log) {
  addLinkFailure(Technology::lte, "", report, log);
}

void RadioFollower::addLinkFailure(Technology technology, std::string_view why,
                                   const Report& report, HappeningLog& log) {
  const bool isKnown = _linkFailedMs && report.atMs - *_linkFailedMs <= kOneFailureMs;
  _linkFailedMs = report.atMs;
  if (isKnown) return;
  std::string text = "Radio link failure on ";
  text += nameOf(technology);
  if (!why.empty()) (text += ": ") += why;
  log.add(report, HappeningKind::radioLinkFailure, technology, std::move(text));
}

}  // namespace qel
