#include "service/ClientName.h"

#include <gtest/gtest.h>

#include <string>

namespace qel::service {
namespace {

TEST(ClientNameTest, TakesPrintableTextOfAnyScript) {
  for (const char* name : {"qelwatch", "a", "my viewer 2", "\xC3\xA9t\xC3\xA9", "\xE6\x89\x8B"}) {
    EXPECT_EQ(faultOfClientName(name), "") << name;
  }
  EXPECT_EQ(faultOfClientName(std::string(64, 'n')), "");
}

// Eight megabytes of name were taken, kept for ever and shown to every client.
TEST(ClientNameTest, RefusesALongName) {
  EXPECT_EQ(faultOfClientName(std::string(65, 'n')), "the client name is longer than 64 bytes");
  EXPECT_NE(faultOfClientName(std::string(8'000'000, 'n')), "");
}

TEST(ClientNameTest, RefusesAnEmptyName) {
  EXPECT_EQ(faultOfClientName(""), "the client name is empty");
}

// They are escaped where a name is shown.
TEST(ClientNameTest, TakesCharactersThatATerminalObeys) {
  for (const char* name : {"a\nb", "\x1B[2J", "\xC2\x9B", "\xE2\x80\xAE"}) {
    EXPECT_EQ(faultOfClientName(name), "") << name;
  }
}

TEST(ClientNameTest, RefusesWhatIsNoText) {
  EXPECT_EQ(faultOfClientName("\xFF"), "the client name is not UTF-8");
  EXPECT_EQ(faultOfClientName("\xE2\x80"), "the client name is not UTF-8");
}

}  // namespace
}  // namespace qel::service
