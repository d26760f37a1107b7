#include "tools/TimeOption.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <string>
#include <utility>

namespace qel::tools {

std::optional<std::uint64_t> millisecondsIn(std::string_view text) {
  constexpr double kMost = 100.0 * 365 * 24 * 60 * 60 * 1000;
  constexpr std::array<std::pair<std::string_view, double>, 6> kUnits = {
      {{"", 1000}, {"ms", 1}, {"s", 1000}, {"m", 60e3}, {"h", 3600e3}, {"d", 24 * 3600e3}}};
  double number = 0;
  const char* const last = text.data() + text.size();
  const auto [end, error] = std::from_chars(text.data(), last, number, std::chars_format::fixed);
  if (error != std::errc()) return std::nullopt;
  const std::string_view unit(end, static_cast<std::size_t>(last - end));
  const auto row = std::ranges::find(kUnits, unit, &std::pair<std::string_view, double>::first);
  if (row == kUnits.end()) return std::nullopt;
  const double milliseconds = number * row->second;
  if (!(milliseconds >= 0 && milliseconds <= kMost)) return std::nullopt;
  return static_cast<std::uint64_t>(std::llround(milliseconds));
}

CLI::Validator asMilliseconds() {
  const auto turn = [](std::string& text) -> std::string {
    const auto milliseconds = millisecondsIn(text);
    if (!milliseconds) return text + " is no time such as 500ms, 10s or 14d";
    text = std::to_string(*milliseconds);
    return {};
  };
  return {turn, "", ""};
}

}  // namespace qel::tools
