#include "recording/privacy/IdentityHider.h"

#include <gtest/gtest.h>

#include <algorithm>

#include "messages/FieldAccess.h"
#include "messages/MessageClasses.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "recording/privacy/IdentityTable.h"

namespace qel::testing {
namespace {

constexpr SipKey kKey = {7, 7, 7};

bool isIdentity(std::string_view messageClass, std::string_view field) {
  return std::ranges::any_of(identityFields(), [&](const IdentityField& row) {
    return row.messageClass == messageClass && row.field == field;
  });
}

// A message with every number, byte string and nested message of its class present.
template <class Message>
std::shared_ptr<Message> filled();

template <class Message, class T, Encoding encoding>
void fillField(Message& message, const ScalarField<Message, T, encoding>& field) {
  message.*field.member = static_cast<T>(1 + field.number);
  Presence::set(message, field.presenceBit, true);
}
template <class Message>
void fillField(Message& message, const DataField<Message>& field) {
  message.*field.member = Bytes{8, 0x29, 0x26, 0x24, 0x10, 0x32, 0x54, 0x76, 0x98};
}
template <class Message, class Nested>
void fillField(Message& message, const MessageField<Message, Nested>& field) {
  message.*field.member = filled<Nested>();
}
template <class Message, class Nested>
void fillField(Message& message, const RepeatedMessageField<Message, Nested>& field) {
  message.*field.member = qel::MessageList<Nested>(2, filled<Nested>());
}
template <class Message, class Field>
void fillField(Message&, const Field&) {}

template <class Message>
std::shared_ptr<Message> filled() {
  auto message = std::make_shared<Message>();
  forEachField<Message>([&](const auto& field) { fillField(*message, field); });
  return message;
}

// Counts the identities found, and wants all of them changed and everything else as it was.
template <class Message>
void compare(const Message& before, const Message& after, std::size_t& identities) {
  forEachField<Message>([&](const auto& field) {
    using Field = std::remove_cvref_t<decltype(field)>;
    const auto& old = before.*field.member;
    const auto& now = after.*field.member;
    SCOPED_TRACE(std::string(Message::kClassName) + "." + std::string(field.key));
    ASSERT_EQ(isPresent(before, field), isPresent(after, field));
    if constexpr (kIsMessage<Field>) {
      if (old) compare(*old, *now, identities);
    } else if constexpr (kIsMessageList<Field>) {
      ASSERT_EQ(old.size(), now.size());
      for (std::size_t i = 0; i < old.size(); ++i) compare(*old[i], *now[i], identities);
    } else if constexpr (kIsPacked<Field>) {
      EXPECT_EQ(old.values, now.values);
    } else if (isIdentity(Message::kClassName, field.key)) {
      ++identities;
      EXPECT_NE(old, now);
    } else {
      EXPECT_EQ(old, now);
    }
  });
}

RecordedEvent metricEvent(std::uint32_t metric, Bytes payload) {
  return {1,
          RecordedKind::metric,
          {{"kKeyMetricID", std::int64_t{metric} + kMetricEventBase},
           {"kKeyProfileID", std::int64_t{0}},
           {"kKeyPayload", std::move(payload)}}};
}

const Bytes& payloadOf(const RecordedEvent& event) {
  return *event.entries.find("kKeyPayload")->asBytes();
}

TEST(IdentityTable, namesFieldsThatThereAre) {
  for (const IdentityField& row : identityFields()) {
    bool found = false;
    AllMessages::forEach([&]<class Message>() {
      forEachField<Message>([&](const auto& field) {
        found = found || (Message::kClassName == row.messageClass && field.key == row.field);
      });
    });
    EXPECT_TRUE(found) << row.messageClass << "." << row.field;
  }
}

TEST(IdentityHider, changesEveryIdentityOfEveryMetricAndNothingElse) {
  std::size_t metrics = 0;
  std::size_t identities = 0;
  AllMessages::forEach([&]<class Message>() {
    const auto messages = metricMessages();
    const auto metric = std::ranges::find(messages, Message::kClassName, &MetricMessage::className);
    if (metric == messages.end()) return;
    ++metrics;
    const Bytes payload = filled<Message>()->data();
    RecordedEvent event = metricEvent(metric->identifier, payload);
    ASSERT_TRUE(IdentityHider(Pseudonyms(kKey)).hide(event));
    const auto before = Message::initWithData(payload);
    const auto after = Message::initWithData(payloadOf(event));
    ASSERT_TRUE(before && after);
    compare(*before, *after, identities);
  });
  EXPECT_EQ(metrics, 30U);
  // IMSI, TMSI, P-TMSI, M-TMSI, two SIM files, two bearers with three addresses.
  EXPECT_EQ(identities, 12U);
}

TEST(IdentityHider, keepsEqualValuesEqual) {
  IdentityHider hider(Pseudonyms::random());
  const Bytes payload = filled<KCellularMmCommonInfo>()->data();
  RecordedEvent first = metricEvent(54537, payload);
  RecordedEvent second = metricEvent(54537, payload);
  ASSERT_TRUE(hider.hide(first));
  ASSERT_TRUE(hider.hide(second));
  EXPECT_EQ(first.entries, second.entries);
  RecordedEvent other = metricEvent(54537, payload);
  ASSERT_TRUE(IdentityHider(Pseudonyms::random()).hide(other));
  EXPECT_NE(payloadOf(first), payloadOf(other));
}

TEST(IdentityHider, refusesWhatCannotBeDecoded) {
  IdentityHider hider(Pseudonyms{kKey});
  for (const std::uint32_t metric : {54537U, 19972U}) {
    RecordedEvent event = metricEvent(metric, {0x08});
    EXPECT_FALSE(hider.hide(event)) << metric;
  }
  EXPECT_EQ(hider.undecodable(), 2U);
}

TEST(IdentityHider, leavesOutFieldsThatNoSchemaKnows) {
  IdentityHider hider(Pseudonyms{kKey});
  for (const std::uint32_t metric : {54538U, 19972U}) {
    // Field 1, then field 100 with three bytes.
    RecordedEvent event = metricEvent(metric, {0x08, 0x05, 0xA2, 0x06, 0x03, 'a', 'b', 'c'});
    ASSERT_TRUE(hider.hide(event));
    EXPECT_EQ(payloadOf(event), (Bytes{0x08, 0x05})) << metric;
  }
}

TEST(IdentityHider, leavesOutPayloadsWithoutAMessageClass) {
  IdentityHider hider(Pseudonyms{kKey});
  RecordedEvent failure = metricEvent(20005, {1, 2, 3});
  ASSERT_TRUE(hider.hide(failure));
  EXPECT_FALSE(failure.entries.contains("kKeyPayload"));
  EXPECT_TRUE(failure.entries.contains("kKeyMetricID"));
  RecordedEvent trigger{
      1, RecordedKind::trigger, {{"kKeyTriggerID", 5}, {"kKeyPayload", Bytes{1}}}};
  ASSERT_TRUE(hider.hide(trigger));
  EXPECT_EQ(trigger.entries, (Dictionary{{"kKeyTriggerID", 5}}));
  EXPECT_EQ(hider.stripped(), 2U);
}

TEST(IdentityHider, leavesOutTextAndBytesUnderOtherKeys) {
  IdentityHider hider(Pseudonyms{kKey});
  RecordedEvent event = metricEvent(19972, {0x10, 0x03});
  const Dictionary harmless = event.entries;
  event.entries.append("who", "001010123456789");
  event.entries.append("raw", Bytes{1, 2});
  event.entries.append("list", List{Value(1)});
  ASSERT_TRUE(hider.hide(event));
  EXPECT_EQ(event.entries, harmless);
  EXPECT_EQ(hider.stripped(), 1U);
}

TEST(IdentityHider, leavesOrdinaryEventsAsTheyAre) {
  IdentityHider hider(Pseudonyms{kKey});
  RecordedEvent metric = metricEvent(19972, {0x08, 0x05, 0x10, 0x03});
  const Dictionary before = metric.entries;
  ASSERT_TRUE(hider.hide(metric));
  EXPECT_EQ(metric.entries, before);
  RecordedEvent trigger{1, RecordedKind::trigger, {{"kKeyTriggerID", std::int64_t{8323091}}}};
  ASSERT_TRUE(hider.hide(trigger));
  EXPECT_EQ(trigger.entries.size(), 1U);
  EXPECT_EQ(hider.stripped() + hider.undecodable(), 0U);
}

}  // namespace
}  // namespace qel::testing
