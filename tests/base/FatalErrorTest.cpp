#include "base/FatalError.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <csignal>

namespace qel {
namespace {

TEST(FatalErrorDeathTest, saysWhyInOneLineAndAborts) {
  EXPECT_EXIT(fatalError("the reason"), ::testing::KilledBySignal(SIGABRT),
              "^fatal error: the reason\n$");
}

TEST(FatalErrorDeathTest, runsItsHandlersFirst) {
  const auto fail = [] {
    atFatalError([] {
      const ssize_t written = ::write(STDERR_FILENO, "saved; ", 7);
      static_cast<void>(written);
    });
    fatalError("the reason");
  };
  EXPECT_EXIT(fail(), ::testing::KilledBySignal(SIGABRT), "^saved; fatal error: the reason\n$");
}

}  // namespace
}  // namespace qel
