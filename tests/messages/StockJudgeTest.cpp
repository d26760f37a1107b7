// The stock protobuf runtime judges reading, writing and the dictionary form of all classes.
#include <google/protobuf/util/message_differencer.h>
#include <gtest/gtest.h>

#include <set>

#include "MessageClasses.h"
#include "RandomMessage.h"
#include "Schemas.h"
#include "StockDictionary.h"
#include "Wire.h"
#include "base/Rendering.h"
#include "messages/catalogue/MetricMessages.h"

namespace qel {
namespace {

using google::protobuf::util::MessageDifferencer;
using testing::ExactBuffer;
using testing::MessageClass;
using testing::RandomMessages;

constexpr std::uint64_t kMessagesAClass = 200;

// Calls judge(messageClass, stock message) for random messages of all classes.
template <class Judge>
void forRandomMessages(Judge&& judge) {
  for (const MessageClass& messageClass : testing::messageClasses()) {
    for (std::uint64_t number = 1; number <= kMessagesAClass; ++number) {
      const auto trace = std::string(messageClass.name) + " number " + std::to_string(number);
      SCOPED_TRACE(trace);
      judge(messageClass, *RandomMessages(number).message(messageClass.name));
      if (::testing::Test::HasFailure()) return;
    }
  }
}

TEST(AllMessageClasses, areThoseOfTheSchemas) {
  std::set<std::string> schemas;
  for (const auto* schema : testing::allSchemas()) schemas.insert(schema->name());
  std::set<std::string> classes;
  for (const MessageClass& messageClass : testing::messageClasses()) {
    classes.emplace(messageClass.name);
  }
  EXPECT_EQ(classes, schemas);
  EXPECT_EQ(testing::AllMessages::kCount, 54U);
}

TEST(AllMessageClasses, haveTheMetricOfTheirSchema) {
  std::size_t metrics = 0;
  for (const auto* schema : testing::allSchemas()) {
    SCOPED_TRACE(schema->name());
    const auto metric = testing::metricOf(*schema);
    if (!metric) continue;
    ++metrics;
    const MetricMessage* found = findMetricMessage(*metric);
    ASSERT_NE(found, nullptr);
    EXPECT_EQ(found->className, schema->name());
  }
  EXPECT_EQ(metrics, metricMessages().size());
}

TEST(StockRuntime, readsBackFieldByFieldWhatItWroteAndWeReadAndWrote) {
  forRandomMessages([](const MessageClass& messageClass, const auto& stock) {
    const ExactBuffer input(testing::serialized(stock));
    const auto ours = messageClass.decode(input.view());
    ASSERT_TRUE(ours);
    const Bytes written = ours->data();
    const auto again = testing::stockMessage(*stock.GetDescriptor());
    ASSERT_TRUE(again->ParseFromArray(written.data(), static_cast<int>(written.size())));
    std::string differences;
    MessageDifferencer differencer;
    differencer.ReportDifferencesToString(&differences);
    EXPECT_TRUE(differencer.Compare(stock, *again)) << differences;
  });
}

TEST(StockRuntime, writesTheSameBytesAsWe) {
  forRandomMessages([](const MessageClass& messageClass, const auto& stock) {
    const Bytes bytes = testing::serialized(stock);
    const auto ours = messageClass.decode(bytes);
    ASSERT_TRUE(ours);
    EXPECT_EQ(hexText(ours->data()), hexText(bytes));
  });
}

TEST(StockRuntime, holdsWhatTheDictionaryFormShows) {
  forRandomMessages([](const MessageClass& messageClass, const auto& stock) {
    const auto ours = messageClass.decode(testing::serialized(stock));
    ASSERT_TRUE(ours);
    const Dictionary expected = testing::stockDictionary(stock);
    const Dictionary shown = ours->dictionaryRepresentation();
    EXPECT_EQ(jsonText(shown), jsonText(expected)) << "the same entries in the same order";
    EXPECT_TRUE(shown == expected) << "text is no bytes";
  });
}

}  // namespace
}  // namespace qel
