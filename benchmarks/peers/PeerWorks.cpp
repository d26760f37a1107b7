#include "peers/PeerWorks.h"

#include <benchmark/benchmark.h>
#include <google/protobuf/message.h>

#include <array>
#include <cstdlib>
#include <ctime>
#include <memory>

#include "OurWorks.h"
#include "peers/FlatEntries.h"
#include "peers/KeptTime.h"
#include "peers/PeerMessages.h"
#include "peers/PlainEntries.h"
#include "peers/StockMessages.h"

namespace qel::bench {
namespace {

using google::protobuf::Message;

template <class Make>
auto forEach(const std::vector<Payload>& payloads, Make make) {
  std::vector<decltype(make(payloads.front()))> made;
  for (const Payload& payload : payloads) made.push_back(make(payload));
  return made;
}

auto decodersOf(const std::vector<Payload>& payloads, std::span<const PeerMessage> messages) {
  return forEach(payloads, [&](const Payload& payload) {
    return findPeerMessage(messages, payload.metric).decode;
  });
}

Step decodeBy(std::span<const PeerMessage> messages, const std::vector<Payload>& payloads) {
  return [&payloads, decode = decodersOf(payloads, messages)](std::size_t i) {
    if (!decode[i](payloads[i].bytes)) std::abort();
  };
}

struct Kept {
  std::shared_ptr<const void> message;
  decltype(PeerMessage::encode) encode;
};

Step encodeBy(std::span<const PeerMessage> messages, const std::vector<Payload>& payloads) {
  const auto keep = [&](const Payload& payload) {
    const PeerMessage& message = findPeerMessage(messages, payload.metric);
    return Kept{message.keep(payload.bytes), message.encode};
  };
  return [kept = forEach(payloads, keep), memory = std::string()](std::size_t i) mutable {
    benchmark::DoNotOptimize(kept[i].encode(kept[i].message.get(), memory).data());
  };
}

// One reader a metric, found before anything is measured.
Step visitBy(EntriesReader (*readerOf)(std::uint32_t metric),
             const std::vector<Payload>& payloads) {
  const auto reader = [&](const Payload& payload) { return readerOf(payload.metric); };
  return [&payloads, read = forEach(payloads, reader)](std::size_t i) {
    benchmark::DoNotOptimize(visit(read[i](payloads[i].bytes)));
  };
}

}  // namespace

const PeerMessage& findPeerMessage(std::span<const PeerMessage> messages, std::uint32_t metric) {
  for (const PeerMessage& message : messages) {
    if (message.metric == metric) return message;
  }
  std::abort();
}

Step decodeStock(const std::vector<Payload>& payloads) {
  const auto prototype = [](const Payload& payload) { return stockPrototype(payload.metric); };
  return [&payloads, prototypes = forEach(payloads, prototype)](std::size_t i) {
    const Bytes& bytes = payloads[i].bytes;
    const std::unique_ptr<Message> message(prototypes[i]->New());
    message->ParseFromArray(bytes.data(), static_cast<int>(bytes.size()));
    benchmark::DoNotOptimize(message.get());
  };
}

Step encodeStock(const std::vector<Payload>& payloads) {
  const auto parse = [](const Payload& payload) {
    std::shared_ptr<Message> message(stockPrototype(payload.metric)->New());
    message->ParseFromArray(payload.bytes.data(), static_cast<int>(payload.bytes.size()));
    return message;
  };
  return [kept = forEach(payloads, parse), out = std::string()](std::size_t i) mutable {
    kept[i]->SerializeToString(&out);
    benchmark::DoNotOptimize(out.data());
  };
}

Step entriesStock(const std::vector<Payload>& payloads) { return visitBy(stockEntries, payloads); }

Step decodeProtozero(const std::vector<Payload>& payloads) {
  return decodeBy(protozeroMessages(), payloads);
}

Step keepProtozero(const std::vector<Payload>& payloads) {
  const auto keeper = [](const Payload& payload) {
    return findPeerMessage(protozeroMessages(), payload.metric).keep;
  };
  return [&payloads, keep = forEach(payloads, keeper)](std::size_t i) {
    benchmark::DoNotOptimize(keep[i](payloads[i].bytes));
  };
}

Step encodeProtozero(const std::vector<Payload>& payloads) {
  return encodeBy(protozeroMessages(), payloads);
}

Step encodeSized(const std::vector<Payload>& payloads) {
  return encodeBy(sizedMessages(), payloads);
}

Step entriesProtozero(const std::vector<Payload>& payloads) {
  return visitBy(protozeroEntries, payloads);
}

Step entriesFlat(const std::vector<Payload>& payloads) {
  const auto fields = [](const Payload& payload) { return &fieldsOf(payload.metric); };
  return
      [&payloads, tables = forEach(payloads, fields), row = FlatEntries()](std::size_t i) mutable {
        readFlat(*tables[i], payloads[i].bytes, row);
        benchmark::DoNotOptimize(visit(row));
      };
}

Step decodeNanopb(const std::vector<Payload>& payloads) {
  return decodeBy(nanopbMessages(), payloads);
}

Step encodeNanopb(const std::vector<Payload>& payloads) {
  return encodeBy(nanopbMessages(), payloads);
}

Step textFmt(const std::vector<Payload>& payloads) {
  const auto entries = [](const Payload& payload) {
    return protozeroEntries(payload.metric)(payload.bytes);
  };
  return [all = forEach(payloads, entries), line = std::string()](std::size_t i) mutable {
    line.clear();
    appendFmt(line, all[i]);
    benchmark::DoNotOptimize(line.data());
  };
}

Step textPlain(const std::vector<Payload>& payloads) {
  struct Kept {
    std::shared_ptr<void> message;
    decltype(PlainRecord::appendText) append;
  };
  const auto keep = [](const Payload& payload) {
    const PlainRecord& record = findPlainRecord(payload.metric);
    Kept kept{record.make(), record.appendText};
    record.read(kept.message.get(), payload.bytes);
    return kept;
  };
  return [all = forEach(payloads, keep), line = std::make_shared<Line>()](std::size_t i) {
    line->clear();
    all[i].append(all[i].message.get(), {}, *line);
    benchmark::DoNotOptimize(line->view().data());
  };
}

Step timeStrftime(const std::vector<Payload>& payloads) {
  return [times = timesOf(payloads)](std::size_t i) {
    const auto seconds = static_cast<std::time_t>(times[i] / 1000);
    std::tm local{};
    ::localtime_r(&seconds, &local);
    std::array<char, 64> text;
    benchmark::DoNotOptimize(
        std::strftime(text.data(), text.size(), "%Y-%m-%d %H:%M:%S %Z", &local));
  };
}

Step timeKept(const std::vector<Payload>& payloads) {
  return [times = timesOf(payloads), kept = KeptTime()](std::size_t i) mutable {
    benchmark::DoNotOptimize(kept.at(times[i]).data());
  };
}

}  // namespace qel::bench
