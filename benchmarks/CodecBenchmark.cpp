// The codec beside the stock protobuf runtime, on the payloads of a phone.

#include <benchmark/benchmark.h>
#include <google/protobuf/message.h>

#include <memory>

#include "AllocationCounter.h"
#include "PhoneMix.h"
#include "StockMessages.h"
#include "base/LogSink.h"
#include "base/Rendering.h"
#include "messages/catalogue/MetricMessages.h"

namespace qel::bench {
namespace {

constexpr std::size_t kPayloads = 10000;

const std::vector<Payload>& payloads() {
  static const std::vector<Payload> mix = [] {
    setSystemLog(nullptr);
    return phoneMix(kPayloads);
  }();
  return mix;
}

// Runs `work` over every payload, and reports time and allocations for one of them.
template <class Work>
void overPayloads(benchmark::State& state, Work&& work) {
  const auto& mix = payloads();
  std::uint64_t allocated = 0;
  for (auto _ : state) {
    const std::uint64_t before = allocations();
    for (std::size_t i = 0; i < mix.size(); ++i) work(i);
    allocated += allocations() - before;
  }
  const auto total = static_cast<double>(state.iterations()) * static_cast<double>(mix.size());
  state.counters["allocations"] = static_cast<double>(allocated) / total;
  state.counters["per_message"] =
      benchmark::Counter(total, benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
}

void decodeOurs(benchmark::State& state) {
  std::vector<DecodeMessage> decoders;
  for (const Payload& payload : payloads()) {
    decoders.push_back(findMetricMessage(payload.metric)->decode);
  }
  overPayloads(state,
               [&](std::size_t i) { benchmark::DoNotOptimize(decoders[i](payloads()[i].bytes)); });
}
BENCHMARK(decodeOurs);

void decodeStock(benchmark::State& state) {
  std::vector<const google::protobuf::Message*> prototypes;
  for (const Payload& payload : payloads()) prototypes.push_back(stockPrototype(payload.metric));
  overPayloads(state, [&](std::size_t i) {
    const Bytes& bytes = payloads()[i].bytes;
    const std::unique_ptr<google::protobuf::Message> message(prototypes[i]->New());
    message->ParseFromArray(bytes.data(), static_cast<int>(bytes.size()));
    benchmark::DoNotOptimize(message.get());
  });
}
BENCHMARK(decodeStock);

void decodeAndDictionaryOurs(benchmark::State& state) {
  std::vector<DecodeMessage> decoders;
  for (const Payload& payload : payloads()) {
    decoders.push_back(findMetricMessage(payload.metric)->decode);
  }
  overPayloads(state, [&](std::size_t i) {
    const auto message = decoders[i](payloads()[i].bytes);
    benchmark::DoNotOptimize(message->dictionaryRepresentation());
  });
}
BENCHMARK(decodeAndDictionaryOurs);

void encodeOurs(benchmark::State& state) {
  std::vector<std::shared_ptr<PBCodable>> messages;
  for (const Payload& payload : payloads()) {
    messages.push_back(findMetricMessage(payload.metric)->decode(payload.bytes));
  }
  PBDataWriter writer;
  overPayloads(state, [&](std::size_t i) {
    writer._output.clear();
    messages[i]->writeTo(writer);
    benchmark::DoNotOptimize(writer._output.data());
  });
}
BENCHMARK(encodeOurs);

void encodeStock(benchmark::State& state) {
  std::vector<std::unique_ptr<google::protobuf::Message>> messages;
  for (const Payload& payload : payloads()) {
    messages.emplace_back(stockPrototype(payload.metric)->New());
    messages.back()->ParseFromArray(payload.bytes.data(), static_cast<int>(payload.bytes.size()));
  }
  std::string out;
  overPayloads(state, [&](std::size_t i) {
    messages[i]->SerializeToString(&out);
    benchmark::DoNotOptimize(out.data());
  });
}
BENCHMARK(encodeStock);

void textOfDictionaryOurs(benchmark::State& state) {
  std::vector<Dictionary> dictionaries;
  for (const Payload& payload : payloads()) {
    dictionaries.push_back(
        findMetricMessage(payload.metric)->decode(payload.bytes)->dictionaryRepresentation());
  }
  std::string line;
  overPayloads(state, [&](std::size_t i) {
    line.clear();
    appendJson(line, dictionaries[i]);
    benchmark::DoNotOptimize(line.data());
  });
}
BENCHMARK(textOfDictionaryOurs);

}  // namespace
}  // namespace qel::bench

BENCHMARK_MAIN();
