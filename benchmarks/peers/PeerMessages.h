// The message classes of all metrics, by peers that know nothing like a common base class.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>

#include "base/Bytes.h"
#include "peers/Line.h"

namespace qel::bench {

struct PeerMessage {
  std::uint32_t metric;
  bool (*decode)(ByteView payload);  // into a fresh object, which then goes; false when damaged
  std::shared_ptr<const void> (*keep)(ByteView payload);
  // Into `memory`, which is used again; valid as long as that.
  std::string_view (*encode)(const void* kept, std::string& memory);
};

std::span<const PeerMessage> protozeroMessages();
std::span<const PeerMessage> sizedMessages();  // protozero's structs, written without it
std::span<const PeerMessage> nanopbMessages();

// Ends the program when there is none of the metric.
const PeerMessage& findPeerMessage(std::span<const PeerMessage> messages, std::uint32_t metric);

// A message that is read into again and again, and its text.
struct PlainRecord {
  std::uint32_t metric;
  std::shared_ptr<void> (*make)();
  // What was there goes. The time of the report, or nothing.
  std::optional<std::uint64_t> (*read)(void* message, ByteView payload);
  void (*appendText)(const void* message, std::string_view time, Line& out);
};

const PlainRecord& findPlainRecord(std::uint32_t metric);

}  // namespace qel::bench
