#include "fuzz/seeds/DiagnosticsSeeds.h"

#include "fuzz/support/Seed.h"
#include "support/diagnostics/NasPackets.h"
#include "support/diagnostics/OtaPackets.h"

namespace qel::fuzz {
namespace {

using namespace diagnostics::test;

constexpr std::size_t kAnyLog = 2;
constexpr std::size_t kAnyEvent = 3;
constexpr std::uint16_t kOverTheAir = 0xB0C0;
constexpr std::uint16_t kWaitMs = 100;

struct Packet {
  std::size_t kind;
  std::uint16_t code;
  Bytes body;
};

std::vector<Packet> packets() {
  std::vector<Packet> all;
  const auto air = [&](AirChannel channel, const Bytes& message) {
    all.push_back({kAnyLog, kOverTheAir, overTheAir(channel, message)});
  };
  const auto nas = [&](std::uint16_t code, const Bytes& message) {
    all.push_back({kAnyLog, code, plainNas(message)});
  };
  air(AirChannel::bcchDlSch,
      sib1Message({.tdd = AirTdd{2, 7}, .ofRelease9 = true, .bands = {66, 10}}));
  air(AirChannel::bcchDlSch, sib2Message(true, AirBarring{12, 5, 17}));
  air(AirChannel::bcchDlSch, sib3Message({}));
  air(AirChannel::bcchDlSch, sib5Message({{.earfcn = 40936, .priority = 6}, {.earfcn = 700}}));
  air(AirChannel::ulCcch, connectionRequest(3));
  air(AirChannel::dlCcch, setupWithDrx(AirDrx{}));
  air(AirChannel::ulDcch, setupComplete());
  air(AirChannel::dlDcch, measureConfiguration({{.object = 3, .earfcn = 700, .identity = 2}}));
  air(AirChannel::dlDcch, secondaryCells({3}, {{1, 301, 700}, {2, 77, 40936}}));
  air(AirChannel::dlDcch, handover(77, 2300));
  air(AirChannel::ulDcch, measurementReport(2, {AirResult{301, 55, 15}}));
  air(AirChannel::ulDcch, measurementReport(1, {AirUmtsResult{444, 20, 30}}));
  air(AirChannel::ulDcch, measurementReport(2, {AirGsmResult{620, 5, 3, 40}}));
  air(AirChannel::ulCcch, reestablishmentRequest(301, 2));
  air(AirChannel::dlDcch, connectionRelease(1));
  all.push_back({kAnyLog, kEmmState, emmState(3, 0, WrittenGuti{})});
  nas(kEmmOut, attachRequest(2));
  nas(kEmmIn,
      attachAccept(0x49, areasValue({5, 9}),
                   {gutiElement({}), equivalentsElement({0x62F210}), featuresElement(true, true)}));
  nas(kEmmIn, updateReject(12));
  nas(kEsmIn, activateConnection({.nameServers = {{192, 0, 2, 1}, Bytes(16, 9)}}));
  nas(kEsmIn, deactivateBearer(5));
  all.push_back({kAnyEvent, 1606, Bytes{3}});
  all.push_back({kAnyEvent, 1608, Bytes{1, 0}});
  return all;
}

}  // namespace

std::vector<Bytes> diagnosticsSeeds() {
  std::vector<Bytes> seeds;
  Seed together;
  for (const Packet& packet : packets()) {
    together.number(kWaitMs).byte(packet.kind).number(packet.code).piece(packet.body);
    seeds.push_back(
        Seed().number(kWaitMs).byte(packet.kind).number(packet.code).piece(packet.body).bytes);
  }
  seeds.push_back(together.bytes);
  return seeds;
}

}  // namespace qel::fuzz
