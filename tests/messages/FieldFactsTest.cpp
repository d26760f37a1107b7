#include "messages/catalogue/FieldFacts.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <set>

#include "messages/Schemas.h"
#include "messages/catalogue/KBBMetricUtility.h"

namespace qel {
namespace {

using google::protobuf::Descriptor;
using google::protobuf::FieldDescriptor;

TEST(FieldFacts, areThoseOfEveryFieldOfEverySchema) {
  const auto schemas = testing::allSchemas();
  ASSERT_EQ(messageFacts().size(), schemas.size());
  for (const Descriptor* schema : schemas) {
    const MessageFacts* message = findMessageFacts(schema->name());
    ASSERT_TRUE(message) << schema->name();
    EXPECT_EQ(message->metric, testing::metricOf(*schema).value_or(0)) << schema->name();
    ASSERT_EQ(message->fields.size(), static_cast<std::size_t>(schema->field_count()));
    for (int i = 0; i < schema->field_count(); ++i) {
      const FieldDescriptor& field = *schema->field(i);
      const FieldFacts& facts = message->fields[static_cast<std::size_t>(i)];
      EXPECT_EQ(message->find(field.name()), &facts) << field.full_name();
      EXPECT_EQ(facts.number, static_cast<std::uint32_t>(field.number())) << field.full_name();
      EXPECT_EQ(facts.repeated, field.is_repeated()) << field.full_name();
      EXPECT_EQ(facts.holds, field.message_type() ? field.message_type()->name() : "");
      EXPECT_EQ(facts.values.empty(), field.enum_type() == nullptr) << field.full_name();
    }
  }
}

TEST(FieldFacts, haveALabelAndAMeaningForEveryField) {
  for (const MessageFacts& message : messageFacts()) {
    EXPECT_FALSE(message.meaning.empty()) << message.name;
    std::set<std::string_view> labels;
    for (const FieldFacts& field : message.fields) {
      EXPECT_FALSE(field.label.empty()) << message.name << '.' << field.key;
      EXPECT_TRUE(labels.insert(field.label).second) << message.name << ": " << field.label;
      EXPECT_FALSE(field.meaning.empty()) << message.name << '.' << field.key;
      const bool inTheSentence = field.meaning.ends_with("27.007, clause 10.1.1.");
      EXPECT_EQ(field.meaning.find("clause") != std::string_view::npos, inTheSentence)
          << message.name << '.' << field.key;
      EXPECT_TRUE(field.holds.empty() || findMessageFacts(field.holds)) << field.holds;
    }
  }
}

TEST(FieldFacts, haveRangesThatAreNotEmpty) {
  for (const MessageFacts& message : messageFacts()) {
    for (const FieldFacts& field : message.fields) {
      if (field.least && field.most) {
        EXPECT_LT(*field.least, *field.most) << message.name << '.' << field.key;
      }
      EXPECT_EQ(field.range.empty(), !field.least && !field.most) << field.key;
    }
  }
}

TEST(FieldFacts, sayWhatTheSchemaSays) {
  const FieldFacts& rsrp = *findMessageFacts("EgwErrcNbrEutraMeas")->find("nbr_rsrp");
  EXPECT_EQ(rsrp.label, "RSRP");
  EXPECT_EQ(rsrp.unit, "dBm");
  EXPECT_EQ(rsrp.raw, "dBm + 140");
  EXPECT_EQ(rsrp.range, "-140 to -43 dBm");
  EXPECT_EQ(rsrp.clause, "36.133, clause 9.1.4");
  EXPECT_EQ(rsrp.meaning, "RSRP as the reported index: dBm + 140, 0 to 97.");
  ASSERT_TRUE(rsrp.quality);
  EXPECT_EQ(rsrp.quality->name, "RSRP");
  EXPECT_FALSE(rsrp.identifies);

  const FieldFacts& channel = *findMessageFacts("EgwErrcNbrEutraMeas")->find("nbr_earfcn");
  EXPECT_EQ(channel.form, FieldForm::earfcn);
  EXPECT_TRUE(channel.identifies);
  EXPECT_FALSE(channel.quality);
}

TEST(FieldFacts, takeTheClauseOfTheirTypeOrMessageWhereTheyNameNone) {
  const FieldFacts& cause = *findMessageFacts("KCellularEmmContext")->find("reject_cause");
  EXPECT_EQ(cause.clause, "24.301, clause 9.9.3.9");
  const FieldFacts& area = *findMessageFacts("KCellularTrackingAreaId")->find("tac");
  EXPECT_EQ(area.clause, "23.003, clause 19.4.2.3");
}

TEST(FieldFacts, knowTheValuesOfAnEnumeration) {
  const FieldFacts& state = *findMessageFacts("KCellularLteRrcState")->find("state");
  const auto connected = std::ranges::find(state.values, 3, &ValueMeaning::value);
  ASSERT_NE(connected, state.values.end());
  EXPECT_EQ(connected->name, "KLTE_RRC_STATE_CONNECTED");
  EXPECT_EQ(connected->meaning, "connected");
}

TEST(MessageFacts, areFoundByTheirMetric) {
  EXPECT_EQ(findPayloadFacts(19972)->name, "KCellularLteRrcState");
  EXPECT_FALSE(findPayloadFacts(0));
  EXPECT_FALSE(findPayloadFacts(1));
  EXPECT_FALSE(findMessageFacts("Nothing"));
}

}  // namespace
}  // namespace qel
