// What a phone's message says, ready for the tables.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "fleet/collect/FleetTable.h"

namespace qel::fleet {

// A cell as the database reads it, without its escapes; nothing: NULL.
using CopyCell = std::optional<std::string>;
using CopyRow = std::vector<CopyCell>;  // behind phone, stream, number and time

struct NumberedEvent {
  std::string phone;
  std::uint64_t stream = 0;
  std::uint64_t number = 0;
  std::uint64_t timeMs = 0;
  std::string metric;
  std::string fault;    // why no table has it; empty: nothing is wrong
  std::string content;  // of an event without a table, as JSON; empty: none
  const FleetTable* table = nullptr;
  std::vector<CopyRow> rows;
};

struct PhoneStatus {
  std::string phone;
  std::string status;
};

struct PhoneQueue {
  std::string phone;
  std::uint64_t stream = 0;
  std::uint64_t dropped = 0;
  std::uint64_t lost = 0;
  std::uint64_t tooLarge = 0;
  std::uint64_t undecodable = 0;
};

// Why a message is none of these, for people: nobody knows what it should be counted as.
struct NoMessage {
  std::string why;
};

using PhoneMessage = std::variant<NumberedEvent, PhoneStatus, PhoneQueue, NoMessage>;

inline constexpr std::size_t kLargestMessage = 1024 * 1024 + 256;  // a line, and its number
inline constexpr std::size_t kMostRowsOfAnEvent = 4096;
inline constexpr std::size_t kMostBytesOfAnEvent = 4 * 1024 * 1024;  // of its cells

// Of a message to the topic. Any thread. In time and memory in proportion to these limits.
PhoneMessage readPhoneMessage(std::string_view topic, std::string_view payload);

// How much memory it holds, nearly.
std::size_t weightOf(const NumberedEvent& event);

}  // namespace qel::fleet
