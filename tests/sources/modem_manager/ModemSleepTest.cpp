// The machine sleeps, and the modem is elsewhere when it wakes.
#include <gtest/gtest.h>

#include <atomic>

#include "messages/lte_serving.h"
#include "sources/Metrics.h"
#include "sources/modem_manager/ModemWorld.h"

namespace qel::testing {
namespace {

using namespace std::chrono_literals;

std::atomic<std::chrono::milliseconds> asleep = 0ms;

// Nothing is asked for a second time before half a minute is over, but for a reason.
constexpr sources::ModemTiming kRarely{30s, 30s, [] { return asleep.load(); }};

std::vector<FakeDictionary> cellWithCode(const char* code) {
  return {{{"cell-type", number(5)},
           {"serving", flag(true)},
           {"operator-id", text("26201")},
           {"tac", text("A1B2")},
           {"ci", text("1C2D3FF")},
           {"physical-ci", text(code)},
           {"earfcn", number(1300)},
           {"rsrp", level(-95)},
           {"rsrq", level(-10.5)}}};
}

class SleepingMachine : public ::testing::Test {
 protected:
  SleepingMachine() {
    world.manager->setCells(cellWithCode("A"));
    world.manager->add(kModemPath, modemWithRsrp(-95));
    world.start();
  }
  ~SleepingMachine() override { asleep = 0ms; }

  bool comesToCell(std::uint32_t code) const {
    return world.log->waitFor<KCellularLteScellInfo>(
        metric::kLteScellInfo, [code](const auto& cell) { return cell.phyCellId() == code; });
  }
  // Something that wakes the source's thread.
  void stir(double rsrpDbm) {
    world.manager->set(kModemPath, kSignal, "Lte", FakeDictionary{{"rsrp", level(rsrpDbm)}});
  }

  ModemWorld world{{}, kRarely};
};

TEST_F(SleepingMachine, AsksTheModemAtOnceWhenItIsAwakeAgain) {
  ASSERT_TRUE(comesToCell(0xA));
  world.manager->setCells(cellWithCode("B"));
  stir(-94);
  ASSERT_TRUE(world.waitForRsrp(-94));
  EXPECT_EQ(world.manager->calls("GetCellInfo"), 1) << "it did not sleep yet";
  asleep = 8h;
  stir(-93);
  EXPECT_TRUE(comesToCell(0xB));
  EXPECT_TRUE(world.waitForRsrp(-93));
}

TEST_F(SleepingMachine, KnowsNothingOfBeforeItsSleep) {
  ASSERT_TRUE(comesToCell(0xA));
  world.manager->answer("GetCellInfo", {FakeAnswer::Kind::never, ""});
  asleep = 8h;
  stir(-93);
  EXPECT_TRUE(world.log->waitFor<KCellularLteScellInfo>(
      metric::kLteScellInfo, [](const auto& cell) { return !cell.hasPhyCellId(); }));
}

}  // namespace
}  // namespace qel::testing
