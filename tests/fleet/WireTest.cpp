// What of a session with known identities stands on the wire.
#include <gmock/gmock.h>

#include "base/Bytes.h"
#include "fleet/WireTap.h"
#include "fleet/WithBroker.h"
#include "sources/simulated/Bcd.h"
#include "sources/simulated/Identities.h"

namespace qel::testing {
namespace {

// The payloads within the text, decoded, one after the other.
std::string payloadsIn(const std::string& wire) {
  static const std::string kKey = "\"kKeyPayload\": \"";
  std::string all;
  for (std::size_t at = 0; (at = wire.find(kKey, at)) != std::string::npos;) {
    at += kKey.size();
    const auto bytes = bytesFromBase64(std::string_view(wire).substr(at, wire.find('"', at) - at));
    if (bytes) all.append(bytes->begin(), bytes->end());
  }
  return all;
}

std::string textOf(ByteView bytes) { return {bytes.begin(), bytes.end()}; }

// The forms in which a session could tell who somebody is.
std::vector<std::string> secrets() {
  const Bytes imsi = sources::encodedImsi(sources::kImsi);
  const Bytes subscriber(imsi.begin() + 4, imsi.end());  // beyond country and network
  const Bytes iccid = sources::swappedDigits(sources::kIccid);
  std::vector<std::string> all = {std::string(sources::kImsi), std::string(sources::kIccid)};
  for (const Bytes& bytes : {imsi, subscriber, iccid}) {
    all.push_back(textOf(bytes));
    all.push_back(hexText(bytes));
  }
  return all;
}

class Wire : public WithBroker {
 protected:
  // All that goes to the broker until the wire has told who the subscriber is or, for a session
  // without identities, as much as the open one.
  std::string publish(std::vector<std::string> more, std::size_t least) {
    const WireTap tap(broker.port());
    RunningQelctl publisher(
        publishing("mqtt://127.0.0.1:" + std::to_string(tap.port()), std::move(more)));
    EXPECT_TRUE(eventually([&] { return tap.sent().size() >= least; })) << publisher.err();
    end(publisher);
    return tap.sent();
  }

  static std::size_t found(const std::string& wire) {
    const std::string searched = wire + payloadsIn(wire);
    return static_cast<std::size_t>(std::ranges::count_if(
        secrets(), [&](const auto& secret) { return searched.find(secret) != std::string::npos; }));
  }

  Broker broker{directory};
};

TEST_F(Wire, tellsNobodyByItself) {
  constexpr std::size_t kSession = 200'000;  // bytes, in which each report comes several times
  for (const std::vector<std::string>& form : {std::vector<std::string>{}, {"--decoded"}}) {
    auto open = form;
    open.emplace_back("--keep-identities");
    EXPECT_GE(found(publish(open, kSession)), 3U);
    const std::string wire = publish(form, kSession);
    EXPECT_EQ(found(wire), 0U);
    EXPECT_THAT(wire, ::testing::HasSubstr("qelwatch/one/KCellularMmCommonInfo"));
    EXPECT_THAT(wire, ::testing::HasSubstr("qelwatch/one/kCellularSimCardFiles"));
  }
}

}  // namespace
}  // namespace qel::testing
