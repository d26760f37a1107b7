#include "OurWorks.h"

#include <benchmark/benchmark.h>

#include <memory>
#include <optional>
#include <string>

#include "MemorySink.h"
#include "base/LineBuffer.h"
#include "base/Rendering.h"
#include "base/TimeZone.h"
#include "history/History.h"
#include "messages/catalogue/MetricMessages.h"
#include "metrics/MetricValidator.h"
#include "sources/SourceEvent.h"

namespace qel::bench {
namespace {

template <class Make>
auto forEach(const std::vector<Payload>& payloads, Make make) {
  std::vector<decltype(make(payloads.front()))> made;
  for (const Payload& payload : payloads) made.push_back(make(payload));
  return made;
}

std::vector<std::shared_ptr<PBCodable>> messagesOf(const std::vector<Payload>& payloads) {
  return forEach(payloads, [](const Payload& payload) {
    return findMetricMessage(payload.metric)->decode(payload.bytes);
  });
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

}  // namespace

Step decodeOurs(const std::vector<Payload>& payloads) {
  const auto decoder = [](const Payload& payload) {
    return findMetricMessage(payload.metric)->decode;
  };
  return [&payloads, decode = forEach(payloads, decoder)](std::size_t i) {
    benchmark::DoNotOptimize(decode[i](payloads[i].bytes));
  };
}

Step dictionaryOurs(const std::vector<Payload>& payloads) {
  const auto describer = [](const Payload& payload) {
    return findMetricMessage(payload.metric)->describe;
  };
  return [&payloads, describe = forEach(payloads, describer)](std::size_t i) {
    benchmark::DoNotOptimize(visit(*describe[i](payloads[i].bytes)));
  };
}

Step encodeOurs(const std::vector<Payload>& payloads) {
  return [kept = messagesOf(payloads), writer = std::make_shared<PBDataWriter>()](std::size_t i) {
    writer->clear();
    kept[i]->writeTo(*writer);
    benchmark::DoNotOptimize(writer->data().data());
  };
}

Step textOurs(const std::vector<Payload>& payloads) {
  std::vector<Dictionary> dictionaries;
  for (const auto& message : messagesOf(payloads)) {
    dictionaries.push_back(message->dictionaryRepresentation());
  }
  return [dictionaries, line = std::make_shared<LineBuffer>()](std::size_t i) {
    line->clear();
    appendJson(*line, dictionaries[i]);
    benchmark::DoNotOptimize(line->view().data());
  };
}

std::vector<std::uint64_t> timesOf(const std::vector<Payload>& payloads) {
  return forEach(payloads, [](const Payload& payload) {
    const auto entries = findMetricMessage(payload.metric)->describe(payload.bytes);
    const Value* time = entries ? entries->find("timestamp") : nullptr;
    return time ? time->asUInt64().value_or(kMixStartMs) : kMixStartMs;
  });
}

Step timeOurs(const std::vector<Payload>& payloads) {
  return [times = timesOf(payloads), dates = DateTexts(systemTimeZone())](std::size_t i) mutable {
    benchmark::DoNotOptimize(dates.at(static_cast<double>(times[i])).data());
  };
}

Dictionary eventOf(const Payload& payload) {
  return sources::metricEvent(payload.metric, payload.bytes, 0).entries;
}

namespace {

std::vector<std::optional<Dictionary>> eventsOf(const std::vector<Payload>& payloads) {
  std::vector<std::optional<Dictionary>> events;
  for (const Payload& payload : payloads) events.emplace_back(eventOf(payload));
  return events;
}

// Of the lists that the screens show; those that are due are copied for it.
std::size_t entriesInLists(const MetricStore& store) {
  std::size_t entries = 0;
  const LTE& lte = store.myLTE;
  const UMTS& umts = store.myUMTS;
  const GSM& gsm = store.myGSM;
  const Common& common = store.myCommon;
  for (const EntryList* list :
       {&lte.EutraNbrs,     &lte.RsrpRsrqSinr,  &lte.TxPower,      &lte.EutraNbrsMeas,
        &lte.UtraNbrsMeas,  &lte.GeraNbrsMeas,  &lte.CAStatusList, &lte.MMCommonInfo,
        &umts.rXInfo,       &umts.TxPower,      &umts.eUtraNbrs,   &umts.utraNbrs,
        &umts.geraNbrs,     &umts.eUtraNbrMeas, &umts.utraNbrMeas, &umts.geraNbrMeas,
        &gsm.eUtraNbrMeas,  &gsm.utraNbrMeas,   &gsm.geraNbrMeas,  &common.activeBearer,
        &common.simContents}) {
    entries += list->size();
  }
  return entries;
}

// Ten milliseconds later at every look.
class SteppingClock final : public Clock {
 public:
  std::uint64_t nowMs() const override { return _nowMs += 10; }

 private:
  mutable std::uint64_t _nowMs = kMixStartMs;
};

// A history in use: it has to let the oldest go.
struct Followed {
  Followed() { validator->setObserver(&history, clock); }

  SteppingClock clock;
  History history;
  std::shared_ptr<MetricValidator> validator = MetricValidator::create(nullptr);
};

}  // namespace

Step eventOurs(const std::vector<Payload>& payloads) {
  setStandardOutput(std::make_shared<MemorySink>());
  return [events = eventsOf(payloads), validator = MetricValidator::create(nullptr)](
             std::size_t i) { validator->metricsDidUpdate(events[i]); };
}

Step eventLookedAt(const std::vector<Payload>& payloads) {
  setStandardOutput(std::make_shared<MemorySink>());
  return
      [events = eventsOf(payloads), validator = MetricValidator::create(nullptr)](std::size_t i) {
        validator->metricsDidUpdate(events[i]);
        benchmark::DoNotOptimize(entriesInLists(*validator));
      };
}

Step eventWithHistory(const std::vector<Payload>& payloads) {
  constexpr std::size_t kTenMinutes = 60'000;
  setStandardOutput(std::make_shared<MemorySink>());
  const auto followed = std::make_shared<Followed>();
  const auto events = eventsOf(payloads);
  for (std::size_t i = 0; i < 2 * kTenMinutes; ++i) {
    followed->validator->metricsDidUpdate(events[i % events.size()]);
  }
  return [events, followed](std::size_t i) { followed->validator->metricsDidUpdate(events[i]); };
}

}  // namespace qel::bench
