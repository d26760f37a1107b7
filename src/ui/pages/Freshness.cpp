#include "ui/pages/Freshness.h"

#include <algorithm>
#include <array>

#include "metrics/DispatchTable.h"
#include "ui/pages/Words.h"

namespace qel {
namespace {

constexpr std::uint64_t kShortestPeriodMs = 5000;  // that of the tables
constexpr std::uint64_t kSilentPeriods = 3;

// What it means that the service cannot be had, and what to do next.
struct Words {
  Feed::Reach reach;
  const char* state;
  const char* advice;
};

constexpr std::array kWords = {
    Words{Feed::Reach::unknown, "connecting", ""},
    Words{Feed::Reach::notInstalled, "not installed",
          "Install the package basebandd, or choose a source with --source."},
    Words{Feed::Reach::notRunning, "not running",
          "Start it: sudo systemctl start basebandd. It is then found by itself."},
    Words{Feed::Reach::noPermission, "no permission",
          "Become a member of the group baseband (sudo adduser $USER baseband), then log in "
          "again."},
    Words{Feed::Reach::noBus, "no message bus", "Start the message bus, or choose one with --bus."},
    Words{Feed::Reach::tooManyClients, "too many clients",
          "Close another viewer; this one is waiting for a place."},
    Words{Feed::Reach::noAnswer, "does not answer",
          "Wait, or start it anew: sudo systemctl restart basebandd."},
    Words{Feed::Reach::busy, "busy", ""},
    Words{Feed::Reach::refused, "refuses this viewer",
          "Its journal tells why: journalctl -u basebandd."},
};

std::string clockText(std::uint64_t durationMs) {
  const std::uint64_t seconds = durationMs / 1000;
  const auto padded = [](std::uint64_t number) {
    return (number < 10 ? "0" : "") + std::to_string(number);
  };
  const std::string end = padded(seconds / 60 % 60) + ":" + padded(seconds % 60);
  return seconds < 3600 ? end : std::to_string(seconds / 3600) + ":" + end;
}

// "Recording drive.jsonl, 3:20 of 10:00, ended"
std::string fileText(const char* kind, const Feed& feed) {
  std::string text = feed.name.empty() ? kind : std::string(kind) + " " + feed.name;
  if (feed.positionMs) text += ", " + clockText(*feed.positionMs);
  if (feed.positionMs && feed.lengthMs) text += " of " + clockText(*feed.lengthMs);
  if (feed.hasEnded) text += ", ended";
  return text;
}

std::string sourceText(const Feed& feed) {
  switch (feed.kind) {
    case Feed::Kind::service:
      return feed.name.empty() ? "Baseband manager" : "Baseband manager, modem " + feed.name;
    case Feed::Kind::simulated:
      return "Simulated modem";
    case Feed::Kind::recording:
      return fileText("Recording", feed);
    case Feed::Kind::rawLog:
      return fileText("Raw log", feed);
    case Feed::Kind::modem:
      return feed.name.empty() ? "Modem of this device" : "Modem " + feed.name;
  }
  return {};
}

bool isFile(const Feed& feed) {
  return feed.kind == Feed::Kind::recording || feed.kind == Feed::Kind::rawLog;
}

// How long a silence is usual.
std::uint64_t patienceMs(const History& history) {
  std::optional<std::uint64_t> shortest;
  for (const DispatchRow& row : dispatchTable()) {
    shortest = earlier(shortest, history.periodMs(row.identifier));
    if (shortest && *shortest <= kShortestPeriodMs) break;  // a shorter one would not count
  }
  return kSilentPeriods * std::max(shortest.value_or(0), kShortestPeriodMs);
}

void tellReach(const Feed& feed, const TimeZone& zone, Freshness& told) {
  const auto* found = std::ranges::find(kWords, feed.reach, &Words::reach);
  if (found == kWords.end()) return;
  told.state = std::string("Baseband manager: ") + found->state;
  if (feed.lostSinceMs) told.state += ", lost at " + minuteText(*feed.lostSinceMs, zone);
  told.advice = found->advice;
}

// Connected, and perhaps silent.
void tellFlow(const Feed& feed, const Viewpoint& viewpoint, const TimeZone& zone, Freshness& told) {
  const auto last = viewpoint.history->lastReceivedMs(viewpoint.nowMs);
  if (!last) {
    told.state = "connected, no reports yet";
    return;
  }
  const std::uint64_t patience = patienceMs(*viewpoint.history);
  told.isFlowing = viewpoint.nowMs <= *last + patience;
  told.state =
      told.isFlowing ? "connected" : "connected, but no reports since " + minuteText(*last, zone);
  if (told.isFlowing && !feed.hasEnded) told.changesAtMs = *last + patience + 1;
}

void addLine(std::string& text, const std::string& line) {
  if (line.empty()) return;
  if (!text.empty()) text += "\n";
  text += line;
}

}  // namespace

Freshness freshness(const Feed& feed, const Viewpoint& viewpoint, const TimeZone& zone) {
  Freshness told;
  told.source = sourceText(feed);
  if (!viewpoint.isLive || (isFile(feed) && feed.hasEnded)) {
    told.isFlowing = true;  // nothing is expected to come
  } else if (feed.reach != Feed::Reach::there) {
    tellReach(feed, zone, told);
  } else {
    tellFlow(feed, viewpoint, zone, told);
  }
  if (feed.dropped > 0) {
    told.loss = countText(feed.dropped) + (feed.dropped == 1 ? " report" : " reports") +
                " left out, which came faster than they could be taken";
  }
  if (!told.isFlowing) told.bar = capitalized(told.state);
  addLine(told.footer, told.source);
  addLine(told.footer, isFile(feed) ? capitalized(feed.reason) : feed.condition);
  addLine(told.footer, capitalized(told.state));
  addLine(told.footer, told.advice);
  addLine(told.footer, told.loss);
  told.spoken = told.footer;
  std::ranges::replace(told.spoken, '\n', '.');
  return told;
}

}  // namespace qel
