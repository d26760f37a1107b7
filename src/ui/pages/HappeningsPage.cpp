#include "ui/pages/HappeningsPage.h"

#include <algorithm>
#include <array>
#include <map>

#include "messages/catalogue/KBBMetricUtility.h"
#include "ui/pages/Words.h"

namespace qel {
namespace {

constexpr std::array kLabels = {
    std::pair{HappeningKind::cell, std::string_view("Cell")},
    std::pair{HappeningKind::technology, std::string_view("Technology")},
    std::pair{HappeningKind::rrc, std::string_view("Connection")},
    std::pair{HappeningKind::radioLinkFailure, std::string_view("Radio link failure")},
    std::pair{HappeningKind::registration, std::string_view("Registration")},
    std::pair{HappeningKind::reject, std::string_view("Reject")},
    std::pair{HappeningKind::bearer, std::string_view("Bearer")},
    std::pair{HappeningKind::carrier, std::string_view("Carrier")},
    std::pair{HappeningKind::service, std::string_view("Service")},
    std::pair{HappeningKind::modem, std::string_view("Modem")},
    std::pair{HappeningKind::gap, std::string_view("Gap")},
    std::pair{HappeningKind::mark, std::string_view("Mark")},
};

constexpr std::array kDays = {"Sunday",   "Monday", "Tuesday", "Wednesday",
                              "Thursday", "Friday", "Saturday"};
constexpr std::array kMonths = {"January",   "February", "March",    "April",
                                "May",       "June",     "July",     "August",
                                "September", "October",  "November", "December"};
constexpr std::uint64_t kDayMs = 24ULL * 60 * 60 * 1000;

bool isSameDay(const CivilTime& a, const CivilTime& b) {
  return a.year == b.year && a.month == b.month && a.day == b.day;
}

// 0 for Sunday (Zeller's rule).
std::size_t weekday(const CivilTime& time) {
  const std::int64_t month = time.month < 3 ? time.month + 12 : time.month;
  const std::int64_t year = time.month < 3 ? time.year - 1 : time.year;
  const std::int64_t day =
      time.day + 13 * (month + 1) / 5 + year + year / 4 - year / 100 + year / 400 + 6;
  return static_cast<std::size_t>(day % 7);
}

// The header of a day, made once for all its rows.
class DayHeader {
 public:
  DayHeader(const Viewpoint& viewpoint, const TimeZone& zone)
      : _zone(zone),
        _isLive(viewpoint.isLive),
        _today(civilTime(viewpoint.nowMs, zone)),
        _yesterday(civilTime(viewpoint.nowMs - std::min(viewpoint.nowMs, kDayMs), zone)) {}

  const std::string& of(std::uint64_t timeMs) {
    const CivilTime time = civilTime(timeMs, _zone);
    if (_text.empty() || !isSameDay(time, _day)) {
      _day = time;
      _text = make(time);
    }
    return _text;
  }

 private:
  std::string make(const CivilTime& time) const {
    if (_isLive && isSameDay(time, _today)) return "Today";
    if (_isLive && isSameDay(time, _yesterday)) return "Yesterday";
    std::string text = std::string(kDays[weekday(time)]) + ", " + std::to_string(time.day) + " " +
                       kMonths[static_cast<std::size_t>(time.month - 1)];
    if (!_isLive || time.year != _today.year) text += " " + std::to_string(time.year);
    return text;
  }

  const TimeZone& _zone;
  const bool _isLive;
  const CivilTime _today;
  const CivilTime _yesterday;
  CivilTime _day;
  std::string _text;
};

std::string recordName(std::int64_t metric) {
  const std::int64_t identifier = metric - kMetricEventBase;
  const auto catalogue = KBBMetricUtility::catalogue();
  const auto found = std::ranges::find_if(
      catalogue, [&](const MetricName& name) { return name.identifier == identifier; });
  return metric == 0 || found == catalogue.end() ? std::string() : std::string(found->name);
}

HappeningRow rowOf(const Happening& happening, std::uint64_t number, DayHeader& days,
                   const TimeZone& zone) {
  HappeningRow row;
  row.timeMs = happening.timeMs;
  row.id = std::to_string(happening.timeMs) + " " + std::to_string(number);
  row.day = days.of(happening.timeMs);
  row.time = secondText(happening.timeMs, zone);
  row.text = happening.text;
  row.record = recordName(happening.metric);
  row.kind = happening.kind;
  row.kindName = labelOf(happening.kind);
  if (happening.technology) row.technology = nameOf(*happening.technology);
  row.spoken = row.time + ", " + row.kindName + ": " + row.text;
  if (!row.record.empty()) row.spoken += ", told by " + row.record;
  return row;
}

std::vector<KindChoice> choices(const std::map<HappeningKind, std::size_t>& counts,
                                const HappeningsFilter& filter) {
  std::vector<KindChoice> result;
  for (const auto& [kind, label] : kLabels) {
    const auto count = counts.find(kind);
    if (count == counts.end() && !filter.kinds.contains(kind)) continue;
    result.push_back({kind, std::string(label), count == counts.end() ? 0 : count->second,
                      filter.kinds.empty() || filter.kinds.contains(kind)});
  }
  return result;
}

std::string noticeFor(const HappeningsPage& page) {
  if (!page.rows.empty()) return {};
  const bool isAny =
      std::ranges::any_of(page.kinds, [](const auto& kind) { return kind.count > 0; });
  return isAny ? "Nothing of the chosen kinds has happened."
               : "Nothing has happened yet. Changes of cell, connection, registration and bearers "
                 "appear here as they are reported.";
}

}  // namespace

std::string_view labelOf(HappeningKind kind) {
  const auto* found =
      std::ranges::find_if(kLabels, [&](const auto& row) { return row.first == kind; });
  return found == kLabels.end() ? std::string_view() : found->second;
}

HappeningsPage happeningsPage(const Viewpoint& viewpoint, const HappeningsFilter& filter,
                              const TimeZone& zone) {
  HappeningsPage page;
  const auto& all = viewpoint.history->happenings();
  std::map<HappeningKind, std::size_t> counts;
  std::size_t older = 0;
  const std::uint64_t gone = viewpoint.history->happeningsGone();
  DayHeader days(viewpoint, zone);
  for (std::size_t i = viewpoint.history->happeningsUntil(viewpoint.nowMs); i > 0; --i) {
    const Happening& happening = all[i - 1];
    ++counts[happening.kind];
    if (!filter.kinds.empty() && !filter.kinds.contains(happening.kind)) continue;
    if (page.rows.size() >= filter.most) {
      ++older;
      continue;
    }
    page.rows.push_back(rowOf(happening, gone + i - 1, days, zone));
  }
  page.kinds = choices(counts, filter);
  page.notice = noticeFor(page);
  if (older > 0) {
    page.older =
        countText(older) + (older == 1 ? " older one is" : " older ones are") + " not shown";
  }
  return page;
}

}  // namespace qel
