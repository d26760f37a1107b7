#include "tesk/bus/EventPacket.h"

#include <algorithm>
#include <array>
#include <memory>

#include "messages/event_packet.h"
#include "messages/runtime/MessageReader.h"
#include "tesk/Constants.h"

namespace tesk::bus {
namespace {

using qel::Dictionary;
using qel::EventEntry;
using qel::Value;

struct Stream {
  std::int32_t number;
  std::string_view name;
};

constexpr std::array kStreams = {Stream{1, kEventMetric}, Stream{2, kEventTrigger}};

// Nothing for a value of a kind that does not travel.
std::shared_ptr<EventEntry> entryOf(const Dictionary::Entry& from) {
  auto entry = qel::makeMessage<EventEntry>();
  entry->setKey(std::string(from.key.view()));
  if (const auto boolean = from.value.asBoolean()) {
    entry->setBoolean(*boolean);
  } else if (from.value.kind() == Value::Kind::floating) {
    return nullptr;
  } else if (const auto integer = from.value.asInt64()) {
    entry->setInteger(static_cast<std::uint64_t>(*integer));
  } else if (const qel::Bytes* data = from.value.asBytes()) {
    entry->setData(*data);
  } else if (const auto text = from.value.asText()) {
    entry->setText(std::string(*text));
  } else {
    return nullptr;
  }
  return entry;
}

std::optional<Value> valueOf(const EventEntry& entry) {
  if (entry.hasBoolean()) return entry.boolean();
  if (entry.hasInteger()) return static_cast<std::int64_t>(entry.integer());
  if (entry.hasData()) return *entry.data();
  if (entry.hasText()) return *entry.text();
  return std::nullopt;
}

}  // namespace

std::optional<qel::Bytes> encodeEvent(std::string_view eventName, const Message& event) {
  const auto stream = std::ranges::find(kStreams, eventName, &Stream::name);
  if (stream == kStreams.end()) return std::nullopt;
  qel::EventPacket packet;
  packet.setStream(stream->number);
  for (const auto& from : event.entries()) {
    if (auto entry = entryOf(from)) packet.addEntries(std::move(entry));
  }
  auto bytes = packet.data();
  if (bytes.size() > kLargestPacket) return std::nullopt;
  return bytes;
}

std::optional<StreamEvent> decodeEvent(qel::ByteView bytes) {
  if (bytes.size() > kLargestPacket) return std::nullopt;
  const auto packet = qel::EventPacket::initWithData(bytes);
  if (!packet) return std::nullopt;
  const auto stream = std::ranges::find(kStreams, packet->stream(), &Stream::number);
  if (stream == kStreams.end()) return std::nullopt;
  Dictionary entries;
  for (const auto& entry : packet->entries()) {
    auto value = valueOf(*entry);
    if (!entry->hasKey() || !value) return std::nullopt;
    entries.set(*entry->key(), std::move(*value));
  }
  return StreamEvent{stream->name, Message(std::move(entries))};
}

bool isIdentified(const StreamEvent& event) {
  if (event.name != kEventMetric) return true;
  const Value* identifier = event.message.entries().find(kKeyMetricID);
  return identifier && identifier->asInt64();
}

}  // namespace tesk::bus
