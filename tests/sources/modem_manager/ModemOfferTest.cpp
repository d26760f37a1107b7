// What only some releases of ModemManager and some modems offer is told where it is there.
#include <gmock/gmock.h>

#include "messages/gsm.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "messages/sim.h"
#include "radio/Bands.h"
#include "sources/modem_manager/ModemReleases.h"
#include "support/RecordingSink.h"

namespace qel::testing {
namespace {

using namespace sources;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr std::uint32_t kDenied = 3;
constexpr std::uint32_t kHome = 1;
constexpr std::uint32_t kOn5G = 1U << 15;

TEST(Releases, TellWhatEachOfThemOffers) {
  for (const int minor : kReleases) {
    SCOPED_TRACE(minor);
    ModemWorld world({}, ModemWorld::kPatient);
    speakAs(minor, *world.manager, modemOfRelease(minor));
    world.start();
    ASSERT_TRUE(world.log->waitForCount(metric::kEmmContext, 3));
    ASSERT_TRUE(becomesTrue([&] { return world.manager->calls("GetCellInfo") > 0; }));
    EXPECT_TRUE(becomesTrue([&] { return world.has(metric::kLteNeighbours) == (minor >= 20); }));
    const auto cell = world.log->newest<KCellularLteScellInfo>(metric::kLteScellInfo);
    EXPECT_EQ(cell->selPlmnMcc(), 262U);
    if (minor < 20) continue;
    ASSERT_TRUE(world.log->waitFor<KCellularLteScellInfo>(
        metric::kLteScellInfo, [](const auto& m) { return m.dlFreq() == 1300; }));
    EXPECT_EQ(world.log->newest<KCellularLteScellInfo>(metric::kLteScellInfo)->hasDlBw(),
              minor >= 22);
    EXPECT_EQ(world.has(metric::kLteCarrierAggregation), minor >= 22);
    const auto own = world.log->newest<KCellularLteNbrEutraCellMeas>(metric::kLteNeighbours);
    EXPECT_EQ(own->measNbrEutras().size(), 1U);
    EXPECT_FALSE(world.log->newest<KCellularEmmContext>(metric::kEmmContext)->hasRejectCause());
  }
}

TEST(Carriers, HaveTheirBandwidthsAndAreNoNeighbours) {
  ModemWorld world({}, ModemWorld::kPatient);
  speakAs(22, *world.manager, modemOfRelease(22));
  world.start();
  ASSERT_TRUE(world.log->waitForCount(metric::kLteCarrierAggregation, 1));
  ASSERT_TRUE(world.log->waitFor<KCellularLteScellInfo>(
      metric::kLteScellInfo, [](const auto& m) { return m.hasDlFreq(); }));
  const auto cell = world.log->newest<KCellularLteScellInfo>(metric::kLteScellInfo);
  EXPECT_EQ(cell->phyCellId(), 7U);
  EXPECT_EQ(cell->dlBw(), 5U);  // 20 MHz
  const auto carriers =
      world.log->newest<KCellularLteCarrierAggregationStatus>(metric::kLteCarrierAggregation);
  ASSERT_EQ(carriers->sccLists().size(), 1U);
  const SecondaryComponentCarrier& carrier = *carriers->sccLists()[0];
  EXPECT_EQ(carrier.pci(), 9U);
  EXPECT_EQ(carrier.dlEarfcn(), 6300U);
  EXPECT_EQ(carrier.dlRfBand(), 20U);
  EXPECT_EQ(carrier.dlBandwidth(), 3U);  // 10 MHz
  EXPECT_EQ(carrier.rsrp(), -9850);
  EXPECT_EQ(carrier.rsrq(), -1100);
  EXPECT_FALSE(carrier.hasState());
}

TEST(Carriers, HaveNoBandwidthThatLteDoesNotHave) {
  for (const std::uint32_t bandwidth : {0U, 1U, 50U, 1400U, 1400000U, 25000000U, 0xFFFFFFFFU}) {
    ModemWorld world({}, ModemWorld::kPatient);
    world.manager->setCells({{{"cell-type", number(5)},
                              {"serving", flag(true)},
                              {"earfcn", number(100)},
                              {"bandwidth", number(bandwidth)}}});
    world.manager->add(kModemPath, modemOfRelease(22));
    world.start();
    ASSERT_TRUE(world.log->waitFor<KCellularLteScellInfo>(
        metric::kLteScellInfo, [](const auto& m) { return m.hasDlFreq(); }));
    const auto cell = world.log->newest<KCellularLteScellInfo>(metric::kLteScellInfo);
    EXPECT_EQ(cell->hasDlBw(), bandwidth == 1400 || bandwidth == 1400000) << bandwidth;
    EXPECT_FALSE(world.has(metric::kLteCarrierAggregation));
  }
}

FakeDictionary rejection(std::uint32_t cause, std::uint32_t technology) {
  FakeDictionary found = {{"error", number(cause)}};
  if (technology != 0) found["access-technology"] = number(technology);
  return found;
}

template <class Message>
bool isRejectedFor(std::optional<std::int32_t> cause, const Message& message) {
  return message.hasRejectCause() == cause.has_value() &&
         message.rejectCause() == cause.value_or(0);
}

TEST(Rejection, IsToldInTheDomainsOfItsTechnology) {
  ModemWorld world({}, ModemWorld::kPatient);
  auto modem = modemOfRelease(24, 0);
  modem.at(kModem3gpp).at("RegistrationState") = kDenied;
  modem.at(kModem3gpp).at("NetworkRejection") = rejection(11, kOnLte);
  world.manager->add(kModemPath, modem);
  world.start();
  const auto emmCause = [&](std::optional<std::int32_t> cause) {
    return world.log->waitFor<KCellularEmmContext>(
        metric::kEmmContext, [cause](const auto& m) { return isRejectedFor(cause, m); });
  };
  const auto mmCause = [&](std::optional<std::int32_t> cause) {
    return world.log->waitFor<KCellularMmContext>(metric::kMmContext, [cause](const auto& m) {
      return isRejectedFor(cause, m);
    }) && world.log->waitFor<KCellularGmmContext>(metric::kGmmContext, [cause](const auto& m) {
      return isRejectedFor(cause, m);
    });
  };
  EXPECT_TRUE(emmCause(11));
  EXPECT_TRUE(mmCause(std::nullopt));
  world.manager->set(kModemPath, kModem3gpp, "NetworkRejection", rejection(13, kOnUmts));
  EXPECT_TRUE(emmCause(std::nullopt));
  EXPECT_TRUE(mmCause(13));
  for (const auto& nothing :
       {rejection(11, kOn5G), rejection(11, 0), rejection(0, kOnLte), rejection(128, kOnLte)}) {
    world.manager->set(kModemPath, kModem3gpp, "NetworkRejection", rejection(15, kOnLte));
    EXPECT_TRUE(emmCause(15));
    world.manager->set(kModemPath, kModem3gpp, "NetworkRejection", nothing);
    EXPECT_TRUE(emmCause(std::nullopt));
  }
}

TEST(Rejection, IsOverOnceThePhoneIsRegistered) {
  ModemWorld world({}, ModemWorld::kPatient);
  auto modem = modemOfRelease(24);
  modem.at(kModem3gpp).at("RegistrationState") = kDenied;
  modem.at(kModem3gpp).at("NetworkRejection") = rejection(22, 0);
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(world.log->waitFor<KCellularEmmContext>(
      metric::kEmmContext, [](const auto& m) { return m.rejectCause() == 22; }));
  world.manager->set(kModemPath, kModem3gpp, "RegistrationState", kHome);
  EXPECT_TRUE(world.log->waitFor<KCellularEmmContext>(
      metric::kEmmContext, [](const auto& m) { return !m.hasRejectCause(); }));
}

FakeInterfaces modemWithInitialBearer(std::uint32_t technologies = kOnLte) {
  auto modem = modemOfRelease(20, technologies);
  modem.at(kModem3gpp).at("InitialEpsBearer") = sdbus::ObjectPath(kInitialBearerPath);
  modem.at(kModem3gpp).at("InitialEpsBearerSettings") =
      FakeDictionary{{"apn", text("asked.test")},
                     {"ip-type", number(1)},
                     {"profile-id", sdbus::Variant(std::int32_t{1})}};
  return modem;
}

FakeInterfaces bearerWith(FakeDictionary properties) {
  return {{kBearer, {{"Connected", true}, {"Properties", std::move(properties)}}}};
}

bool waitForApns(const ModemWorld& world, const std::vector<std::string>& apns) {
  return world.log->waitFor<KCellularActivatedBearerContexts>(metric::kBearers, [&](const auto& m) {
    std::vector<std::string> found;
    for (const auto& bearer : m.bearerContexts()) found.push_back(bearer->apn().value_or(""));
    return found == apns && m.bearerContextCount() == apns.size();
  });
}

TEST(FirstConnectionOfLte, IsToldAsTheNetworkGaveIt) {
  ModemWorld world({}, ModemWorld::kPatient);
  world.manager->add(kInitialBearerPath,
                     bearerWith({{"apn", text("given.test")}, {"ip-type", number(4)}}));
  world.manager->add(kModemPath, modemWithInitialBearer());
  world.start();
  ASSERT_TRUE(waitForApns(world, {"given.test"}));
  const auto bearers = world.log->newest<KCellularActivatedBearerContexts>(metric::kBearers);
  EXPECT_EQ(bearers->bearerContexts()[0]->pdpType(), 5);  // both, of LTE
  EXPECT_EQ(bearers->bearerContexts()[0]->cid(), 1U);
  world.manager->set(kModemPath, kModem, "AccessTechnologies", kOnUmts);
  EXPECT_TRUE(waitForApns(world, {}));
}

TEST(FirstConnectionOfLte, IsToldAsItWasAskedForWhereItSaysNothing) {
  ModemWorld world({}, ModemWorld::kPatient);
  world.manager->add(kInitialBearerPath, bearerWith({}));
  world.manager->add(kModemPath, modemWithInitialBearer());
  world.start();
  ASSERT_TRUE(waitForApns(world, {"asked.test"}));
  const auto bearers = world.log->newest<KCellularActivatedBearerContexts>(metric::kBearers);
  EXPECT_EQ(bearers->bearerContexts()[0]->pdpType(), 3);  // IPv4, of LTE
}

TEST(FirstConnectionOfLte, IsToldOnceWhereAProgramUsesItToo) {
  for (const char* apn : {"GIVEN.test", "other.test"}) {
    ModemWorld world({}, ModemWorld::kPatient);
    auto modem = modemWithInitialBearer();
    modem.at(kModem).at("Bearers") = std::vector<sdbus::ObjectPath>{sdbus::ObjectPath(kBearerPath)};
    world.manager->add(kInitialBearerPath, bearerWith({{"apn", text("given.test")}}));
    world.manager->add(kBearerPath, bearerWith({{"apn", text(apn)}}));
    world.manager->add(kModemPath, modem);
    world.start();
    const bool same = std::string(apn) == "GIVEN.test";
    EXPECT_TRUE(waitForApns(
        world, same ? std::vector<std::string>{apn} : std::vector<std::string>{apn, "given.test"}));
  }
}

const FakeInterfaces kFullSim = {
    {kSim,
     {{"Imsi", std::string("001011234567890")},
      {"SimIdentifier", std::string("8900101234567890123")},
      {"OperatorIdentifier", std::string("00101")},
      {"OperatorName", std::string("Test Net")},
      {"EmergencyNumbers", std::vector<std::string>{"112", "911", "1234567", "0a"}}}}};

std::map<std::uint32_t, Bytes> filesIn(const ModemWorld& world) {
  const auto message = world.log->newest<KCellularSimCardFiles>(metric::kSimFiles);
  std::map<std::uint32_t, Bytes> files;
  for (const auto& file : message->efLists()) files[file->efId()] = *file->content();
  return files;
}

TEST(Card, HasFilesForWhatIsKnownOfIt) {
  ModemWorld world({}, ModemWorld::kPatient);
  auto modem = modemOfRelease(20);
  modem.at(kModem).at("Sim") = sdbus::ObjectPath(kSimPath);
  world.manager->add(kSimPath, kFullSim);
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(world.log->waitForCount(metric::kSimFiles, 1));
  auto files = filesIn(world);
  EXPECT_EQ(files.size(), 5U);
  EXPECT_EQ(files[0x6F46], (Bytes{0xFF, 'T', 'e', 's', 't', ' ', 'N', 'e', 't', 0xFF, 0xFF, 0xFF,
                                  0xFF, 0xFF, 0xFF, 0xFF, 0xFF}));
  EXPECT_EQ(files[0x6FAD], (Bytes{0xFF, 0xFF, 0xFF, 2}));
  EXPECT_EQ(files[0x6FB7], (Bytes{0x11, 0xF2, 0xFF, 0x19, 0xF1, 0xFF}));
}

TEST(Card, HasNoFileWithANameThatItCannotHold) {
  for (const char* name : {"", "Seventeen letters", "Caf\xC3\xA9", "a_b", "$"}) {
    ModemWorld world({}, ModemWorld::kPatient);
    auto modem = modemOfRelease(20);
    modem.at(kModem).at("Sim") = sdbus::ObjectPath(kSimPath);
    auto sim = kFullSim;
    sim.at(kSim).at("OperatorName") = std::string(name);
    sim.at(kSim).at("OperatorIdentifier") = std::string("2620");
    world.manager->add(kSimPath, sim);
    world.manager->add(kModemPath, modem);
    world.start();
    ASSERT_TRUE(world.log->waitForCount(metric::kSimFiles, 1));
    const auto files = filesIn(world);
    EXPECT_FALSE(files.contains(0x6F46)) << name;
    EXPECT_FALSE(files.contains(0x6FAD));
  }
}

TEST(Card, InThePrimarySlotIsReadWhereNoneIsNamed) {
  ModemWorld world({}, ModemWorld::kPatient);
  auto modem = modemOfRelease(18);
  modem.at(kModem).at("SimSlots") =
      std::vector<sdbus::ObjectPath>{sdbus::ObjectPath("/"), sdbus::ObjectPath(kSimPath)};
  modem.at(kModem).at("PrimarySimSlot") = std::uint32_t{1};
  world.manager->add(kSimPath, kFullSim);
  world.manager->add(kModemPath, modem);
  world.start();
  ASSERT_TRUE(world.log->waitForCount(metric::kEmmContext, 3));
  EXPECT_FALSE(world.has(metric::kSimFiles));
  world.manager->set(kModemPath, kModem, "PrimarySimSlot", std::uint32_t{2});
  EXPECT_TRUE(becomesTrue([&] { return world.has(metric::kSimFiles); }));
  world.manager->set(kModemPath, kModem, "PrimarySimSlot", std::uint32_t{3});
  EXPECT_TRUE(becomesTrue([&] { return !world.has(metric::kSimFiles); }));
}

TEST(GsmBand, IsThatOfTheCountryWhereANumberStandsForTwo) {
  const std::pair<const char*, std::optional<std::int32_t>> countries[] = {
      {"26201", kGsmDcs1800}, {"310410", kGsmPcs1900}, {"72405", std::nullopt}};
  for (const auto& [network, band] : countries) {
    ModemWorld world({}, ModemWorld::kPatient);
    auto modem = modemOfRelease(20, kOnGsm);
    modem.at(kModem3gpp).at("OperatorCode") = std::string(network);
    world.manager->setCells(
        {{{"cell-type", number(2)}, {"serving", flag(true)}, {"arfcn", number(600)}}});
    world.manager->add(kModemPath, modem);
    world.start();
    ASSERT_TRUE(world.log->waitFor<KCellularGsmScellInfo>(
        metric::kGsmScellInfo, [](const auto& cell) { return cell.hasArfcn(); }));
    const auto cell = world.log->newest<KCellularGsmScellInfo>(metric::kGsmScellInfo);
    EXPECT_EQ(cell->hasGsmBand(), band.has_value()) << network;
    EXPECT_EQ(cell->gsmBand(), band.value_or(0)) << network;
  }
}

FakeInterfaces modemThatReports(double rsrpDbm) {
  auto modem = modemOfRelease(20);
  modem.at(kSignal).at("Lte") = FakeDictionary{{"rsrp", level(rsrpDbm)}};
  return modem;
}

TEST(SignalReports, TakeThePlaceOfMeasuringEveryFewSeconds) {
  ModemWorld world({}, ModemWorld::kPatient);
  world.manager->add(kModemPath, modemThatReports(-80));
  world.start();
  ASSERT_TRUE(world.log->waitForCount(metric::kLteRsrpRsrqSinr, 6));
  EXPECT_THAT(world.manager->thresholdsAskedFor(), ElementsAre(1U));
  EXPECT_THAT(world.manager->ratesAskedFor(), IsEmpty());
  world.source.reset();
  EXPECT_THAT(world.manager->thresholdsAskedFor(), ElementsAre(1U, 0U));
}

TEST(SignalReports, ThatAreRefusedLeaveItMeasured) {
  CapturedSystemLog log;
  for (const char* error : {"org.freedesktop.ModemManager1.Error.Core.Unsupported",
                            "org.freedesktop.DBus.Error.AccessDenied"}) {
    ModemWorld world({}, ModemWorld::kPatient);
    world.manager->answer("SetupThresholds", {FakeAnswer::Kind::error, error});
    world.manager->add(kModemPath, modemThatReports(-80));
    world.start();
    EXPECT_TRUE(becomesTrue([&] { return world.manager->ratesAskedFor().size() == 1; }));
    EXPECT_EQ(world.manager->calls("SetupThresholds"), 1);
  }
  ASSERT_THAT(log.lines(), ::testing::SizeIs(1));
  EXPECT_THAT(log.lines()[0], ::testing::HasSubstr("Signal.SetupThresholds"));
}

TEST(SignalReports, ThatDoNotComeLeaveItMeasured) {
  ModemWorld world({}, ModemWorld::kPatient);
  world.manager->add(kModemPath, modemOfRelease(20));
  world.start();
  EXPECT_TRUE(becomesTrue([&] { return world.manager->ratesAskedFor().size() == 1; }));
  world.source.reset();
  EXPECT_THAT(world.manager->ratesAskedFor(), ElementsAre(1U, 0U));
}

}  // namespace
}  // namespace qel::testing
