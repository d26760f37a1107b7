#include "sources/diagnostics/port/PortFinder.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <vector>

#include "sources/diagnostics/DiagnosticsCondition.h"
#include "support/diagnostics/FakeRouter.h"
#include "support/diagnostics/PlayedSearch.h"
#include "support/diagnostics/PseudoModem.h"

namespace qel::diagnostics {
namespace {

using Kind = PortTrouble::Kind;
using test::PlayedPorts;
using test::PlayedSearch;
using test::PseudoModem;

constexpr const char* kModem = "/sys/devices/usb1/1-2";
constexpr const char* kOther = "/sys/devices/usb1/1-3";

struct Finding {
  explicit Finding(std::string wish = "")
      : finder(std::move(wish), std::make_unique<PlayedSearch>(ports)) {}

  std::string opened() {
    open = nullptr;
    open = finder.open();
    return open ? finder.port().address : "";
  }

  std::shared_ptr<PlayedPorts> ports = std::make_shared<PlayedPorts>();
  PortFinder finder;
  std::unique_ptr<DiagPort> open;
};

TEST(PortFinder, TakesTheFirstPortThatCanBeOpened) {
  PseudoModem modem;
  Finding finding;
  finding.ports->set({{"/dev/gone", kOther}, {modem.path(), kModem}});
  EXPECT_EQ(finding.opened(), modem.path());
  EXPECT_EQ(finding.finder.port().modem, kModem);
}

TEST(PortFinder, TakesTheRouterWhenThereIsNoDevice) {
  test::FakeRouter router;
  Finding finding;
  finding.ports->set({{router.address(), ""}});
  EXPECT_EQ(finding.opened(), router.address());
}

TEST(PortFinder, TakesTheWishedPortAlone) {
  PseudoModem modem;
  PseudoModem other;
  Finding finding(modem.path());
  finding.ports->set({{other.path(), kOther}, {modem.path(), kModem}});
  EXPECT_EQ(finding.opened(), modem.path());
  Finding without("/dev/gone");
  without.ports->set({{other.path(), kOther}});
  EXPECT_EQ(without.opened(), "");
  EXPECT_EQ(without.finder.port().address, "/dev/gone");
  EXPECT_EQ(without.finder.trouble().words, "No such file or directory");
}

TEST(PortFinder, TakesAPortThatNobodyKnowsWhenItIsWished) {
  PseudoModem modem;
  Finding finding(modem.path());
  EXPECT_EQ(finding.opened(), modem.path());
}

TEST(PortFinder, FollowsTheModemToAnotherName) {
  auto modem = std::make_unique<PseudoModem>();
  PseudoModem back;
  PseudoModem other;
  Finding finding(modem->path());
  finding.ports->set({{other.path(), kOther}, {modem->path(), kModem}});
  ASSERT_EQ(finding.opened(), modem->path());
  modem.reset();
  finding.ports->set({{other.path(), kOther}, {back.path(), kModem}});
  EXPECT_EQ(finding.opened(), back.path());
}

TEST(PortFinder, FollowsTheModemWhenAnotherHasTakenItsName) {
  PseudoModem first;
  PseudoModem second;
  Finding finding(first.path());
  finding.ports->set({{first.path(), kModem}});
  ASSERT_EQ(finding.opened(), first.path());
  finding.ports->set({{first.path(), kOther}, {second.path(), kModem}});
  EXPECT_EQ(finding.opened(), second.path());
}

TEST(PortFinder, KnowsOtherPortsFromOtherNews) {
  Finding finding;
  finding.ports->set({{"/dev/gone", kOther}});
  EXPECT_EQ(finding.opened(), "");
  finding.ports->set({{"/dev/gone", kOther}});
  EXPECT_FALSE(finding.finder.hasChanged());
  PseudoModem modem;
  finding.ports->set({{"/dev/gone", kOther}, {modem.path(), kModem}});
  EXPECT_TRUE(finding.finder.hasChanged());
  EXPECT_EQ(finding.opened(), modem.path());
}

TEST(PortFinder, KnowsWhenAWishedPortComesThatNobodyLists) {
  const PseudoModem modem;
  const std::string path = ::testing::TempDir() + "qel-port-" + std::to_string(::getpid());
  Finding finding(path);
  ASSERT_EQ(finding.opened(), "");
  EXPECT_FALSE(finding.finder.hasChanged());
  std::filesystem::create_symlink(modem.path(), path);
  EXPECT_TRUE(finding.finder.hasChanged());
  EXPECT_EQ(finding.opened(), path);
  std::filesystem::remove(path);
}

TEST(PortFinder, SaysWhyThereIsNone) {
  Finding finding;
  EXPECT_EQ(finding.opened(), "");
  EXPECT_EQ(finding.finder.trouble().kind, Kind::absent);
  finding.ports->set({{"/dev/only-udev-sees-it", kModem}, {"@qel-no-router", ""}});
  EXPECT_EQ(finding.opened(), "");
  EXPECT_EQ(finding.finder.trouble().kind, Kind::denied);
  EXPECT_EQ(finding.finder.port().address, "/dev/only-udev-sees-it");
}

TEST(PortAdvice, SaysWhatToDo) {
  const FoundPort port{"/dev/ttyUSB0", kModem};
  const auto advice = [&](Kind kind) { return adviceWithoutPort(port, {kind, "some words"}); };
  EXPECT_NE(advice(Kind::held).find("ID_MM_PORT_IGNORE"), std::string::npos);
  EXPECT_NE(advice(Kind::denied).find("DIAGNOSTICS PORT in basebandd(8)"), std::string::npos);
  EXPECT_NE(advice(Kind::failed).find("some words"), std::string::npos);
  EXPECT_NE(advice(Kind::absent).find("/dev/ttyUSB0"), std::string::npos);
  EXPECT_EQ(conditionWithoutPort({Kind::held, ""}).state, "held");
  EXPECT_EQ(conditionWithoutPort({Kind::denied, ""}).state, "no-rights");
}

// The machine of ports.umockdev, where this program runs under umockdev-run.
TEST(UdevPortSearch, FindsTerminalsAndNodesAndTheirModems) {
  if (std::getenv("UMOCKDEV_DIR") == nullptr) GTEST_SKIP() << "not run by umockdev-run";
  const std::vector<FoundPort> expected = {
      {"/dev/ttyUSB0", "/sys/devices/pci0000:00/0000:00:14.0/usb1/1-2"},
      {"/dev/wwan0qcdm0", "/sys/devices/pci0000:00/0000:01:00.0"},
      {"@diag", ""},
  };
  EXPECT_EQ(makeUdevPortSearch()->ports(), expected);
}

TEST(UdevPortSearch, OffersTheRouterLast) {
  const auto search = makeUdevPortSearch();
  const auto ports = search->ports();
  ASSERT_FALSE(ports.empty());
  EXPECT_EQ(ports.back().address, "@diag");
  EXPECT_EQ(search->modemOf("/dev/null"), "");
  EXPECT_EQ(search->modemOf("/dev/gone"), "");
  search->clear();
}

}  // namespace
}  // namespace qel::diagnostics
