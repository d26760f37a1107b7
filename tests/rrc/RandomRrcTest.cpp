// Random messages of LTE's schema, made by an encoder that shares nothing with the reader.

#include <gtest/gtest.h>

#include <set>

#include "rrc/RandomRrc.h"
#include "rrc/SchemaFiles.h"
#include "rrc/reader/Walker.h"

namespace qel::testing {
namespace {

using rrc::generator::Tables;

void expectReadAsWritten(bool foreign) {
  const Tables& tables = lteTables();
  RandomRrc random(tables, {.seed = 7, .foreign = foreign});
  for (int i = 0; i < 300; ++i) {
    for (const auto& [name, type] : tables.messages) {
      const RandomRrcMessage message = random.message(type);
      const rrc::Schema schema = tables.schema();
      const auto reading = rrc::walk(schema, type, message.pdu);
      ASSERT_TRUE(reading) << name << ' ' << hexText(message.pdu);
      ASSERT_EQ(tokensOf(*reading, tables), message.tokens) << name << ' ' << hexText(message.pdu);
    }
  }
}

TEST(RandomRrcMessages, areReadAsTheyWereWritten) { expectReadAsWritten(false); }

TEST(RandomRrcMessages, areReadPastAdditionsThatTheSchemaDoesNotKnow) { expectReadAsWritten(true); }

TEST(RandomRrcMessages, reachEveryFieldThatIsRead) {
  const Tables& tables = lteTables();
  const rrc::Schema schema = tables.schema();
  std::set<rrc::Mark> reached;
  RandomRrc random(tables, {.seed = 11});
  for (int i = 0; i < 4000; ++i) {
    for (const auto& [name, type] : tables.messages) {
      const Bytes pdu = random.message(type).pdu;
      const auto reading = rrc::walk(schema, type, pdu);
      ASSERT_TRUE(reading);
      for (const rrc::Found& found : reading->found) reached.insert(found.mark);
    }
  }
  int read = 0;
  for (const rrc::Type& type : tables.types) {
    if (type.kind != rrc::Kind::sequence && type.kind != rrc::Kind::choice) continue;
    for (std::size_t i = 0; i < std::size_t{type.count} + type.additions; ++i) {
      if (!random.mayChoose(type, i)) continue;
      ++read;
      EXPECT_TRUE(reached.contains(tables.fields[type.first + i].mark))
          << tables.fieldNames[type.first + i];
    }
  }
  EXPECT_GT(read, 800);
  RecordProperty("fields", read);
}

}  // namespace
}  // namespace qel::testing
