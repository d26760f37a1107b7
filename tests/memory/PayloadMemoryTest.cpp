// What a payload costs in memory is bound by its size, whatever its bytes are.
#include <google/protobuf/descriptor.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <string>
#include <thread>
#include <vector>

#include "messages/Schemas.h"
#include "messages/Wire.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "messages/catalogue/TagLog.h"
#include "metrics/MetricValidator.h"
#include "support/CountedMemory.h"
#include "support/RecordingSink.h"
#include "support/Sanitized.h"

namespace qel {
namespace {

using google::protobuf::Descriptor;
using google::protobuf::FieldDescriptor;
using testing::CountedMemory;
using testing::joined;

constexpr std::size_t kPayloadBytes = 8 * 1024;
// For what does not depend on the payload's size.
constexpr double kOnceBytes = 4 * 1024;

// The shortest ways to write one field, alone or with the shortest fields of its message within.
std::vector<Bytes> smallest(const FieldDescriptor& field) {
  const auto number = static_cast<std::uint64_t>(field.number());
  std::vector<Bytes> ways;
  if (field.type() == FieldDescriptor::TYPE_MESSAGE) {
    ways.push_back(testing::delimitedField(number, {}));
    const Descriptor& nested = *field.message_type();
    Bytes all;
    for (int i = 0; i < nested.field_count(); ++i) {
      const auto within = smallest(*nested.field(i));
      for (const Bytes& way : within) ways.push_back(testing::delimitedField(number, way));
      all = joined(all, within.front());
    }
    ways.push_back(testing::delimitedField(number, all));
  } else if (field.is_packed() || field.type() == FieldDescriptor::TYPE_BYTES ||
             field.type() == FieldDescriptor::TYPE_STRING) {
    for (const char* content : {"", "61"}) {
      ways.push_back(testing::delimitedField(number, testing::hex(content)));
    }
  } else {
    ways.push_back(testing::varintField(number, 9));
  }
  return ways;
}

Bytes repeated(const Bytes& part) {
  Bytes payload;
  payload.reserve(kPayloadBytes);
  while (payload.size() + part.size() <= kPayloadBytes) testing::append(payload, part);
  return payload;
}

// Calls the work with payloads of the class that are made of one short field over and over: in
// order, and with another field behind it that only a message can take.
void forPayloads(std::string_view className, const std::function<void(const Bytes&)>& work) {
  const Descriptor& schema = testing::schemaOf(className);
  for (int i = 0; i < schema.field_count(); ++i) {
    for (const Bytes& way : smallest(*schema.field(i))) {
      const Bytes payload = repeated(way);
      SCOPED_TRACE(std::string(className) + ": " + hexText(way) + " over and over");
      work(payload);
      work(joined(payload, testing::varintField(1, 1), testing::varintField(1, 1)));
    }
  }
}

double timesThePayload(const std::function<void()>& work) {
  const CountedMemory memory;
  work();
  return (static_cast<double>(memory.most()) - kOnceBytes) / kPayloadBytes;
}

class PayloadMemory : public ::testing::Test {
 protected:
  // Calls law(metric, payload) for costly payloads of every metric.
  template <class Law>
  static void forAll(Law&& law) {
    for (const MetricMessage& metric : metricMessages()) {
      forPayloads(metric.className, [&](const Bytes& payload) { law(metric, payload); });
    }
  }
};

// Every dictionary had room for all fields of its class, at once 265 times the payload.
TEST_F(PayloadMemory, ADictionaryTakesAtMost45TimesThePayload) {
  forAll([](const MetricMessage& metric, const Bytes& payload) {
    EXPECT_LE(timesThePayload([&] { EXPECT_TRUE(metric.describe(payload)); }), 45.0);
  });
}

TEST_F(PayloadMemory, ACopyOfADictionaryTakesAtMost45TimesThePayload) {
  forAll([](const MetricMessage& metric, const Bytes& payload) {
    const auto dictionary = metric.describe(payload);
    EXPECT_LE(timesThePayload([&] { const Dictionary copy = *dictionary; }), 45.0);
  });
}

TEST_F(PayloadMemory, AMessageTakesAtMost150TimesThePayload) {
  forAll([](const MetricMessage& metric, const Bytes& payload) {
    EXPECT_LE(timesThePayload([&] { EXPECT_TRUE(metric.decode(payload)); }), 150.0);
  });
}

TEST_F(PayloadMemory, ADictionaryOfAMessageTakesAtMost45TimesThePayload) {
  forAll([](const MetricMessage& metric, const Bytes& payload) {
    const auto message = metric.decode(payload);
    EXPECT_LE(timesThePayload([&] { message->dictionaryRepresentation(); }), 45.0);
  });
}

TEST_F(PayloadMemory, ToSeeWhetherAPayloadCanBeReadTakesNone) {
  const CountedTagLines unwritten;  // as in the service
  forAll([](const MetricMessage& metric, const Bytes& payload) {
    const CountedMemory memory;
    EXPECT_TRUE(metric.isReadable(payload));
    EXPECT_EQ(memory.most(), 0U);
  });
}

// How often the heap is asked when a list of that length is read again, on a thread of its own.
std::size_t askedForTheSecondList(std::size_t length) {
  const MetricMessage& metric = *findMetricMessage(54017);
  Bytes payload;
  for (std::size_t i = 0; i < length; ++i) {
    testing::append(payload, testing::delimitedField(3, testing::hex("08011002180320f401")));
  }
  std::size_t asked = 0;
  std::thread([&] {
    const auto work = [&] {
      EXPECT_EQ(metric.describe(payload)->find("rx_info")->asList()->size(), length);
      EXPECT_TRUE(metric.decode(payload));
    };
    work();
    const CountedMemory memory;
    work();
    asked = memory.times();
  }).join();
  return asked;
}

// Beyond some hundred entries every one came from the heap and went back to it.
TEST_F(PayloadMemory, AListAsLongAsOneBeforeTakesNothingFromTheHeap) {
  if (testing::kIsSanitized) GTEST_SKIP() << "every block is the heap's";
  for (const std::size_t length : {10U, 1000U, 10'000U}) {
    EXPECT_EQ(askedForTheSecondList(length), 0U) << length;
  }
}

// The store keeps the record and the lists that screens show, and a line of text is made of it.
TEST_F(PayloadMemory, AnEventTakesAtMost150TimesItsPayload) {
  const testing::CapturedSystemLog systemLog;
  const auto validator = MetricValidator::create(nullptr);
  setStandardOutput(nullptr);
  forAll([&](const MetricMessage& metric, const Bytes& payload) {
    const Dictionary event = {{"kKeyMetricID", metric.identifier + kMetricEventBase},
                              {"kKeyPayload", payload}};
    EXPECT_LE(timesThePayload([&] { validator->processMetric(event); }), 150.0);
  });
}

}  // namespace
}  // namespace qel
