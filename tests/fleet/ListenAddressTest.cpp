#include "fleet/ListenAddress.h"

#include <gtest/gtest.h>

namespace qel::fleet {
namespace {

TEST(ListenAddress, isAddressAndPort) {
  const auto address = listenAddress("127.0.0.1:9817");
  ASSERT_TRUE(address);
  EXPECT_EQ(address->host, "127.0.0.1");
  EXPECT_EQ(address->port, 9817);
  EXPECT_EQ(address->text(), "127.0.0.1:9817");
  EXPECT_EQ(listenAddress("[::1]:80")->text(), "[::1]:80");
}

TEST(ListenAddress, knowsWhatStaysOnTheMachine) {
  for (const char* text : {"127.0.0.1:1", "127.255.0.9:1", "[::1]:1"}) {
    EXPECT_TRUE(listenAddress(text)->isLoopback) << text;
  }
  for (const char* text : {"0.0.0.0:1", "192.0.2.1:1", "[::]:1", "[2001:db8::1]:1"}) {
    EXPECT_FALSE(listenAddress(text)->isLoopback) << text;
  }
}

TEST(ListenAddress, isNothingElse) {
  for (const char* text :
       {"", ":", "9817", ":9817", "127.0.0.1", "127.0.0.1:", "127.0.0.1:65536", "127.0.0.1:-1",
        "127.0.0.1:80x", "127.0.0.1:80,0.0.0.0:80", "localhost:80", "::1:80", "[::1]80", "[:80",
        "[127.0.0.1]:80", "127.1:80", "1.2.3.4.5:80"}) {
    EXPECT_FALSE(listenAddress(text)) << text;
  }
}

TEST(ListenAddress, tellsWhyNobodyCanListenThere) {
  EXPECT_EQ(whyNotFree(*listenAddress("127.0.0.1:0")), "");
  EXPECT_EQ(whyNotFree(*listenAddress("192.0.2.1:9817")), "Cannot assign requested address");
}

}  // namespace
}  // namespace qel::fleet
