// Random messages of LTE's schema, made by an encoder that shares nothing with the reader.

#include <gtest/gtest.h>

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

}  // namespace
}  // namespace qel::testing
