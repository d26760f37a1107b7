#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>

#include "base/Rendering.h"
#include "connection/TeskWrapper.h"
#include "support/FakeTransport.h"
#include "support/RecordingSink.h"

namespace qel {
namespace {

using testing::CapturedSystemLog;
using testing::installFakeService;

class TeskWrapperCommands : public ::testing::Test {
 protected:
  // The one request that was sent, as text: key order counts.
  std::string request() const {
    return service->commands.size() == 1 ? jsonText(service->commands[0].request) : "not one";
  }

  CapturedSystemLog log;
  std::shared_ptr<testing::FakeService> service = installFakeService();
  std::shared_ptr<TeskWrapper> wrapper = TeskWrapper::sharedInstance();
};

TEST_F(TeskWrapperCommands, clearSendsTheApplicationIdentifierOnly) {
  EXPECT_TRUE(wrapper->removeQuixConfigForAppid("qelwatch"));
  EXPECT_EQ(service->calls, std::vector<std::string>{"kCommandClearConfiguration"});
  EXPECT_EQ(request(), R"({"kKeyAppID": 2})");
  EXPECT_EQ(log.lines(),
            std::vector<std::string>{"-[TeskWrapper removeQuixConfigForAppid:]: error=0 msg=done"});
}

TEST_F(TeskWrapperCommands, anyOtherIdentifierSendsAndLogsNothing) {
  for (const std::string_view appId : {"", "Qelwatch", "QELWATCH", "qelwatch ", "2"}) {
    EXPECT_FALSE(wrapper->removeQuixConfigForAppid(appId));
    EXPECT_FALSE(wrapper->addQuixConfigForAppId(appId, "/dev/null"));
    EXPECT_FALSE(wrapper->querySpecificMetric(appId, 1, 2, 3, 4, 5));
  }
  EXPECT_TRUE(service->calls.empty());
  EXPECT_TRUE(log.lines().empty());
}

TEST_F(TeskWrapperCommands, installSendsTheWholeFile) {
  const std::string path = ::testing::TempDir() + "qelwatch_install_test";
  std::ofstream(path, std::ios::binary) << std::string("\x08\0\xFF", 3);
  EXPECT_TRUE(wrapper->addQuixConfigForAppId("qelwatch", path));
  std::remove(path.c_str());
  EXPECT_EQ(service->calls, std::vector<std::string>{"kCommandAddConfiguration"});
  EXPECT_EQ(request(), R"({"kKeyAppID": 2, "kKeyPayload": "<0800ff>", "kKeyPayloadType": 0})");
  EXPECT_EQ(log.lines(),
            std::vector<std::string>{
                "-[TeskWrapper addQuixConfigForAppId:andProtofFilePath:]: error=0 msg=done"});
}

TEST_F(TeskWrapperCommands, installOfAFileThatCannotBeReadSendsNoBytes) {
  EXPECT_TRUE(wrapper->addQuixConfigForAppId("qelwatch", "/nonexistent/file"));
  EXPECT_EQ(request(), R"({"kKeyAppID": 2, "kKeyPayload": "<>", "kKeyPayloadType": 0})");
}

TEST_F(TeskWrapperCommands, queryKeepsTheSignOfItsArguments) {
  EXPECT_TRUE(wrapper->querySpecificMetric("qelwatch", -9999, -1, 8323091, -2147483647 - 1, 7));
  EXPECT_EQ(service->calls, std::vector<std::string>{"kCommandQueryMetric"});
  EXPECT_EQ(request(),
            R"({"kKeyAppID": 2, "kKeyPayloadType": 0, "kKeyTriggerRef": -9999, )"
            R"("kKeyTriggerType": -1, "kKeyTriggerID": 8323091, "kKeyProfileID": -2147483648, )"
            R"("kKeyMetricID": 7})");
}

TEST_F(TeskWrapperCommands, aRefusalIsLoggedWithCodeAndMessage) {
  service->answer = [](std::string_view) { return tesk::CommandResult{-536813566, "no modem"}; };
  EXPECT_FALSE(wrapper->querySpecificMetric("qelwatch", 9999, 0, 8323091, 0, 0));
  EXPECT_EQ(log.lines(),
            std::vector<std::string>{
                "-[TeskWrapper querySpecificMetric:triggerRef:triggerType:triggerID:profileID:"
                "metricID:]: error=-536813566 msg=no modem"});
}

TEST(TeskWrapperWithoutAService, answersNoAndLogs) {
  const CapturedSystemLog log;
  tesk::setConnector(nullptr);
  EXPECT_FALSE(TeskWrapper::sharedInstance()->removeQuixConfigForAppid("qelwatch"));
  EXPECT_EQ(log.lines(),
            std::vector<std::string>{"-[TeskWrapper removeQuixConfigForAppid:]: error=-534716415 "
                                     "msg=baseband manager service not reachable"});
}

}  // namespace
}  // namespace qel
