#include "ui/pages/Words.h"

#include <algorithm>
#include <array>
#include <cmath>

namespace qel {
namespace {

constexpr std::uint64_t kSecond = 1000;
constexpr std::uint64_t kMinute = 60 * kSecond;
constexpr std::uint64_t kHour = 60 * kMinute;
constexpr std::uint64_t kDay = 24 * kHour;

// How long a duration must be for that step, in which it is told.
struct Step {
  std::uint64_t fromMs;
  std::uint64_t stepMs;
  std::uint64_t unitMs;
  const char* unit;
};

constexpr std::array kSteps = {
    Step{2 * kDay, kDay, kDay, " days"},
    Step{kHour, kHour, kHour, " h"},
    Step{kMinute, kMinute, kMinute, " min"},
    Step{0, 5 * kSecond, kSecond, " s"},
};

const Step& stepFor(std::uint64_t durationMs) {
  return *std::ranges::find_if(kSteps, [&](const Step& step) { return durationMs >= step.fromMs; });
}

std::string twoDigits(int number) { return (number < 10 ? "0" : "") + std::to_string(number); }

}  // namespace

std::string_view codeLabel(Technology technology) {
  switch (technology) {
    case Technology::lte:
      return "PCI";
    case Technology::umts:
      return "PSC";
    case Technology::gsm:
      return "BSIC";
  }
  return "";
}

std::string_view channelLabel(Technology technology) {
  switch (technology) {
    case Technology::lte:
      return "EARFCN";
    case Technology::umts:
      return "UARFCN";
    case Technology::gsm:
      return "ARFCN";
  }
  return "";
}

std::string_view areaLabel(Technology technology) {
  return technology == Technology::lte ? "TAC" : "LAC";
}

std::string figureText(float value) {
  const auto tenths = std::lround(std::clamp(value, -1e6F, 1e6F) * 10);
  const auto magnitude = std::labs(tenths);
  std::string text = (tenths < 0 ? "-" : "") + std::to_string(magnitude / 10);
  if (magnitude % 10 != 0) text += "." + std::to_string(magnitude % 10);
  return text;
}

std::string signedText(float value) {
  const std::string text = figureText(value);
  return text.front() == '-' ? text : "+" + text;
}

std::string countText(std::uint64_t count) {
  std::string text = std::to_string(count);
  for (std::size_t place = text.size(); place > 3; place -= 3) text.insert(place - 3, ",");
  return text;
}

std::string durationText(std::uint64_t durationMs) {
  const Step& step = stepFor(durationMs);
  return std::to_string(durationMs / step.stepMs * step.stepMs / step.unitMs) + step.unit;
}

std::uint64_t nextDurationMs(std::uint64_t durationMs) {
  const Step& step = stepFor(durationMs);
  return (durationMs / step.stepMs + 1) * step.stepMs;
}

CivilTime civilTime(std::uint64_t timeMs, const TimeZone& zone) {
  return zone.at(static_cast<std::int64_t>(timeMs / kSecond));
}

std::string minuteText(std::uint64_t timeMs, const TimeZone& zone) {
  const CivilTime time = civilTime(timeMs, zone);
  return twoDigits(time.hour) + ":" + twoDigits(time.minute);
}

std::string secondText(std::uint64_t timeMs, const TimeZone& zone) {
  const CivilTime time = civilTime(timeMs, zone);
  return twoDigits(time.hour) + ":" + twoDigits(time.minute) + ":" + twoDigits(time.second);
}

std::optional<std::uint64_t> earlier(std::optional<std::uint64_t> a,
                                     std::optional<std::uint64_t> b) {
  if (!a || !b) return a ? a : b;
  return std::min(*a, *b);
}

std::string capitalized(std::string_view text) {
  std::string result(text);
  if (!result.empty() && result[0] >= 'a' && result[0] <= 'z') {
    result[0] = static_cast<char>(result[0] - 'a' + 'A');
  }
  return result;
}

}  // namespace qel
