#include "app/ClosingConnector.h"

#include <gtest/gtest.h>

#include "support/FakeTransport.h"

namespace qel {
namespace {

using Strings = std::vector<std::string>;

class ClosingConnectorTest : public ::testing::Test {
 protected:
  std::unique_ptr<tesk::Transport> connect() {
    return connector.connect("qelwatch",
                             [this](std::string_view, const tesk::Message&) { ++events; });
  }

  std::shared_ptr<testing::FakeService> service = std::make_shared<testing::FakeService>();
  std::shared_ptr<testing::FakeConnector> inner = std::make_shared<testing::FakeConnector>(service);
  ClosingConnector connector{inner};
  tesk::Message reply;
  int events = 0;
};

TEST_F(ClosingConnectorTest, passesEverythingOnWhileOpen) {
  const auto transport = connect();
  transport->eventsOn();
  EXPECT_EQ(transport->performCommand("kCommandQueryMetric", {}, reply).code, 0);
  transport->eventsOff();
  service->send("kEventMetric", {});
  EXPECT_EQ(service->clients, Strings{"qelwatch"});
  EXPECT_EQ(service->calls, (Strings{"on", "kCommandQueryMetric", "off"}));
  EXPECT_EQ(events, 1);
}

TEST_F(ClosingConnectorTest, onceClosedFindsTheServiceOutOfReach) {
  const auto transport = connect();
  connector.close();
  transport->eventsOn();
  transport->eventsOff();
  EXPECT_EQ(transport->performCommand("kCommandQueryMetric", {}, reply).code,
            tesk::kServiceUnreachable);
  EXPECT_TRUE(service->calls.empty());
  EXPECT_EQ(connect(), nullptr);
}

TEST_F(ClosingConnectorTest, closingLetsGoOfTheService) {
  const auto transport = connect();
  const std::weak_ptr<testing::FakeConnector> held = inner;
  inner.reset();
  EXPECT_FALSE(held.expired());
  connector.close();
  EXPECT_TRUE(held.expired());
}

TEST_F(ClosingConnectorTest, aTransportThatIsGoneIsNoMatter) {
  connect().reset();
  connector.close();
  EXPECT_TRUE(service->calls.empty());
}

}  // namespace
}  // namespace qel
