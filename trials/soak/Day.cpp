#include "soak/Day.h"

#include <fstream>
#include <stdexcept>
#include <vector>

#include "recording/LineSource.h"

namespace qel::trials {
namespace {

constexpr std::uint64_t kPauseMs = 1000;         // between two rounds of the sample
constexpr std::uint64_t kLeadInEveryMs = 30000;  // short enough to be waited for
constexpr std::uint64_t kStartMs = 1700000000000;
constexpr const char* kTimeKey = "{\"time_ms\": ";
constexpr const char* kNobodysTrigger = ", \"event\": \"trigger\", \"kKeyTriggerID\": 1}\n";

struct Line {
  std::uint64_t timeMs;
  std::string rest;
};

std::vector<Line> sampleLines() {
  std::string error;
  const auto source = LineSource::open(QEL_SAMPLE, error);
  if (!source) throw std::runtime_error(error);
  std::vector<Line> lines;
  const std::string key = kTimeKey;
  for (std::string_view text; source->next(text) == LineSource::Outcome::line;) {
    const std::string line(text);
    std::size_t digits = 0;
    const auto time = std::stoull(line.substr(key.size()), &digits);
    lines.push_back({time, line.substr(key.size() + digits) + "\n"});
  }
  if (lines.empty()) throw std::runtime_error("the sample drive is empty");
  return lines;
}

bool isTrigger(const std::string& rest) {
  return rest.find("\"event\": \"trigger\"") != std::string::npos;
}

}  // namespace

Day writeDay(const std::string& file, double hours, double leadInSeconds) {
  const auto sample = sampleLines();
  const std::uint64_t span = sample.back().timeMs - sample.front().timeMs + kPauseMs;
  std::ofstream out(file);
  Day day;
  std::uint64_t timeMs = kStartMs;
  day.leadIn = static_cast<std::uint64_t>(leadInSeconds * 1000 / kLeadInEveryMs) + 1;
  for (std::uint64_t i = 0; i < day.leadIn; ++i, timeMs += kLeadInEveryMs) {
    out << kTimeKey << timeMs << kNobodysTrigger;
  }
  const auto end = timeMs + static_cast<std::uint64_t>(hours * 3600 * 1000);
  for (; timeMs < end; timeMs += span) {
    for (const Line& line : sample) {
      out << kTimeKey << timeMs + (line.timeMs - sample.front().timeMs) << line.rest;
      isTrigger(line.rest) ? ++day.triggers : ++day.metrics;
    }
  }
  day.seconds = static_cast<double>(timeMs - kStartMs) / 1000;
  if (!out.flush()) throw std::runtime_error("no room for the recording of a day");
  return day;
}

}  // namespace qel::trials
