// Metric events without further thought.

#include <google/protobuf/descriptor.h>
#include <google/protobuf/message.h>

#include <array>
#include <cstdlib>
#include <ctime>
#include <iomanip>
#include <map>
#include <memory>
#include <sstream>
#include <variant>

#include "MemorySink.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "metrics/DispatchTable.h"
#include "peers/PeerWorks.h"
#include "peers/StockMessages.h"

namespace qel::bench {
namespace {

using google::protobuf::FieldDescriptor;
using google::protobuf::Message;
using google::protobuf::Reflection;

struct MapValue;
using Map = std::map<std::string, MapValue>;
using MapList = std::vector<MapValue>;

struct MapValue {
  std::variant<bool, std::int64_t, std::uint64_t, std::string, Bytes, MapList, Map> is;
};

Map mapOf(const Message& message);

MapValue valueOf(const Message& message, const FieldDescriptor& field) {
  const Reflection& reflection = *message.GetReflection();
  switch (field.cpp_type()) {
    case FieldDescriptor::CPPTYPE_UINT32:
      return {std::uint64_t{reflection.GetUInt32(message, &field)}};
    case FieldDescriptor::CPPTYPE_UINT64:
      return {std::uint64_t{reflection.GetUInt64(message, &field)}};
    case FieldDescriptor::CPPTYPE_INT32:
      return {std::int64_t{reflection.GetInt32(message, &field)}};
    case FieldDescriptor::CPPTYPE_BOOL:
      return {reflection.GetBool(message, &field)};
    case FieldDescriptor::CPPTYPE_ENUM:
      return {reflection.GetEnum(message, &field)->name()};
    case FieldDescriptor::CPPTYPE_STRING: {
      const std::string text = reflection.GetString(message, &field);
      if (field.type() == FieldDescriptor::TYPE_BYTES) return {Bytes(text.begin(), text.end())};
      return {text};
    }
    case FieldDescriptor::CPPTYPE_MESSAGE:
      return {mapOf(reflection.GetMessage(message, &field))};
    default:
      std::abort();  // no metric message has such a field
  }
}

MapList listOf(const Message& message, const FieldDescriptor& field) {
  const Reflection& reflection = *message.GetReflection();
  MapList list;
  for (int i = 0; i < reflection.FieldSize(message, &field); ++i) {
    if (field.cpp_type() == FieldDescriptor::CPPTYPE_MESSAGE) {
      list.push_back({mapOf(reflection.GetRepeatedMessage(message, &field, i))});
    } else if (field.cpp_type() == FieldDescriptor::CPPTYPE_INT32) {
      list.push_back({std::int64_t{reflection.GetRepeatedInt32(message, &field, i)}});
    } else {
      list.push_back({std::uint64_t{reflection.GetRepeatedUInt32(message, &field, i)}});
    }
  }
  return list;
}

Map mapOf(const Message& message) {
  std::vector<const FieldDescriptor*> fields;
  message.GetReflection()->ListFields(message, &fields);
  Map map;
  for (const FieldDescriptor* field : fields) {
    if (field->is_repeated()) {
      map[field->name()] = {listOf(message, *field)};
    } else {
      map[field->name()] = valueOf(message, *field);
    }
  }
  return map;
}

class StreamWriter {
 public:
  explicit StreamWriter(std::ostream& out) : _out(out) {}

  void operator()(bool value) { _out << (value ? "true" : "false"); }
  void operator()(std::int64_t value) { _out << value; }
  void operator()(std::uint64_t value) { _out << value; }
  void operator()(const std::string& text) { _out << std::quoted(text); }
  void operator()(const Bytes& bytes) {
    _out << "\"<" << std::hex << std::setfill('0');
    for (const unsigned byte : bytes) _out << std::setw(2) << byte;
    _out << std::dec << ">\"";
  }
  void operator()(const MapList& list) {
    const char* before = "[";
    for (const MapValue& value : list) {
      _out << std::exchange(before, ", ");
      std::visit(*this, value.is);
    }
    _out << (list.empty() ? "[]" : "]");
  }
  void operator()(const Map& map) {
    const char* before = "{";
    for (const auto& [key, value] : map) {
      _out << std::exchange(before, ", ") << std::quoted(key) << ": ";
      std::visit(*this, value.is);
    }
    _out << (map.empty() ? "{}" : "}");
  }

 private:
  std::ostream& _out;
};

std::string timeText(std::uint64_t milliseconds) {
  const auto seconds = static_cast<std::time_t>(milliseconds / 1000);
  std::tm local{};
  ::localtime_r(&seconds, &local);
  std::array<char, 64> text;
  return {text.data(), std::strftime(text.data(), text.size(), "%Y-%m-%d %H:%M:%S %Z", &local)};
}

class NaiveValidator {
 public:
  void take(const Map& event) {
    const auto metric = std::get<std::uint64_t>(event.at("kKeyMetricID").is);
    std::ostringstream first;
    first << "Metric ID in Hex = " << std::hex << std::uppercase << std::setw(2) << metric;
    standardOutput().write(first.str());

    const DispatchRow* row = findDispatchRow(static_cast<std::int64_t>(metric));
    if (!row) return standardOutput().write("I dont care for this Metric");
    const Bytes& bytes = std::get<Bytes>(event.at("kKeyPayload").is);
    const std::unique_ptr<Message> message(prototypeOf(metric).New());
    if (!message->ParseFromArray(bytes.data(), static_cast<int>(bytes.size()))) std::abort();

    Map& record = _records[metric];
    record = mapOf(*message);
    if (const auto found = record.find("timestamp"); found != record.end()) {
      found->second = {timeText(std::get<std::uint64_t>(found->second.is))};
    }
    std::ostringstream second;
    second << row->logText;
    StreamWriter{second}(record);
    standardOutput().write(second.str());
    standardOutput().write("Received Valid Metric");
  }

 private:
  const Message& prototypeOf(std::uint64_t metric) {
    const Message*& prototype = _prototypes[metric];
    if (!prototype)
      prototype = stockPrototype(static_cast<std::uint32_t>(metric - kMetricEventBase));
    return *prototype;
  }

  std::map<std::uint64_t, const Message*> _prototypes;
  std::map<std::uint64_t, Map> _records;  // the newest of each metric
};

}  // namespace

Step eventNaive(const std::vector<Payload>& payloads) {
  std::vector<Map> events;
  for (const Payload& payload : payloads) {
    events.push_back({{"kKeyMetricID", {std::uint64_t{payload.metric + kMetricEventBase}}},
                      {"kKeyProfileID", {std::int64_t{0}}},
                      {"kKeyPayload", {payload.bytes}}});
  }
  setStandardOutput(std::make_shared<MemorySink>());
  return
      [events, validator = NaiveValidator()](std::size_t i) mutable { validator.take(events[i]); };
}

}  // namespace qel::bench
