// The text that names a modem of ModemManager as the source.
#include <gmock/gmock.h>

#include "sources/SourceChoice.h"

namespace qel {
namespace {

using namespace sources;
using ::testing::HasSubstr;

ModemManagerChoice choiceOf(std::string_view text) {
  SourceError error;
  const auto choice = parseSourceChoice(text, error);
  if (choice && std::holds_alternative<ModemManagerChoice>(*choice)) {
    return std::get<ModemManagerChoice>(*choice);
  }
  ADD_FAILURE() << text << ": " << error.message;
  return {};
}

TEST(ModemManagerChoice, TakesTheFirstModemOfTheSystemBusByItself) {
  const auto choice = choiceOf("modem-manager");
  EXPECT_EQ(choice.imei, "");
  EXPECT_EQ(choice.path, "");
  EXPECT_EQ(choice.bus, "system");
}

TEST(ModemManagerChoice, NamesAModemByImeiOrPathAndABus) {
  EXPECT_EQ(choiceOf("modem-manager:350000000000011").imei, "350000000000011");
  EXPECT_EQ(choiceOf("modem-manager:3500000000000112").imei, "3500000000000112");
  EXPECT_EQ(choiceOf("modem-manager:/org/freedesktop/ModemManager1/Modem/3").path,
            "/org/freedesktop/ModemManager1/Modem/3");
  EXPECT_EQ(choiceOf("modem-manager,bus=session").bus, "session");
  const auto all = choiceOf("modem-manager:/a/b_1,bus=unix:path=/run/x,guid=1f");
  EXPECT_EQ(all.path, "/a/b_1");
  EXPECT_EQ(all.bus, "unix:path=/run/x,guid=1f");
}

TEST(ModemManagerChoice, ThatMakesNoSenseIsWrongUsageAndNamed) {
  const std::pair<const char*, const char*> bad[] = {
      {"modem-managerx", "unknown source"},
      {"modem-manager:", "bad modem \":\""},
      {"modem-manager:12345678901234", "bad modem"},
      {"modem-manager:35000000000001a", "bad modem"},
      {"modem-manager:/", "bad modem"},
      {"modem-manager:/a//b", "bad modem"},
      {"modem-manager:/a/", "bad modem"},
      {"modem-manager:/a-b", "bad modem"},
      {"modem-manager,rate=5", "bad modem \",rate=5\""},
      {"modem-manager,bus=", "no bus named"},
  };
  for (const auto& [text, reason] : bad) {
    SourceError error;
    EXPECT_FALSE(parseSourceChoice(text, error)) << text;
    EXPECT_EQ(error.exitCode, 64) << text;
    EXPECT_THAT(error.message, HasSubstr(reason));
  }
}

TEST(ModemManagerChoice, MakesASourceBeforeThereIsABus) {
  SourceError error;
  const auto choice =
      parseSourceChoice("modem-manager:350000000000011,bus=unix:path=/nowhere/at/all", error);
  ASSERT_TRUE(choice);
  const auto source = makeSource(*choice, error);
  ASSERT_TRUE(source);
  EXPECT_EQ(source->description(), "modem 350000000000011 of ModemManager");
}

}  // namespace
}  // namespace qel
