// The entries of one list, read from a payload without the message around them.
#include "messages/runtime/ListReader.h"

#include <gtest/gtest.h>

#include <vector>

#include "Damage.h"
#include "OtherSenders.h"
#include "Schemas.h"
#include "Wire.h"
#include "messages/lte_serving.h"

namespace qel {
namespace {

using Measurement = KCellularLteServingCellMeasurement;
using testing::RandomMessages;

void expectTheListOfTheMessage(const Bytes& bytes) {
  const testing::ExactBuffer exact(bytes);
  std::vector<RxInfo> entries;
  const bool isThere = readList<Measurement, RxInfo>(
      exact.view(), [&entries](const RxInfo& entry) { entries.push_back(entry); });
  const auto message = Measurement::initWithData(exact.view());
  ASSERT_EQ(isThere, message != nullptr) << hexText(bytes);
  if (!message) return;
  ASSERT_EQ(entries.size(), message->rxInfos().size()) << hexText(bytes);
  for (std::size_t i = 0; i < entries.size(); ++i) {
    EXPECT_TRUE(entries[i].isEqual(*message->rxInfos()[i])) << hexText(bytes);
  }
}

TEST(ListReading, givesTheEntriesThatTheMessageHas) {
  const auto& schema = testing::schemaOf(Measurement::kClassName);
  for (std::uint64_t number = 1; number <= 50; ++number) {
    RandomMessages random(number);
    const Bytes whole = random.encoded(Measurement::kClassName);
    expectTheListOfTheMessage(whole);
    expectTheListOfTheMessage(testing::shuffled(random, schema, whole));
    expectTheListOfTheMessage(testing::doubled(random, schema, whole));
    expectTheListOfTheMessage(testing::fromTheFuture(random, schema, whole));
    for (int i = 0; i < 20; ++i) expectTheListOfTheMessage(testing::damaged(random, whole));
  }
}

TEST(ListReading, leavesTheRestOfAnEntryThatEndsEarlyToTheMessage) {
  expectTheListOfTheMessage({0x1A, 0x06, 0x10, 0x07, 0x0C, 0x10, 0x01, 0x0C, 0x1A, 0x00});
}

TEST(ListReading, findsNoneInNoBytes) { expectTheListOfTheMessage({}); }

}  // namespace
}  // namespace qel
