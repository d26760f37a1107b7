// Words and numbers that several pages share.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "base/TimeZone.h"
#include "radio/Technology.h"

namespace qel {

// "PCI", "PSC" or "BSIC"; "EARFCN", "UARFCN" or "ARFCN"; "TAC" or "LAC".
std::string_view codeLabel(Technology technology);
std::string_view channelLabel(Technology technology);
std::string_view areaLabel(Technology technology);

// At most one decimal, none for a whole number: "-86", "-12.5".
std::string figureText(float value);
// The same with its sign, also of what is not negative: "+6".
std::string signedText(float value);
// "1,234,567"
std::string countText(std::uint64_t count);

// "15 s", "3 min", "2 h", "4 days"; below a minute in steps of five seconds.
std::string durationText(std::uint64_t durationMs);
// The next duration that reads differently.
std::uint64_t nextDurationMs(std::uint64_t durationMs);

CivilTime civilTime(std::uint64_t timeMs, const TimeZone& zone);
// "20:21" and "20:21:07".
std::string minuteText(std::uint64_t timeMs, const TimeZone& zone);
std::string secondText(std::uint64_t timeMs, const TimeZone& zone);

// The earlier of two moments, either of which may be none.
std::optional<std::uint64_t> earlier(std::optional<std::uint64_t> a,
                                     std::optional<std::uint64_t> b);

// The text with a capital at its start.
std::string capitalized(std::string_view text);

}  // namespace qel
