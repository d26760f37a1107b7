#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

#include "base/Rendering.h"
#include "support/FakeTransport.h"
#include "support/RecordingSink.h"
#include "tesk/Constants.h"
#include "ui/kit/ResourceBundle.h"
#include "ui/screens/AppDelegate.h"
#include "ui/screens/AppIDValidator.h"
#include "ui/screens/RootNavigationController.h"

namespace qel {
namespace {

using Strings = std::vector<std::string>;

// Writes the lines of standard output among the calls of the service.
class LineAmongCalls final : public LogSink {
 public:
  explicit LineAmongCalls(std::shared_ptr<testing::FakeService> service)
      : _service(std::move(service)) {}
  void write(std::string_view line) override {
    _service->calls.push_back("> " + std::string(line));
  }

 private:
  std::shared_ptr<testing::FakeService> _service;
};

class StartUp : public ::testing::Test {
 protected:
  StartUp() { setStandardOutput(std::make_shared<LineAmongCalls>(service)); }
  ~StartUp() override {
    setStandardOutput(nullptr);
    std::filesystem::remove_all(folder);
  }

  void shipResource() const {
    std::filesystem::create_directories(folder);
    std::ofstream(folder / "orb_test_lte.deviceconfig") << "configuration";
    ResourceBundle::setMain(std::make_shared<DirectoryBundle>(folder.string()));
  }

  void refuseInstall() const {
    service->answer = [](std::string_view command) {
      return tesk::CommandResult{command == tesk::kCommandAddConfiguration ? 7 : 0, "refused"};
    };
  }

  std::filesystem::path folder = std::filesystem::path(::testing::TempDir()) /
                                 ("qelwatch_start_up_test" + std::to_string(::getpid()));
  testing::CapturedSystemLog log;
  std::shared_ptr<testing::FakeService> service = testing::installFakeService();
};

TEST_F(StartUp, theDelegateSaysYesAndHasNoWindow) {
  AppDelegate delegate;
  EXPECT_TRUE(delegate.didFinishLaunchingWithOptions());
  EXPECT_EQ(delegate.window, nullptr);
  EXPECT_TRUE(service->clients.empty()) << "nothing connects before the first screen";
}

TEST_F(StartUp, theRootHasItsNamesBeforeItsViewLoads) {
  const RootNavigationController root;
  EXPECT_EQ(root.myAppID, "qelwatch");
  EXPECT_EQ(root.metricFileName, "orb_test_lte");
  EXPECT_EQ(root.metricFileType, "deviceconfig");
  EXPECT_EQ(root.myTeskWrapper, TeskWrapper::sharedInstance());
  EXPECT_EQ(root.myMetricValidator, MetricValidator::shared());
}

TEST_F(StartUp, creatingTheRootConnectsAndListens) {
  const RootNavigationController root;
  EXPECT_EQ(service->clients, Strings{"qelwatch"});
  EXPECT_EQ(service->calls, (Strings{"off", "on"}));
  EXPECT_EQ(TeskWrapper::sharedInstance()->delegate(), MetricValidator::shared());
}

TEST_F(StartUp, clearsInstallsListensAndQueriesInThisOrder) {
  shipResource();
  const auto root = std::make_shared<RootNavigationController>();
  service->calls.clear();
  root->loadViewIfNeeded();
  EXPECT_EQ(service->calls, (Strings{"kCommandClearConfiguration", "> pushing metric file",
                                     "kCommandAddConfiguration", "off", "on",
                                     "> Querying SIM files", "kCommandQueryMetric"}));
}

TEST_F(StartUp, asksForTheSIMFilesWithFixedNumbers) {
  shipResource();
  const auto root = std::make_shared<RootNavigationController>();
  root->loadViewIfNeeded();
  ASSERT_EQ(service->commands.size(), 3U);
  const Dictionary& query = service->commands[2].request;
  EXPECT_EQ(*query.find("kKeyTriggerRef"), Value(9999));
  EXPECT_EQ(*query.find("kKeyTriggerType"), Value(0));
  EXPECT_EQ(*query.find("kKeyTriggerID"), Value(8323091));
  EXPECT_EQ(*query.find("kKeyProfileID"), Value(0));
  EXPECT_EQ(*query.find("kKeyMetricID"), Value(0));
}

TEST_F(StartUp, withoutTheResourceOnlyClears) {
  const auto root = std::make_shared<RootNavigationController>();
  service->calls.clear();
  root->loadViewIfNeeded();
  EXPECT_EQ(service->calls,
            (Strings{"kCommandClearConfiguration", "> Metric Log File path doesnt exist"}));
}

TEST_F(StartUp, stopsAfterAnInstallThatWasRefused) {
  shipResource();
  refuseInstall();
  const auto root = std::make_shared<RootNavigationController>();
  service->calls.clear();
  root->loadViewIfNeeded();
  EXPECT_EQ(service->calls, (Strings{"kCommandClearConfiguration", "> pushing metric file",
                                     "kCommandAddConfiguration"}));
}

TEST_F(StartUp, doesNotLookAtTheAnswersOfClearAndQuery) {
  shipResource();
  service->answer = [](std::string_view command) {
    return tesk::CommandResult{command == tesk::kCommandAddConfiguration ? 0 : 5, "no"};
  };
  const auto root = std::make_shared<RootNavigationController>();
  service->calls.clear();
  root->loadViewIfNeeded();
  EXPECT_EQ(service->calls.back(), "kCommandQueryMetric");
}

TEST_F(StartUp, runsOnceAProcess) {
  shipResource();
  const auto root = std::make_shared<RootNavigationController>();
  root->loadViewIfNeeded();
  root->didReceiveMemoryWarning();
  root->loadViewIfNeeded();
  EXPECT_EQ(service->commands.size(), 3U);
}

TEST_F(StartUp, anotherApplicationsNameSendsNothing) {
  shipResource();
  const auto root = std::make_shared<RootNavigationController>();
  root->myAppID = "someone";
  root->loadViewIfNeeded();
  EXPECT_TRUE(service->commands.empty());
}

TEST_F(StartUp, theQueryCarriesItsOwnNameNotTheRoots) {
  shipResource();
  const auto root = std::make_shared<RootNavigationController>();
  service->answer = [&root](std::string_view command) {
    if (command == tesk::kCommandAddConfiguration) root->myAppID = "someone";
    return tesk::CommandResult{};
  };
  root->loadViewIfNeeded();
  EXPECT_EQ(service->calls.back(), "kCommandQueryMetric");
}

using StartUpDeathTest = StartUp;

TEST_F(StartUpDeathTest, needsTheConnectionToInstall) {
  shipResource();
  const auto root = std::make_shared<RootNavigationController>();
  root->myTeskWrapper = nullptr;
  EXPECT_DEATH(root->loadViewIfNeeded(), "no connection to install the metric configuration with");
}

TEST_F(StartUp, withoutConnectionAndResourceOnlySaysSo) {
  const auto root = std::make_shared<RootNavigationController>();
  root->myTeskWrapper = nullptr;
  service->calls.clear();
  root->loadViewIfNeeded();
  EXPECT_EQ(service->calls, Strings{"> Metric Log File path doesnt exist"});
}

TEST(AppIDValidator, startsWithItsDefaults) {
  const AppIDValidator validator;
  EXPECT_EQ(validator.myAppID, 2);
  EXPECT_EQ(validator.appIDKey, "kKeyAppID");
  EXPECT_FALSE(validator.appID);
}

TEST(AppIDValidator, saysYesToTwoOnly) {
  AppIDValidator validator;
  EXPECT_TRUE(validator.validate({{"kKeyAppID", 2}}));
  EXPECT_EQ(validator.appID, 2);
  EXPECT_FALSE(validator.validate({{"kKeyAppID", 3}}));
  EXPECT_EQ(validator.appID, 3);
}

TEST(AppIDValidator, keepsNothingThatIsNoInteger) {
  AppIDValidator validator;
  for (const Dictionary& event : {Dictionary{{"kKeyAppID", "2"}}, Dictionary{{"kKeyAppID", true}},
                                  Dictionary{}, Dictionary{{"kkeyappid", 2}}}) {
    validator.appID = 2;
    EXPECT_FALSE(validator.validate(event)) << jsonText(event);
    EXPECT_FALSE(validator.appID);
  }
}

}  // namespace
}  // namespace qel
