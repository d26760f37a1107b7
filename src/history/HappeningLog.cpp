#include "history/HappeningLog.h"

#include <algorithm>
#include <utility>

namespace qel {

void HappeningLog::add(Happening happening, std::uint64_t atMs) {
  _happenings.push_back(std::move(happening));
  _atMs.push_back(atMs);
  if (_happenings.size() <= _most) return;
  _happenings.pop_front();
  _atMs.pop_front();
  ++_gone;
}

void HappeningLog::add(const Report& report, HappeningKind kind,
                       std::optional<Technology> technology, std::string text) {
  Happening happening;
  happening.timeMs = report.timeMs;
  happening.kind = kind;
  happening.technology = technology;
  happening.metric = report.metric;
  happening.text = std::move(text);
  add(std::move(happening), report.atMs);
}

std::size_t HappeningLog::until(std::uint64_t atMs) const {
  return static_cast<std::size_t>(std::ranges::upper_bound(_atMs, atMs) - _atMs.begin());
}

}  // namespace qel
