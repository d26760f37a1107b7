#include "fleet/Login.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include "recording/TemporaryFile.h"

namespace qel::fleet {
namespace {

using qel::testing::TemporaryFile;

std::string faultOf(const std::string& content) {
  const TemporaryFile file("", content);
  std::string error;
  EXPECT_FALSE(readLogin(file.path(), error)) << content;
  EXPECT_TRUE(error.starts_with(file.path())) << error;
  return error.substr(file.path().size());
}

TEST(Login, isAUserAndAPassword) {
  const TemporaryFile file("", "user me\n\npassword  with spaces \n");
  std::string error;
  const auto login = readLogin(file.path(), error);
  ASSERT_TRUE(login) << error;
  EXPECT_EQ(login->user, "me");
  EXPECT_EQ(login->password, " with spaces ");
}

TEST(Login, mayHaveNoPassword) {
  const TemporaryFile file("", "user me");
  std::string error;
  const auto login = readLogin(file.path(), error);
  ASSERT_TRUE(login) << error;
  EXPECT_EQ(login->password, "");
}

TEST(Login, isRefusedByItsLine) {
  EXPECT_EQ(faultOf(""), ": names no user");
  EXPECT_EQ(faultOf("password a\n"), ": names no user");
  const std::string why = ": neither \"user NAME\" nor \"password TEXT\"";
  EXPECT_EQ(faultOf("user me\nsecret a\n"), ", line 2" + why);
  EXPECT_EQ(faultOf("user \n"), ", line 1" + why);
  EXPECT_EQ(faultOf("user me\nuser you\n"), ", line 2" + why);
  EXPECT_EQ(faultOf("user " + std::string(5000, 'a')), ": longer than 4096 bytes");
}

TEST(Login, isNotReadWhenOthersCould) {
  const TemporaryFile file("", "user me\n");
  for (const mode_t mode : {0640U, 0604U, 0620U}) {
    ASSERT_EQ(::chmod(file.path().c_str(), mode), 0);
    std::string error;
    EXPECT_FALSE(readLogin(file.path(), error));
    EXPECT_EQ(error, file.path() + ": others may read it (chmod 600 changes that)");
  }
}

TEST(Login, isNoFolder) {
  std::string error;
  EXPECT_FALSE(readLogin("/proc/self/task/none", error));
  EXPECT_EQ(error, "/proc/self/task/none: No such file or directory");
}

}  // namespace
}  // namespace qel::fleet
