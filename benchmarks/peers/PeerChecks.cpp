// A peer that skips work is no peer.

#include <google/protobuf/descriptor.h>
#include <google/protobuf/message.h>

#include <algorithm>
#include <cstdlib>
#include <iostream>
#include <memory>

#include "MemorySink.h"
#include "OurWorks.h"
#include "base/Rendering.h"
#include "messages/catalogue/MetricMessages.h"
#include "peers/FlatEntries.h"
#include "peers/PeerMessages.h"
#include "peers/PeerWorks.h"
#include "peers/PlainEntries.h"
#include "peers/StockMessages.h"

namespace qel::bench {
namespace {

using google::protobuf::FieldDescriptor;
using google::protobuf::Message;

void require(bool same, std::string_view who, std::uint32_t metric) {
  if (same) return;
  std::cerr << who << " has other results for " << findMetricMessage(metric)->className << '\n';
  std::exit(EXIT_FAILURE);
}

void fill(Message& message);

void fill(Message& message, const FieldDescriptor& field) {
  const auto& reflection = *message.GetReflection();
  const auto number = static_cast<std::uint32_t>(1000 + field.number());
  const std::string text = "value " + std::to_string(number);
  switch (field.cpp_type()) {
    case FieldDescriptor::CPPTYPE_UINT32:
      return reflection.SetUInt32(&message, &field, number);
    case FieldDescriptor::CPPTYPE_UINT64:
      return reflection.SetUInt64(&message, &field, std::uint64_t{number} << 32);
    case FieldDescriptor::CPPTYPE_INT32:
      return reflection.SetInt32(&message, &field, -static_cast<std::int32_t>(number));
    case FieldDescriptor::CPPTYPE_BOOL:
      return reflection.SetBool(&message, &field, true);
    case FieldDescriptor::CPPTYPE_ENUM: {
      const auto& values = *field.enum_type();
      return reflection.SetEnum(&message, &field, values.value(values.value_count() - 1));
    }
    case FieldDescriptor::CPPTYPE_STRING:
      return reflection.SetString(&message, &field, text);
    case FieldDescriptor::CPPTYPE_MESSAGE:
      return fill(*reflection.MutableMessage(&message, &field));
    default:
      std::abort();
  }
}

// Gives every field a value, lists two.
void fill(Message& message) {
  const auto& reflection = *message.GetReflection();
  for (int i = 0; i < message.GetDescriptor()->field_count(); ++i) {
    const auto& field = *message.GetDescriptor()->field(i);
    if (!field.is_repeated()) {
      fill(message, field);
    } else if (field.cpp_type() == FieldDescriptor::CPPTYPE_MESSAGE) {
      for (int k = 0; k < 2; ++k) fill(*reflection.AddMessage(&message, &field));
    } else {
      const bool isSigned = field.cpp_type() == FieldDescriptor::CPPTYPE_INT32;
      for (const int number : {1, 300}) {
        isSigned ? reflection.AddInt32(&message, &field, -number)
                 : reflection.AddUInt32(&message, &field, static_cast<std::uint32_t>(number));
      }
    }
  }
}

// A payload with every field that the metric's class has.
Payload fullPayload(std::uint32_t metric) {
  const std::unique_ptr<Message> message(stockPrototype(metric)->New());
  fill(*message);
  const std::string bytes = message->SerializeAsString();
  return {metric, Bytes(bytes.begin(), bytes.end())};
}

std::string fmtText(EntriesReader (*readerOf)(std::uint32_t), const Payload& payload) {
  std::string text;
  appendFmt(text, readerOf(payload.metric)(payload.bytes));
  return text;
}

std::string plainText(const Payload& payload) {
  const PlainRecord& record = findPlainRecord(payload.metric);
  const auto message = record.make();
  record.read(message.get(), payload.bytes);
  Line text;
  record.appendText(message.get(), {}, text);
  return std::string(text.view());
}

// Ours shows packed lists even when they are empty; the rivals do not. The timestamp is before
// them.
std::string withoutEmptyLists(std::string text) {
  constexpr std::string_view kEmpty = "\": []";
  for (auto end = text.find(kEmpty); end != std::string::npos; end = text.find(kEmpty)) {
    const auto begin = text.rfind(", \"", end);
    text.erase(begin, end + kEmpty.size() - begin);
  }
  return text;
}

void checkOurs(const Payload& payload) {
  const auto message = findMetricMessage(payload.metric)->decode(payload.bytes);
  require(message && message->data() == payload.bytes, "ours", payload.metric);
}

// What is read and written again are the same bytes.
void checkCodec(const Payload& payload) {
  const auto check = [&](std::span<const PeerMessage> messages, std::string_view who) {
    const PeerMessage& message = findPeerMessage(messages, payload.metric);
    std::string memory;
    const auto written = message.encode(message.keep(payload.bytes).get(), memory);
    require(std::ranges::equal(written, payload.bytes,
                               [](char a, std::uint8_t b) { return a == static_cast<char>(b); }),
            who, payload.metric);
  };
  check(protozeroMessages(), "protozero");
  check(sizedMessages(), "generated code");
  check(nanopbMessages(), "nanopb");
}

void checkEntries(const Payload& payload) {
  const auto ours = findMetricMessage(payload.metric)->describe(payload.bytes);
  const std::string text = withoutEmptyLists(jsonText(ours.value()));
  require(fmtText(stockEntries, payload) == text, "libprotobuf", payload.metric);
  require(fmtText(protozeroEntries, payload) == text, "protozero", payload.metric);
  require(plainText(payload) == text, "generated text", payload.metric);
  FlatEntries row;
  readFlat(fieldsOf(payload.metric), payload.bytes, row);
  require(flatText(row) == text, "protozero's row", payload.metric);
}

// The lines that an event gives, their characters sorted: the entries of a std::map are in another
// order than ours.
std::string charactersOf(Step (*prepare)(const std::vector<Payload>&), const Payload& payload) {
  const std::vector<Payload> payloads{payload};
  const Step step = prepare(payloads);
  const auto sink = std::make_shared<MemorySink>();
  setStandardOutput(sink);
  step(0);
  std::string lines = withoutEmptyLists(sink->lines());
  setStandardOutput(nullptr);
  std::ranges::sort(lines);
  return lines;
}

void checkEvent(const Payload& payload) {
  const std::string ours = charactersOf(eventOurs, payload);
  require(charactersOf(eventStock, payload) == ours, "event by libprotobuf", payload.metric);
  require(charactersOf(eventProtozero, payload) == ours, "event by protozero", payload.metric);
  require(charactersOf(eventNaive, payload) == ours, "plain event", payload.metric);
}

}  // namespace

void checkPeers(const std::vector<Mix>& mixes) {
  for (const Mix& mix : mixes) {
    for (const Payload& payload : mix.payloads) {
      checkOurs(payload);
      checkCodec(payload);
      checkEntries(payload);
      checkEvent(payload);
    }
  }
  for (const PeerMessage& message : protozeroMessages()) {
    const Payload full = fullPayload(message.metric);
    checkCodec(full);
    require(fmtText(stockEntries, full) == fmtText(protozeroEntries, full), "protozero",
            full.metric);
  }
}

}  // namespace qel::bench
