#include <benchmark/benchmark.h>
#include <plain.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <protozero/exception.hpp>

#include "peers/PeerMessages.h"

namespace qel::bench {
namespace {

std::string_view textOf(ByteView bytes) {
  return {reinterpret_cast<const char*>(bytes.data()), bytes.size()};
}

template <class Message>
bool decode(ByteView payload) {
  try {
    Message message;
    plain::read(textOf(payload), message);
    benchmark::DoNotOptimize(&message);
    benchmark::ClobberMemory();
    return true;
  } catch (const protozero::exception&) {
    return false;
  }
}

template <class Message>
std::shared_ptr<const void> keep(ByteView payload) {
  const auto message = std::make_shared<Message>();
  plain::read(textOf(payload), *message);
  return message;
}

template <class Message>
std::string_view encode(const void* kept, std::string& memory) {
  memory.clear();
  plain::write(*static_cast<const Message*>(kept), memory);
  return memory;
}

template <class Message>
std::string_view encodeSized(const void* kept, std::string& memory) {
  plain::writeSized(*static_cast<const Message*>(kept), memory);
  return memory;
}

template <class Message>
std::shared_ptr<void> make() {
  return std::make_shared<Message>();
}

template <class Message>
std::optional<std::uint64_t> readAgain(void* kept, ByteView payload) {
  auto& message = *static_cast<Message*>(kept);
  plain::clear(message);
  plain::read(textOf(payload), message);
  return message.timestamp;
}

template <class Message>
void appendText(const void* kept, std::string_view time, Line& out) {
  plain::appendText(*static_cast<const Message*>(kept), time, out);
}

#define PEER(metric, Message) \
  PeerMessage { metric, decode<plain::Message>, keep<plain::Message>, encode<plain::Message> }
constexpr std::array kMessages = {
#include <metrics.inc>
};
#undef PEER

#define PEER(metric, Message) \
  PeerMessage { metric, decode<plain::Message>, keep<plain::Message>, encodeSized<plain::Message> }
constexpr std::array kSizedMessages = {
#include <metrics.inc>
};
#undef PEER

#define PEER(metric, Message)                                                           \
  PlainRecord {                                                                         \
    metric, make<plain::Message>, readAgain<plain::Message>, appendText<plain::Message> \
  }
constexpr std::array kRecords = {
#include <metrics.inc>
};
#undef PEER

}  // namespace

std::span<const PeerMessage> protozeroMessages() { return kMessages; }
std::span<const PeerMessage> sizedMessages() { return kSizedMessages; }

const PlainRecord& findPlainRecord(std::uint32_t metric) {
  const auto found = std::ranges::find(kRecords, metric, &PlainRecord::metric);
  if (found == kRecords.end()) std::abort();
  return *found;
}

}  // namespace qel::bench
