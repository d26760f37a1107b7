// What the service may ask ModemManager for, on a bus like the system's with the shipped policy.
// Needs root, who alone can become somebody else.

#include <gtest/gtest.h>

#include <array>
#include <chrono>
#include <thread>
#include <utility>

#include "bus/PolicyTrial.h"
#include "sources/modem_manager/FakeModemManager.h"

namespace qel::testing {
namespace {

using namespace std::chrono_literals;

const std::string kService = "org.freedesktop.ModemManager1";
const std::string kModem = kService + ".Modem";
const std::string kModemPath = "/org/freedesktop/ModemManager1/Modem/0";

// The worst of defaults: everybody may send every call, as ModemManager's own file lets them for
// all that polkit has a word about.
std::string openPolicy() {
  return "<policy context=\"default\"><allow user=\"*\"/><allow own=\"*\"/>"
         "<allow send_destination=\"*\"/><allow receive_sender=\"*\"/></policy>" +
         shippedPolicy(QEL_MODEM_POLICY);
}

class ModemPolicy : public ::testing::Test {
 protected:
  void SetUp() override {
    if (::geteuid() != 0) GTEST_SKIP() << "needs root";
    bus = std::make_unique<PrivateBus>(openPolicy());
    manager = std::make_unique<FakeModemManager>(bus->address());
  }

  // Whether the bus lets the call through; the fake has no such method, or refuses the arguments.
  int callAs(const char* user, const std::string& interface, const std::string& member) const {
    return as(user, kOtherGroup, *bus, {"call", kService, kModemPath, interface, member});
  }

  std::unique_ptr<PrivateBus> bus;
  std::unique_ptr<FakeModemManager> manager;
};

// Once the service could have switched the modem off, reset it or guessed its PIN.
TEST_F(ModemPolicy, KeepsTheServiceFromAllThatChangesAModem) {
  const std::array<std::pair<std::string, std::string>, 33> forbidden = {{
      {kModem, "Enable"},
      {kModem, "Reset"},
      {kModem, "FactoryReset"},
      {kModem, "SetPowerState"},
      {kModem, "SetPrimarySimSlot"},
      {kModem, "SetCurrentModes"},
      {kModem, "SetCurrentBands"},
      {kModem, "SetCurrentCapabilities"},
      {kModem, "CreateBearer"},
      {kModem, "DeleteBearer"},
      {kModem, "Command"},
      {kModem + ".Simple", "Connect"},
      {kModem + ".Simple", "Disconnect"},
      {kModem + ".Modem3gpp", "Register"},
      {kModem + ".Modem3gpp", "Scan"},
      {kModem + ".Modem3gpp", "SetInitialEpsBearerSettings"},
      {kModem + ".Modem3gpp", "DisableFacilityLock"},
      {kModem + ".Modem3gpp.Ussd", "Initiate"},
      {kModem + ".Location", "SetSuplServer"},
      {kModem + ".Location", "InjectAssistanceData"},
      {kModem + ".Messaging", "Create"},
      {kModem + ".Messaging", "Delete"},
      {kModem + ".Voice", "CreateCall"},
      {kModem + ".Firmware", "Select"},
      {kService + ".Sim", "SendPin"},
      {kService + ".Sim", "SendPuk"},
      {kService + ".Sim", "EnablePin"},
      {kService + ".Sim", "ChangePin"},
      {kService + ".Bearer", "Connect"},
      {kService + ".Bearer", "Disconnect"},
      {kService, "InhibitDevice"},
      {kService, "SetLogging"},
      {"org.freedesktop.DBus.Properties", "Set"},
  }};
  for (const auto& [interface, member] : forbidden) {
    EXPECT_EQ(callAs(kServiceUser, interface, member), denied) << interface << '.' << member;
  }
}

TEST_F(ModemPolicy, LetsTheServiceAskWhatItAsks) {
  const std::array<std::pair<std::string, std::string>, 8> wanted = {{
      {"org.freedesktop.DBus.ObjectManager", "GetManagedObjects"},
      {"org.freedesktop.DBus.Properties", "GetAll"},
      {"org.freedesktop.DBus.Properties", "Get"},
      {kModem, "GetCellInfo"},
      {kModem + ".Location", "GetLocation"},
      {kModem + ".Location", "Setup"},
      {kModem + ".Signal", "Setup"},
      {kModem + ".Signal", "SetupThresholds"},
  }};
  for (const auto& [interface, member] : wanted) {
    EXPECT_NE(callAs(kServiceUser, interface, member), denied) << interface << '.' << member;
  }
}

TEST_F(ModemPolicy, ChangesNothingForOthers) {
  EXPECT_NE(callAs("nobody", kModem, "Enable"), denied);
  EXPECT_NE(callAs("nobody", kService + ".Sim", "SendPin"), denied);
}

// The source itself, so that a call that it learns to make is not forgotten here.
TEST_F(ModemPolicy, IsEnoughForTheSource) {
  using Dictionary = FakeDictionary;
  manager->add(kModemPath,
               {{kModem,
                 {{"State", std::int32_t{8}},
                  {"AccessTechnologies", std::uint32_t{1U << 14}},
                  {"Sim", sdbus::ObjectPath("/sim/0")},
                  {"Bearers", std::vector<sdbus::ObjectPath>()}}},
                {kModem + ".Signal", {{"Rate", std::uint32_t{0}}, {"Lte", Dictionary()}}},
                {kModem + ".Location",
                 {{"Capabilities", std::uint32_t{1}},
                  {"Enabled", std::uint32_t{0}},
                  {"SignalsLocation", false}}}});
  const std::array<std::string, 4> calls = {"GetCellInfo", "GetLocation", "Setup",
                                            "Location.Setup"};
  const ChildProcess source(launchAs(kServiceUser, kOtherGroup, *bus, {"modem"}));
  const auto end = std::chrono::steady_clock::now() + 30s;
  for (const std::string& call : calls) {
    while (manager->calls(call) == 0 && std::chrono::steady_clock::now() < end) {
      std::this_thread::sleep_for(5ms);
    }
  }
  for (const std::string& call : calls) EXPECT_GT(manager->calls(call), 0) << call;
}

}  // namespace
}  // namespace qel::testing
