#include "Works.h"

#include <benchmark/benchmark.h>
#include <google/protobuf/message.h>

#include <array>
#include <ctime>
#include <memory>
#include <string>
#include <vector>

#include "PhoneMix.h"
#include "StockMessages.h"
#include "base/LogSink.h"
#include "base/Rendering.h"
#include "base/TimeZone.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "metrics/MetricValidator.h"

namespace qel::bench {
namespace {

using Step = std::function<void(std::size_t)>;

const std::vector<Payload>& payloads() {
  static const std::vector<Payload> mix = phoneMix(kPayloads);
  return mix;
}

template <class Make>
auto forEachPayload(Make make) {
  std::vector<decltype(make(payloads().front()))> made;
  for (const Payload& payload : payloads()) made.push_back(make(payload));
  return made;
}

std::vector<DecodeMessage> decoders() {
  return forEachPayload(
      [](const Payload& payload) { return findMetricMessage(payload.metric)->decode; });
}

std::vector<std::shared_ptr<PBCodable>> messages() {
  return forEachPayload([](const Payload& payload) {
    return findMetricMessage(payload.metric)->decode(payload.bytes);
  });
}

Step decodeOurs() {
  return [decode = decoders()](std::size_t i) {
    benchmark::DoNotOptimize(decode[i](payloads()[i].bytes));
  };
}

Step decodeStock() {
  return [prototypes = forEachPayload([](const Payload& payload) {
            return stockPrototype(payload.metric);
          })](std::size_t i) {
    const Bytes& bytes = payloads()[i].bytes;
    const std::unique_ptr<google::protobuf::Message> message(prototypes[i]->New());
    message->ParseFromArray(bytes.data(), static_cast<int>(bytes.size()));
    benchmark::DoNotOptimize(message.get());
  };
}

std::size_t visit(const Dictionary& dictionary);

std::size_t visit(const Value& value) {
  auto kinds = static_cast<std::size_t>(value.kind());
  if (value.kind() < Value::Kind::list) return kinds;
  if (const auto* nested = value.asDictionary()) return kinds + visit(*nested);
  for (const Value& element : *value.asList()) kinds += visit(element);
  return kinds;
}

// Every key and value of the dictionary and of those within it.
std::size_t visit(const Dictionary& dictionary) {
  std::size_t seen = 0;
  for (const auto& [key, value] : dictionary) seen += key.view().size() + visit(value);
  return seen;
}

Step dictionaryOurs() {
  return
      [describe = forEachPayload([](const Payload& payload) {
         return findMetricMessage(payload.metric)->describe;
       })](std::size_t i) { benchmark::DoNotOptimize(visit(*describe[i](payloads()[i].bytes))); };
}

Step encodeOurs() {
  return [kept = messages(), writer = std::make_shared<PBDataWriter>()](std::size_t i) {
    writer->clear();
    kept[i]->writeTo(*writer);
    benchmark::DoNotOptimize(writer->data().data());
  };
}

Step encodeStock() {
  std::vector<std::shared_ptr<google::protobuf::Message>> kept;
  for (const Payload& payload : payloads()) {
    kept.emplace_back(stockPrototype(payload.metric)->New());
    kept.back()->ParseFromArray(payload.bytes.data(), static_cast<int>(payload.bytes.size()));
  }
  return [kept, out = std::string()](std::size_t i) mutable {
    kept[i]->SerializeToString(&out);
    benchmark::DoNotOptimize(out.data());
  };
}

Step textOurs() {
  std::vector<Dictionary> dictionaries;
  for (const auto& message : messages()) {
    dictionaries.push_back(message->dictionaryRepresentation());
  }
  return [dictionaries, line = std::string()](std::size_t i) mutable {
    line.clear();
    appendJson(line, dictionaries[i]);
    benchmark::DoNotOptimize(line.data());
  };
}

constexpr double kStartMs = 1500000000000.0;

Step timeOurs() {
  return [dates = DateTexts(systemTimeZone())](std::size_t i) mutable {
    benchmark::DoNotOptimize(dates.at(kStartMs + static_cast<double>(i) * 40.0).data());
  };
}

Step timeStrftime() {
  return [](std::size_t i) {
    const auto seconds = static_cast<std::time_t>(kStartMs / 1000.0) + static_cast<long>(i) / 25;
    std::tm local{};
    ::localtime_r(&seconds, &local);
    std::array<char, 64> text;
    benchmark::DoNotOptimize(
        std::strftime(text.data(), text.size(), "%Y-%m-%d %H:%M:%S %Z", &local));
  };
}

// Keeps the lines as bytes in memory, as a batch for a file would be.
class MemorySink final : public LogSink {
 public:
  void write(std::string_view line) override {
    constexpr std::size_t kBatch = 65536;
    if (_lines.size() > kBatch) _lines.clear();
    _lines += line;
    _lines += '\n';
  }

 private:
  std::string _lines;
};

Step eventOurs() {
  std::vector<std::optional<Dictionary>> events;
  for (const Payload& payload : payloads()) {
    events.emplace_back(Dictionary{{"kKeyMetricID", payload.metric + kMetricEventBase},
                                   {"kKeyProfileID", 0},
                                   {"kKeyPayload", payload.bytes}});
  }
  setStandardOutput(std::make_shared<MemorySink>());
  return [events, validator = MetricValidator::create(nullptr)](std::size_t i) {
    validator->metricsDidUpdate(events[i]);
  };
}

constexpr std::array kWorks = {
    Work{"decode a fresh message", "libprotobuf", decodeStock},
    Work{"decode a fresh message", "ours", decodeOurs},
    Work{"decode, dictionary, visit every entry", "ours", dictionaryOurs},
    Work{"encode a kept message", "libprotobuf", encodeStock},
    Work{"encode a kept message", "ours", encodeOurs},
    Work{"text of a dictionary", "ours", textOurs},
    Work{"time text, warm", "strftime", timeStrftime},
    Work{"time text, warm", "ours", timeOurs},
    Work{"one metric event", "ours", eventOurs},
};

}  // namespace

std::span<const Work> works() { return kWorks; }

}  // namespace qel::bench
