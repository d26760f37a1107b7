// What of a session with known identities stands on the wire.
#include <gmock/gmock.h>

#include <regex>
#include <set>

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
std::vector<std::string> lastingIdentities() {
  const Bytes imsi = sources::encodedImsi(sources::kImsi);
  const Bytes subscriber(imsi.begin() + 4, imsi.end());  // beyond country and network
  const Bytes iccid = sources::swappedDigits(sources::kIccid);
  const Bytes address = {0x20, 0x01, 0x0d, 0xb8, 0, 2, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0x17};
  std::vector<std::string> all = {std::string(sources::kImsi), std::string(sources::kIccid)};
  for (const Bytes& bytes : {imsi, subscriber, iccid, address}) {
    all.push_back(textOf(bytes));
    all.push_back(hexText(bytes));
  }
  return all;
}

std::string varint(std::uint32_t number) {
  std::string text;
  for (; number >= 0x80; number >>= 7) text += static_cast<char>(number | 0x80);
  return text + static_cast<char>(number);
}

// The numbers by which the network calls the subscriber, as an open session in words tells them.
std::vector<std::string> temporaryIdentities(const std::string& openWire) {
  static const std::regex kIdentity("\"(?:m_tmsi|tmsi|p_tmsi)\": ([0-9]{6,10})");
  std::set<std::string> all;
  const auto end = std::sregex_iterator();
  for (auto at = std::sregex_iterator(openWire.begin(), openWire.end(), kIdentity); at != end;
       ++at) {
    const std::string text = (*at)[1].str();
    const auto number = static_cast<std::uint32_t>(std::stoul(text));
    all.insert({text, varint(number)});
  }
  return {all.begin(), all.end()};
}

class Wire : public WithBroker {
 protected:
  // All that goes to the broker, of that many bytes or somewhat more.
  std::string publish(std::vector<std::string> more) {
    constexpr std::size_t kSession = 200'000;  // in which each report comes several times
    const WireTap tap(broker.port());
    RunningQelctl publisher(
        publishing("mqtt://127.0.0.1:" + std::to_string(tap.port()), std::move(more)));
    EXPECT_TRUE(eventually([&] { return tap.sent().size() >= kSession; })) << publisher.err();
    end(publisher);
    return tap.sent();
  }

  static std::ptrdiff_t found(const std::vector<std::string>& secrets, const std::string& wire) {
    const std::string searched = wire + payloadsIn(wire);
    return std::ranges::count_if(
        secrets, [&](const auto& secret) { return searched.find(secret) != std::string::npos; });
  }

  Broker broker{directory};
};

TEST_F(Wire, tellsNobodyByItself) {
  const std::string open = publish({"--keep-identities"});
  const std::string openWords = publish({"--keep-identities", "--decoded"});
  auto secrets = lastingIdentities();
  EXPECT_GE(found(secrets, open), 4);
  EXPECT_GE(found(secrets, openWords), 4);
  const auto temporary = temporaryIdentities(openWords);
  EXPECT_GE(found(temporary, open), 2);
  secrets.insert(secrets.end(), temporary.begin(), temporary.end());
  for (const std::vector<std::string>& form : {std::vector<std::string>{}, {"--decoded"}}) {
    const std::string wire = publish(form);
    EXPECT_EQ(found(secrets, wire), 0);
    EXPECT_THAT(wire, ::testing::HasSubstr("qelwatch/one/KCellularMmCommonInfo"));
    EXPECT_THAT(wire, ::testing::HasSubstr("qelwatch/one/kCellularSimCardFiles"));
    EXPECT_THAT(wire, ::testing::HasSubstr("qelwatch/one/KCellularActivatedBearerContexts"));
  }
}

}  // namespace
}  // namespace qel::testing
