#include "history/RadioFollower.h"

#include <algorithm>
#include <span>
#include <string>
#include <utility>

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

constexpr std::string_view kRadioLinkFailure = "KWCDMA_RRC_CONN_STATE_RADIO_LINK_FAILURE";

std::string_view nameIn(const Value* value) {
  return value ? value->asText().value_or(std::string_view()) : std::string_view();
}

}  // namespace

// What a state says about the phone, where it says any of it.
struct RadioFollower::StateFacts {
  enum class Use : std::uint8_t { untold, inUse, left };
  enum class Channel : std::uint8_t { untold, none, dedicated };

  std::string_view name;
  Use use = Use::untold;  // of the technology: by a connection, or the wish for one
  Channel channel = Channel::untold;
  bool isOver = false;  // there is a cause of release, of those that tell two causes

  static const StateFacts& of(std::span<const StateFacts> states, std::string_view name) {
    static constexpr StateFacts kUntold = {""};
    const auto found = std::ranges::find(states, name, &StateFacts::name);
    return found == states.end() ? kUntold : *found;
  }
};

struct RadioFollower::StateChange {
  Technology technology;
  const Value* state;
  const Value* cause;
  const StateFacts& facts;
  std::optional<std::string_view> failure;  // of the radio link, and why
};

void RadioFollower::use(Technology technology, const Report& report, HappeningLog& log) {
  if (_inUse == technology) return;
  _inUse = technology;
  if (_lastTechnology && *_lastTechnology != technology) {
    log.tell<ToldTechnology>(report, HappeningKind::technology, technology,
                             ToldTechnology{*_lastTechnology, technology});
  }
  _lastTechnology = technology;
  _technology.set(report.atMs, technology);
  const auto* cell = _servingCell.newest();
  if (cell && *cell && (*cell)->technology != technology) _servingCell.set(report.atMs, {});
}

void RadioFollower::leave(Technology technology, const Report& report) {
  if (_inUse != technology) return;
  _inUse.reset();
  _technology.set(report.atMs, std::nullopt);
  _servingCell.set(report.atMs, std::nullopt);
}

void RadioFollower::followCell(const Report& report, HappeningLog& log) {
  auto cell = _cells.read(report.metric, report.record);
  if (!cell) return;
  use(cell->technology, report, log);
  if (_linkFailedMs && report.atMs - *_linkFailedMs > kAfterFailureMs) _linkFailedMs.reset();
  const Rrc before = rrcOf(cell->technology);
  if (cell->technology == Technology::gsm) followGsmChannel(report.record);
  if (!_lastCell || !_lastCell->isSameCellAs(*cell)) {
    const CellMove move = moveTo(*cell, before);
    log.tell<ToldCell>(report, HappeningKind::cell, cell->technology, _lastCell, *cell, move);
  } else {
    cell->fillFrom(*_lastCell);
  }
  _lastCell = cell;
  const auto* known = _servingCell.newest();
  if (!known || *known != cell) _servingCell.set(report.atMs, cell);
}

// GSM tells of the phone's channel in its reports of the cell.
void RadioFollower::followGsmChannel(const Dictionary& record) {
  const std::string_view state = nameIn(record.find("state"));
  Rrc& rrc = rrcOf(Technology::gsm);
  rrc.isDedicated = state == "DEDICATED_STATE";
  rrc.isKnown = rrc.isDedicated || state == "NON_DEDICATED_STATE";
}

// Within one technology the connection tells them apart, unless it has just failed.
CellMove RadioFollower::moveTo(const ReportedCell& cell, const Rrc& before) const {
  const Rrc& now = _rrc[static_cast<std::size_t>(cell.technology)];
  if (!_lastCell || _lastCell->technology != cell.technology || _linkFailedMs) {
    return CellMove::unknown;
  }
  const bool isAsBefore = before.isKnown && now.isKnown && before.isDedicated == now.isDedicated;
  if (!isAsBefore) return CellMove::unknown;
  return now.isDedicated ? CellMove::handover : CellMove::reselection;
}

void RadioFollower::followState(const StateChange& change, const Report& report,
                                HappeningLog& log) {
  using Use = StateFacts::Use;
  using Channel = StateFacts::Channel;
  if (!change.state) return;
  const StateFacts& facts = change.facts;
  // Of a phone of which nothing is known, being idle there is something.
  const bool isFirst = !_lastTechnology && facts.channel == Channel::none;
  if (facts.use == Use::inUse || isFirst) use(change.technology, report, log);
  Rrc& known = rrcOf(change.technology);
  Value cause = change.cause ? *change.cause : Value();
  if (change.failure || *change.state != known.state) {
    log.tell<ToldConnection>(report, HappeningKind::rrc, change.technology, *change.state, cause);
    known.state = *change.state;
    if (change.failure) addLinkFailure(change.technology, *change.failure, report, log);
  }
  known.cause = std::move(cause);
  known.isKnown = facts.channel != Channel::untold;
  known.isDedicated = facts.channel == Channel::dedicated;
  if (facts.use == Use::left) leave(change.technology, report);
}

void RadioFollower::followLteState(const Report& report, HappeningLog& log) {
  using Use = StateFacts::Use;
  using Channel = StateFacts::Channel;
  static constexpr std::array kStates = {
      StateFacts{"KLTE_RRC_STATE_CONNECTED", Use::inUse, Channel::dedicated},
      StateFacts{"KLTE_RRC_STATE_IDLE", Use::untold, Channel::none},
      StateFacts{"KLTE_RRC_STATE_ATMPT_CONNECTION", Use::inUse},
      StateFacts{"KLTE_RRC_STATE_NULL", Use::left},
  };
  const Value* state = _lteState.in(report.record);
  const Value* cause = _lteCause.in(report.record);
  const auto found = std::ranges::find(kLinkFailures, nameIn(cause), &NamedWords::name);
  std::optional<std::string_view> failure;
  if (state && found != kLinkFailures.end()) {
    // The cause of a failure stays in the reports until the connection ends.
    const Rrc& known = rrcOf(Technology::lte);
    const bool hasEnded = known.isDedicated && *state != known.state;
    if (*cause != known.cause || hasEnded) failure = found->words;
  }
  followState({Technology::lte, state, cause, StateFacts::of(kStates, nameIn(state)), failure},
              report, log);
}

void RadioFollower::followUmtsState(const Report& report, HappeningLog& log) {
  using Use = StateFacts::Use;
  using Channel = StateFacts::Channel;
  // On shared channels and between pages the phone itself chooses its cells.
  static constexpr std::array kStates = {
      StateFacts{"KWCDMA_RRC_CONN_STATE_CELL_DCH", Use::inUse, Channel::dedicated},
      StateFacts{"KWCDMA_RRC_CONN_STATE_CELL_FACH", Use::inUse, Channel::none},
      StateFacts{"KWCDMA_RRC_CONN_STATE_CELL_PCH", Use::inUse, Channel::none},
      StateFacts{"KWCDMA_RRC_CONN_STATE_URA_PCH", Use::inUse, Channel::none},
      StateFacts{"KWCDMA_RRC_CONN_STATE_ESTABLISH", Use::inUse, Channel::none},
      StateFacts{"KWCDMA_RRC_CONN_STATE_IDLE", Use::untold, Channel::none, true},
      StateFacts{"KWCDMA_RRC_CONN_STATE_RELEASE", Use::untold, Channel::untold, true},
      StateFacts{"KWCDMA_RRC_CONN_STATE_SCRI_SENT", Use::untold, Channel::untold, true},
      StateFacts{kRadioLinkFailure, Use::untold, Channel::untold, true},
      StateFacts{"KWCDMA_RRC_CONN_STATE_INACTIVE", Use::left},
  };
  const Value* state = report.record.find("state");
  const StateFacts& facts = StateFacts::of(kStates, nameIn(state));
  const Value* cause = report.record.find(facts.isOver ? "release_cause" : "establishment_cause");
  const bool hasFailed = facts.name == kRadioLinkFailure && *state != rrcOf(Technology::umts).state;
  followState({Technology::umts, state, facts.use == Use::left ? nullptr : cause, facts,
               hasFailed ? std::optional<std::string_view>("") : std::nullopt},
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
  log.tellText(report, HappeningKind::radioLinkFailure, technology, std::move(text));
}

}  // namespace qel
