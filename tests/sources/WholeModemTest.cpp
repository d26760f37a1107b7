// A phone whose modem speaks on its diagnostics port while ModemManager drives it: between the two
// every metric of the catalogue comes, and each from one of them only.

#include <gtest/gtest.h>

#include <set>

#include "base/Clock.h"
#include "messages/catalogue/MetricMessages.h"
#include "sources/combined/CombinedSource.h"
#include "sources/diagnostics/DiagnosticsSource.h"
#include "sources/modem_manager/ModemWorld.h"
#include "support/diagnostics/GsmPackets.h"
#include "support/diagnostics/LtePackets.h"
#include "support/diagnostics/NasPackets.h"
#include "support/diagnostics/OtaPackets.h"
#include "support/diagnostics/Packets.h"
#include "support/diagnostics/PlayedSearch.h"
#include "support/diagnostics/PseudoModem.h"
#include "support/diagnostics/SourceLog.h"
#include "support/diagnostics/UmtsMessages.h"
#include "support/diagnostics/UmtsPackets.h"

namespace qel::testing {
namespace {

using namespace diagnostics::test;
using diagnostics::DiagnosticsSource;
using Logs = std::vector<std::pair<std::uint16_t, Bytes>>;

constexpr const char* kDevice = "/sys/devices/usb1/1-2";

Logs onLte() {
  constexpr std::uint16_t kAir = 0xB0C0;
  const std::vector<WrittenLteCell> cells = {{185, {heard(-108, -82, 50, 8.3)}}};
  return {
      {0xB0C2, lteServingCell(3)},
      {kAir, overTheAir(AirChannel::bcchDlSch, sib1Message({}))},
      {kAir, overTheAir(AirChannel::ulCcch, connectionRequest(3))},
      {kAir, overTheAir(AirChannel::dlCcch, setupWithDrx(AirDrx{}))},
      {kAir, overTheAir(AirChannel::ulDcch, setupComplete())},
      {kAir, overTheAir(AirChannel::dlDcch, measureConfiguration({{1, 700, 1}}))},
      {kAir, overTheAir(AirChannel::ulDcch,
                        measurementReport(1, std::vector<AirUmtsResult>{{407, 40, 30}}))},
      {kAir, overTheAir(AirChannel::dlDcch, secondaryCells({}, {{1, 7, 2300}}))},
      {0xB193, lteMeasurement(4, 1300, cells)},
      {0xB195, lteConnectedNeighbours(4, 1300, {{31, {heard(-112, -86, 6)}}})},
      {0xB16E, ltePusch(5, {{1, 22}})},
      {0xB0EE, emmState(3, 0, WrittenGuti{})},
      {0xB0EC, plainNas(attachAccept(6, areasValue({0x5408})))},
      {0xB0E2, plainNas(activateConnection({}))},
  };
}

Logs onUmts() {
  return {
      {0x4127, umtsCell()},
      {0x4125, BodyWriter().u8(2)},
      {0x4005, umtsRanks(0, {{10638, 407, -78, -8}, {10638, 51, -90, -14}})},
      {0x4176, umtsGainControl({{100, kUmtsReceiverOff, 200}})},
      {0x412F, umtsRrc(9, joined({Bytes{1}, umtsBlock1({7, 6}).bytes()}))},
      {0x412F, umtsRrc(9, joined({Bytes{3}, umtsBlock3().bytes()}))},
  };
}

Logs onGsm() {
  constexpr std::uint16_t kBand900 = 8U << 12;
  const auto level = [](int dbm) { return static_cast<std::uint16_t>(dbm * 16); };
  return {
      {0x5134, BodyWriter()
                   .u16(kBand900 | 62)
                   .u8(3)
                   .u8(5)
                   .u16(0xABCD)
                   .bytes(area("00101", 0x1234))
                   .u8(0)
                   .u8(0xFF)},
      {0x512F, radioMessage(RadioChannel::broadcast, systemInformation3({}))},
      {0x512F, radioMessage(RadioChannel::broadcast, systemInformation13({}))},
      {0x507A, BodyWriter().u16(level(-71)).u8(0)},
      {0x5071, BodyWriter().u8(1).u16(kBand900 | 5).u16(level(-65)).u8(1).u8(0x2B).zeros(6)},
      {0x512F, radioMessage(RadioChannel::slow, measurementReport(37, 2))},
      {0x7130, Bytes{3, 0, 0}},
      {0x7131, Bytes{19, 8, 0}},
  };
}

std::uint32_t metricNamed(const sources::SourceEvent& event) {
  return static_cast<std::uint32_t>(*event.entries.find("kKeyMetricID")->asInt64()) -
         kMetricEventBase;
}

class WholeModemTest : public ::testing::Test {
 protected:
  WholeModemTest() {
    FakeInterfaces phone = modemOn(kOnLte);
    phone.at(kModem).insert_or_assign("Device", FakeProperty(std::string(kDevice)));
    phone.at(kModem).insert_or_assign("Sim", FakeProperty(sdbus::ObjectPath(kSimPath)));
    phone.at(kSignal).insert_or_assign("Lte", FakeProperty(FakeDictionary{{"rsrp", level(-99)}}));
    world.manager->add(kSimPath, {{kSim,
                                   {{"SimIdentifier", std::string("89490200001234567890")},
                                    {"Imsi", std::string("001010123456789")}}}});
    world.manager->add(kModemPath, phone);
    ports->set({{modem.path(), kDevice}});
    diagnostics::DiagnosticsWorld played;
    played.search = [ports = ports] { return std::make_unique<PlayedSearch>(ports); };
    port = std::make_shared<DiagnosticsSource>(diagnostics::DiagnosticsChoice{}, played);
    source = std::make_unique<sources::CombinedSource>(
        port, std::shared_ptr<sources::EventSource>(std::move(world.source)),
        sources::CombinedSource::Port::missed);
  }

  // Sent until it is taken: the modem may still be being told what to send.
  void tell(const Logs& logs) {
    for (const auto& [code, body] : logs) {
      EXPECT_TRUE(comesTrue([&, code = code, &body = body] {
        return modem.sendLog(code, body, systemClock().nowMs());
      })) << std::hex
          << code;
    }
  }

  ModemWorld world;
  PseudoModem modem;
  std::shared_ptr<PlayedPorts> ports = std::make_shared<PlayedPorts>();
  std::shared_ptr<DiagnosticsSource> port;
  std::shared_ptr<SourceLog> log = std::make_shared<SourceLog>();
  std::shared_ptr<sources::ListenerSignal> listeners = std::make_shared<sources::ListenerSignal>();
  std::unique_ptr<sources::CombinedSource> source;
};

TEST_F(WholeModemTest, TellsEveryMetricOfTheCatalogue) {
  source->start(log, listeners);
  ASSERT_TRUE(comesTrue([&] { return port->modem() == kDevice; }));
  tell(onLte());
  modem.send(eventPacket({{1608, Bytes{1, 0}, systemClock().nowMs()}}));
  ASSERT_TRUE(log->waitForMetric(metric::kLteRadioLinkFailure));
  tell(onUmts());
  tell(onGsm());
  for (const MetricName& name : KBBMetricUtility::catalogue()) {
    EXPECT_TRUE(log->waitForMetric(name.identifier)) << name.identifier << " " << name.name;
  }
  for (const sources::SourceEvent& event : log->events()) {
    const MetricMessage* message = findMetricMessage(metricNamed(event));
    if (!message) continue;
    EXPECT_TRUE(message->isReadable(*event.entries.find("kKeyPayload")->asBytes()))
        << message->className;
  }
}

}  // namespace
}  // namespace qel::testing
