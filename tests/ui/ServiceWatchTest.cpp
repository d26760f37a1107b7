// The start of a viewer whose service is there late, refuses or goes away, and what the reader is
// told.

#include "app/ServiceWatch.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <filesystem>
#include <fstream>

#include "tesk/Constants.h"
#include "tesk/bus/Reasons.h"
#include "ui/Window.h"
#include "ui/kit/ResourceBundle.h"

namespace qel {
namespace {

using testing::Window;
namespace fs = std::filesystem;

class ServiceWatchTest : public ::testing::Test {
 protected:
  ~ServiceWatchTest() override { fs::remove_all(folder); }

  void shipResource() const {
    fs::create_directories(folder);
    std::ofstream(folder / "orb_test_lte.deviceconfig") << "configuration";
    ResourceBundle::setMain(std::make_shared<DirectoryBundle>(folder.string()));
  }

  void answer(std::int32_t code) const {
    service->answer = [code](std::string_view) { return tesk::CommandResult{code, "as told"}; };
  }

  void openWindow() {
    window = std::make_unique<Window>(false, service);
    watch->showIn(window->navigation());
    window->settle();
  }

  void tell(bool reachable, std::string_view why = "") const {
    watch->observer()(reachable, std::string(why));
    for (int i = 0; i < 3; ++i) window->settle();
  }

  std::ptrdiff_t times(std::string_view command) const {
    return std::ranges::count(service->commands, command, &testing::FakeService::Command::name);
  }

  fs::path folder =
      fs::path(::testing::TempDir()) / ("qelwatch_service_watch_test" + std::to_string(::getpid()));
  std::shared_ptr<testing::FakeService> service = testing::installFakeService();
  std::shared_ptr<ServiceWatch> watch = std::make_shared<ServiceWatch>();
  std::unique_ptr<Window> window;
};

TEST_F(ServiceWatchTest, aStartThatFoundNoServiceIsMadeOnceItIsThereAndNeverAgain) {
  shipResource();
  answer(tesk::kServiceUnreachable);
  openWindow();
  tell(false, tesk::bus::kNotThere);
  EXPECT_EQ(times(tesk::kCommandAddConfiguration), 1);
  answer(0);
  tell(true);
  EXPECT_EQ(times(tesk::kCommandAddConfiguration), 2);
  EXPECT_EQ(times(tesk::kCommandQueryMetric), 1);
  for (int i = 0; i < 3; ++i) {
    tell(false, tesk::bus::kNotThere);
    tell(true);
  }
  EXPECT_EQ(times(tesk::kCommandClearConfiguration), 2);
  EXPECT_EQ(times(tesk::kCommandAddConfiguration), 2);
}

// Each return of the service installed again what it had refused.
TEST_F(ServiceWatchTest, aRefusedInstallationIsNotMadeAgain) {
  shipResource();
  answer(7);
  openWindow();
  for (int i = 0; i < 3; ++i) {
    tell(true);
    tell(false, tesk::bus::kNotThere);
  }
  EXPECT_EQ(times(tesk::kCommandClearConfiguration), 1);
  EXPECT_EQ(times(tesk::kCommandAddConfiguration), 1);
}

TEST_F(ServiceWatchTest, anInstallationThatIsRefusedLaterIsNotMadeAgainEither) {
  shipResource();
  answer(tesk::kServiceUnreachable);
  openWindow();
  answer(7);
  tell(true);
  tell(false, tesk::bus::kNotThere);
  tell(true);
  EXPECT_EQ(times(tesk::kCommandAddConfiguration), 2);
}

// Each return of the service cleared the configuration once more.
TEST_F(ServiceWatchTest, aStartWithoutItsConfigurationFileIsNotMadeAgain) {
  answer(tesk::kServiceUnreachable);
  openWindow();
  answer(0);
  for (int i = 0; i < 3; ++i) {
    tell(true);
    tell(false, tesk::bus::kNotThere);
  }
  EXPECT_EQ(times(tesk::kCommandClearConfiguration), 1);
  EXPECT_EQ(times(tesk::kCommandAddConfiguration), 0);
}

TEST_F(ServiceWatchTest, aServiceThatComesWhileTheStartIsUnderWayIsNotMissed) {
  shipResource();
  openWindow();  // made, with the answer 0
  const auto root = std::make_shared<RootNavigationController>();
  service->commands.clear();
  int asked = 0;
  service->answer = [&](std::string_view) {
    if (++asked == 2) root->comeIntoService();  // as the event loop would while a command waits
    return tesk::CommandResult{asked <= 2 ? tesk::kServiceUnreachable : 0, ""};
  };
  root->loadViewIfNeeded();
  EXPECT_EQ(times(tesk::kCommandAddConfiguration), 2);
  EXPECT_EQ(times(tesk::kCommandQueryMetric), 1);
}

// Whatever the reason was, the reader was told the same.
TEST_F(ServiceWatchTest, everyReasonHasItsOwnNotice) {
  answer(tesk::kServiceUnreachable);
  openWindow();
  const auto noticeFor = [this](std::string_view why) {
    tell(false, why);
    return window->navigation().notice().toStdString();
  };
  EXPECT_EQ(noticeFor(tesk::bus::kNotThere),
            "Baseband manager not reachable: it is not installed. Install the package basebandd.");
  EXPECT_EQ(noticeFor(tesk::bus::kNotStarted),
            "Baseband manager not running: it could not be started. Its log says why: journalctl "
            "-u basebandd");
  EXPECT_EQ(noticeFor(tesk::bus::kNoPermission),
            "Baseband manager not reachable: no permission. Members of the group baseband have "
            "it: join it, then log in again.");
  EXPECT_EQ(noticeFor(tesk::bus::kTooManyClients),
            "Baseband manager has too many clients: waiting for a place.");
  EXPECT_EQ(noticeFor(tesk::bus::kNoAnswer), "Baseband manager does not answer");
  EXPECT_EQ(noticeFor(tesk::bus::kNoBus),
            "Baseband manager not reachable: there is no message bus.");
  tell(true);
  EXPECT_EQ(window->navigation().notice(), QString());
  tell(false, tesk::bus::kNoAnswer);
  EXPECT_TRUE(window->navigation().notice().startsWith("Baseband manager does not answer since "));
}

// On any other bus than the system's nothing starts the service by itself.
TEST_F(ServiceWatchTest, aBusWithoutTheServiceIsNotCalledAMissingPackage) {
  watch = std::make_shared<ServiceWatch>("session");
  openWindow();
  tell(false, tesk::bus::kNotThere);
  EXPECT_EQ(window->navigation().notice(),
            QStringLiteral("Baseband manager not reachable: it is not running on this bus. Start "
                           "basebandd there."));
}

// A service that was too busy was said to be not reachable.
TEST_F(ServiceWatchTest, aBusyServiceIsCalledBusy) {
  openWindow();
  tell(false, tesk::bus::kBusy);
  EXPECT_EQ(window->navigation().notice(), QStringLiteral("Baseband manager is busy"));
}

TEST_F(ServiceWatchTest, whatIsLeftOutStandsAtTheFootOfTheFirstScreen) {
  openWindow();
  window->navigation().setLoss(QStringLiteral("1,204 reports left out"));
  window->settle();
  EXPECT_TRUE(window->shows("1,204 reports left out"));
  EXPECT_EQ(window->warnings(), 0);
}

}  // namespace
}  // namespace qel
