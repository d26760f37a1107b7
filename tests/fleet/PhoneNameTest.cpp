#include "fleet/PhoneName.h"

#include <gtest/gtest.h>

#include <fstream>

#include "fleet/Folder.h"

namespace qel::fleet {
namespace {

TEST(PhoneName, isAPartOfATopic) {
  for (const char* name : {"a", "phone-3f", "Lab_2.east", "1234567890123"}) {
    EXPECT_EQ(faultOfPhoneName(name), "") << name;
  }
  for (const char* name : {"", "a/b", "#", "+", "a b", "ä", "a\n", "$SYS"}) {
    EXPECT_NE(faultOfPhoneName(name), "") << name;
  }
  EXPECT_EQ(faultOfPhoneName(std::string(64, 'a')), "");
  EXPECT_NE(faultOfPhoneName(std::string(65, 'a')), "");
}

TEST(PhoneName, isNoIdentity) {
  for (const char* name : {"352099001761481", "35-209900-176148-1", "imei-352099001761481",
                           "001010123456789.lab", "35209900176148"}) {
    EXPECT_NE(faultOfPhoneName(name), "") << name;
  }
}

TEST(PhoneName, isMadeByChanceAndKept) {
  const testing::Folder one;
  const testing::Folder other;
  std::string error;
  const auto name = keptPhoneName(one.path(), error);
  ASSERT_TRUE(name) << error;
  EXPECT_EQ(faultOfPhoneName(*name), "");
  EXPECT_EQ(keptPhoneName(one.path(), error), name);
  EXPECT_NE(keptPhoneName(other.path(), error), name);
}

TEST(PhoneName, isNotTakenFromAFileThatHasNone) {
  const testing::Folder folder;
  std::ofstream(folder.path() + "/phone") << "two words\n";
  std::string error;
  EXPECT_FALSE(keptPhoneName(folder.path(), error));
  EXPECT_TRUE(error.starts_with(folder.path() + "/phone: ")) << error;
  EXPECT_FALSE(keptPhoneName("/nonexistent", error));
}

}  // namespace
}  // namespace qel::fleet
