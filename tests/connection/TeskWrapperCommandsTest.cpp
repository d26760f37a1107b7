#include <gtest/gtest.h>
#include <sys/stat.h>

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

// Reading a folder, or memory at an address that is not there, threw through the wrapper once; a
// pipe without a writer held it up.
TEST_F(TeskWrapperCommands, installOfWhatIsNoFileSendsNoBytes) {
  const std::string pipe = ::testing::TempDir() + "qelwatch_install_pipe";
  std::remove(pipe.c_str());
  ASSERT_EQ(::mkfifo(pipe.c_str(), 0600), 0);
  for (const std::string& path : {std::string("/proc"), std::string("/proc/self/mem"), pipe,
                                  std::string("/dev/zero"), std::string()}) {
    service->commands.clear();
    EXPECT_TRUE(wrapper->addQuixConfigForAppId("qelwatch", path)) << path;
    EXPECT_EQ(request(), R"({"kKeyAppID": 2, "kKeyPayload": "<>", "kKeyPayloadType": 0})") << path;
  }
  std::remove(pipe.c_str());
}

TEST_F(TeskWrapperCommands, installOfAFileBeyondAMebibyteSendsNoBytes) {
  constexpr std::size_t kMost = 1024 * 1024;
  const std::string path = ::testing::TempDir() + "qelwatch_large_install_test";
  for (const std::size_t size : {kMost, kMost + 1}) {
    std::ofstream(path, std::ios::binary) << std::string(size, 'x');
    service->commands.clear();
    EXPECT_TRUE(wrapper->addQuixConfigForAppId("qelwatch", path));
    ASSERT_EQ(service->commands.size(), 1U);
    const Bytes* sent = service->commands[0].request.find("kKeyPayload")->asBytes();
    EXPECT_EQ(sent->size(), size == kMost ? kMost : 0U);
  }
  std::remove(path.c_str());
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
