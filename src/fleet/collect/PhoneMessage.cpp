#include "fleet/collect/PhoneMessage.h"

#include <limits>
#include <utility>

#include "base/Rendering.h"
#include "fleet/MetricNames.h"
#include "fleet/PhoneName.h"
#include "fleet/collect/CopyRows.h"
#include "messages/catalogue/TagLog.h"
#include "recording/EventLine.h"
#include "recording/PlainLine.h"
#include "recording/RecordedMetric.h"

namespace qel::fleet {
namespace {

constexpr std::string_view kTopicStart = "qelwatch/";
constexpr std::size_t kLongestMetricName = 128;
constexpr std::string_view kStream = "stream";
constexpr std::string_view kNumber = "number";
constexpr std::string_view kTooLarge = "too_large";

struct Topic {
  std::string_view phone;
  std::string_view name;
};

std::optional<Topic> readTopic(std::string_view topic) {
  if (!topic.starts_with(kTopicStart)) return std::nullopt;
  topic.remove_prefix(kTopicStart.size());
  const auto slash = topic.find('/');
  if (slash == std::string_view::npos) return std::nullopt;
  const Topic parts{topic.substr(0, slash), topic.substr(slash + 1)};
  const bool isGood = faultOfPhoneName(parts.phone).empty() && !parts.name.empty() &&
                      parts.name.find('/') == std::string_view::npos;
  return isGood ? std::optional(parts) : std::nullopt;
}

// A number that the database has a place for.
std::optional<std::uint64_t> numberIn(const Dictionary& entries, std::string_view key,
                                      std::uint64_t least, std::uint64_t most) {
  const Value* value = entries.find(key);
  const auto number = value ? value->asUInt64() : std::nullopt;
  return number && *number >= least && *number <= most ? number : std::nullopt;
}

// An event, or what its sender made of it.
struct ReadLine {
  RecordedEvent event;          // its kind and time; of a decoded one without entries
  std::optional<Value> record;  // of a decoded one
  std::string metric;
};

std::optional<std::string> readDecoded(Dictionary& line, ReadLine& read) {
  const Value* metric = line.find("metric");
  const auto name = metric ? metric->asText() : std::nullopt;
  if (!name || name->empty() || name->size() > kLongestMetricName) {
    return "\"metric\" is no name";
  }
  read.metric = databaseText(*name);
  read.record = *line.find("record");
  if (!read.record->asDictionary()) return "\"record\" is no object";
  return std::nullopt;
}

// What both forms of a line have beside the event itself.
std::optional<std::string> readFrame(const Dictionary& line, RecordedEvent& event) {
  const Value* kind = line.find(kRecordedEventKey);
  const auto known = kind && kind->asText() ? recordedKind(*kind->asText()) : std::nullopt;
  if (!known) return "\"event\" is no kind of event";
  const auto time = numberIn(line, kRecordedTimeKey, 0, kLastRecordedMs);
  if (!time) return "\"time_ms\" is no time";
  event.kind = *known;
  event.timeMs = *time;
  return std::nullopt;
}

std::optional<std::string> readNumbers(const Dictionary& line, NumberedEvent& event) {
  const auto stream = numberIn(line, kStream, 0, std::numeric_limits<std::uint32_t>::max());
  const auto number = numberIn(line, kNumber, 1, std::numeric_limits<std::int64_t>::max());
  if (!stream || !number) return "it has no stream and number";
  event.stream = *stream;
  event.number = *number;
  return std::nullopt;
}

bool namesItsMetric(const RecordedEvent& event) {
  const Value* metric = event.entries.find(kRecordedMetricKey);
  return event.kind != RecordedKind::metric || (metric && metric->asInt64());
}

// A line that is not plain: a decoded one, or one of a recording with something unusual in it.
std::optional<std::string> readAnyLine(std::string_view payload, ReadLine& read,
                                       NumberedEvent& event) {
  auto parsed = parseJsonLine(payload);
  if (const auto* bad = std::get_if<LineFault>(&parsed)) return bad->reason;
  Dictionary& line = std::get<Dictionary>(parsed);
  if (auto why = readNumbers(line, event)) return why;
  const Value* entries = line.find("entries");
  const bool isDecoded = line.contains("record");
  if (isDecoded || (entries && entries->asDictionary())) {
    if (auto why = readFrame(line, read.event)) return why;
    if (isDecoded) return readDecoded(line, read);
    read.event.entries = *entries->asDictionary();
  } else {
    auto recorded = parseEventLine(payload);
    if (const auto* bad = std::get_if<LineFault>(&recorded)) return bad->reason;
    read.event = std::get<RecordedEvent>(std::move(recorded));
  }
  return namesItsMetric(read.event) ? std::nullopt : std::optional("it names no metric");
}

std::optional<std::string> readLine(std::string_view payload, ReadLine& read,
                                    NumberedEvent& event) {
  auto plain = readPlainLine(payload);
  if (!plain || !namesItsMetric(*plain)) return readAnyLine(payload, read, event);
  read.event = std::move(*plain);
  return readNumbers(read.event.entries, event);
}

void makeRows(const ReadLine& read, NumberedEvent& event) {
  CopyRows rows(*event.table);
  const auto put = [&rows](const TableRow& row) { return rows.add(row); };
  bool isMade = false;
  if (read.record) {
    isMade = event.table->rows().shownRows(read.event.timeMs, *read.record->asDictionary(), put);
  } else {
    const CountedTagLines tagLines;
    auto record = event.table->metric().describe(payloadOf(read.event.entries));
    if (!record) {
      event.fault = "payload cannot be decoded";
      return;
    }
    isMade = event.table->rows().rows(read.event.timeMs, std::move(*record), put);
  }
  if (isMade) {
    event.rows = rows.take();
  } else {
    event.fault = rows.fault();
  }
}

void findTable(const ReadLine& read, NumberedEvent& event) {
  if (read.record) {
    event.table = findFleetTable(event.metric);
  } else if (const MetricMessage* metric = messageOf(read.event.entries)) {
    if (read.event.kind == RecordedKind::metric) event.table = findFleetTable(metric->identifier);
  }
}

PhoneMessage readEvent(const Topic& topic, std::string_view payload) {
  NumberedEvent event;
  ReadLine read;
  if (auto why = readLine(payload, read, event)) return NoMessage{std::move(*why)};
  event.phone = topic.phone;
  event.timeMs = read.event.timeMs;
  event.metric = read.record ? read.metric : metricNameOf(read.event);
  findTable(read, event);
  if (event.table) {
    makeRows(read, event);
  } else if (read.record) {
    event.content = jsonText(*read.record);
  } else {
    read.event.entries.remove(kStream);
    read.event.entries.remove(kNumber);
    event.content = jsonText(read.event.entries);
  }
  return event;
}

PhoneMessage readStatus(const Topic& topic, std::string_view payload) {
  if (payload != "online" && payload != "offline") return NoMessage{"it is no status"};
  return PhoneStatus{std::string(topic.phone), std::string(payload)};
}

PhoneMessage readQueue(const Topic& topic, std::string_view payload) {
  const auto parsed = parseJsonLine(payload);
  const auto* line = std::get_if<Dictionary>(&parsed);
  if (!line) return NoMessage{std::get<LineFault>(parsed).reason};
  PhoneQueue queue{std::string(topic.phone)};
  for (const auto& [key, member] :
       {std::pair<std::string_view, std::uint64_t*>{kStream, &queue.stream},
        {"dropped", &queue.dropped},
        {"lost", &queue.lost},
        {kTooLarge, &queue.tooLarge},
        {"undecodable", &queue.undecodable}}) {
    if (key == kTooLarge && !line->contains(key)) continue;  // phones did not always say it
    const auto number = numberIn(*line, key, 0, std::numeric_limits<std::int64_t>::max());
    if (!number) return NoMessage{quoted(key) + " is no number"};
    *member = *number;
  }
  return queue;
}

}  // namespace

PhoneMessage readPhoneMessage(std::string_view topic, std::string_view payload) {
  const auto parts = readTopic(topic);
  if (!parts) return NoMessage{"the topic is none of a phone"};
  if (payload.size() > kLargestMessage) {
    return NoMessage{"longer than " + std::to_string(kLargestMessage) + " bytes"};
  }
  if (parts->name == "status") return readStatus(*parts, payload);
  if (parts->name == "queue") return readQueue(*parts, payload);
  return readEvent(*parts, payload);
}

std::size_t weightOf(const NumberedEvent& event) {
  std::size_t weight = sizeof event + event.content.size() + event.fault.size();
  for (const CopyRow& row : event.rows) {
    weight += sizeof row + row.size() * sizeof(CopyCell);
    for (const CopyCell& cell : row) weight += cell ? cell->size() : 0;
  }
  return weight;
}

}  // namespace qel::fleet
