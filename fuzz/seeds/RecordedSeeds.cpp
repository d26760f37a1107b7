#include "fuzz/seeds/RecordedSeeds.h"

#include <algorithm>
#include <map>
#include <string>

#include "base/FatalError.h"
#include "fuzz/support/Seed.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "recording/EventLine.h"
#include "recording/LineCompressor.h"
#include "recording/RecordingReader.h"
#include "tesk/Constants.h"
#include "tesk/bus/EventPacket.h"

namespace qel::fuzz {
namespace {

constexpr int kOfEach = 2;
constexpr std::size_t kEventsOfAFile = 4;

Bytes payloadOf(const RecordedEvent& event) {
  const Value* value = event.entries.find(kRecordedPayloadKey);
  return value && value->asBytes() ? *value->asBytes() : Bytes();
}

std::int64_t metricOf(const RecordedEvent& event) {
  return event.entries.find(kRecordedMetricKey)->asInt64().value() - std::int64_t{kMetricEventBase};
}

// The place of the metric in the list of those with a class, or else a byte for "none of them" and
// its number.
void writeMetric(Seed& seed, std::int64_t metric) {
  const auto metrics = metricMessages();
  const auto found = std::ranges::find(metrics, metric, &MetricMessage::identifier);
  if (found != metrics.end()) {
    seed.byte(static_cast<std::size_t>(found - metrics.begin()));
  } else {
    seed.byte(0xFF).number(static_cast<std::uint32_t>(metric));
  }
}

std::string linesOf(const std::vector<RecordedEvent>& events, std::size_t first) {
  std::string text;
  for (std::size_t i = first; i < std::min(first + kEventsOfAFile, events.size()); ++i) {
    text += eventLine(events[i]) + '\n';
  }
  return text;
}

ByteView viewOf(std::string_view text) {
  return {reinterpret_cast<const std::uint8_t*>(text.data()), text.size()};
}

}  // namespace

std::vector<RecordedEvent> firstOfEach(const std::string& recording) {
  RecordingFault notOpened;
  const auto reader = RecordingReader::open(recording, RecordingReader::BadLines::fail, notOpened);
  if (!reader) fatalError(notOpened.message);
  std::vector<RecordedEvent> events;
  std::map<std::int64_t, int> count;
  while (auto event = reader->next()) {
    if (event->kind == RecordedKind::metric && count[metricOf(*event)]++ < kOfEach) {
      events.push_back(std::move(*event));
    }
  }
  if (events.empty()) fatalError(recording + " has no events");
  return events;
}

std::vector<Bytes> eventSeeds(const std::vector<RecordedEvent>& events) {
  std::vector<Bytes> seeds;
  for (const std::size_t way : {0U, 1U}) {
    for (std::size_t i = 0; i + 1 < events.size(); i += 2) {
      Seed seed;
      seed.byte(way);
      for (const RecordedEvent* event : {&events[i], &events[i + 1]}) {
        seed.byte(0);
        writeMetric(seed, metricOf(*event));
        seed.number(event->timeMs).piece(payloadOf(*event));
      }
      seeds.push_back(seed.bytes);
    }
  }
  return seeds;
}

std::vector<Bytes> lineSeeds(const std::vector<RecordedEvent>& events) {
  std::vector<Bytes> seeds;
  for (const RecordedEvent& event : events)
    seeds.push_back(Seed().rest(viewOf(eventLine(event))).bytes);
  for (
      const std::string_view line :
      {R"({"time_ms": 1, "event": "trigger", "kKeyTriggerID": 7, "x": [1, -2.5, null, {"y": true}]})",
       R"({"time_ms": 1e3, "event": "metric"})",
       R"({"event": "trigger", "time_ms": 2, "a": "\u00e4"})",
       R"({"metric": 19972, "payload": "08e807"})", R"({"payload": "", "metric": -1, "a": 1})"}) {
    seeds.push_back(Seed().rest(viewOf(line)).bytes);
  }
  return seeds;
}

std::vector<Bytes> recordingSeeds(const std::vector<RecordedEvent>& events) {
  std::vector<Bytes> seeds;
  for (std::size_t i = 0; i < events.size(); i += kEventsOfAFile) {
    const std::string text = linesOf(events, i);
    seeds.push_back(Seed().byte(1).rest(viewOf(text)).bytes);
    LineCompressor compressor;
    seeds.push_back(Seed().byte(1).rest(compressor.line(text)).rest(compressor.end()).bytes);
    seeds.push_back(
        Seed().byte(0).byte(0).byte(0).number(std::uint16_t{0}).rest(viewOf(text)).bytes);
  }
  return seeds;
}

std::vector<Bytes> identitySeeds(const std::vector<RecordedEvent>& events) {
  std::vector<Bytes> seeds;
  for (const RecordedEvent& event : events) {
    Seed seed;
    writeMetric(seed, metricOf(event));
    seed.piece(payloadOf(event)).byte(0).entries({{"own", "text"}, {"number", 1}});
    seeds.push_back(seed.bytes);
  }
  return seeds;
}

std::vector<Bytes> packetSeeds(const std::vector<RecordedEvent>& events) {
  std::vector<Bytes> seeds;
  for (const RecordedEvent& event : events) {
    const auto packet = tesk::bus::encodeEvent(tesk::kEventMetric, tesk::Message(event.entries));
    if (packet) seeds.push_back(Seed().byte(0).rest(*packet).bytes);
    seeds.push_back(Seed().byte(1).byte(0).entries(event.entries).bytes);
  }
  return seeds;
}

}  // namespace qel::fuzz
