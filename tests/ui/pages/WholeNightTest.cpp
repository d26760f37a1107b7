// Service, viewer and recorder over a night in which the device sleeps for eight hours in four
// pieces: the time of day and the time since the start go on meanwhile, every steady clock stands
// still.

#include <gtest/gtest.h>

#include <algorithm>

#include "history/ToldHappening.h"
#include "recording/Sleep.h"
#include "service/InProcessConnector.h"
#include "service/StateFile.h"
#include "service/support/Configuration.h"
#include "service/support/FakeSource.h"
#include "support/RecordedEvents.h"
#include "support/RecordedLines.h"
#include "ui/kit/RunLoop.h"
#include "ui/pages/Freshness.h"
#include "ui/pages/NowPage.h"
#include "ui/pages/RecordingControl.h"
#include "ui/pages/Scene.h"

namespace qel::testing {
namespace {

using namespace std::chrono_literals;

constexpr int kSleeps = 4;
constexpr auto kSleep = 2h;
constexpr auto kAwake = 60s;  // before each sleep and after the last
constexpr auto kRedraw = 5s;
constexpr std::uint32_t kLevel = MetricValidator::K_LTE_RSRP_RSRQ_SINR - 0x3C0000;

Bytes level(std::int32_t rsrpDbm) {
  auto average = std::make_shared<RsrpRsrqSinr>();
  average->setRsrp0(rsrpDbm);
  average->setRsrq0(-9);
  KCellularLteRsrpRsrqSinr report;
  report.setAvgValues(average);
  report.addInstValues(average);
  return report.data();
}

class WholeNight : public ::testing::Test {
 protected:
  struct Redraw {
    void fire() { ++fired; }
    int fired = 0;
  };

  WholeNight() {
    serve();
    tesk::Message reply;
    EXPECT_EQ(
        viewer->performCommand(tesk::kCommandAddConfiguration, addRequest(wishes()), reply).code,
        0);
    viewer->eventsOn();
    timers.addTimer(std::make_shared<RepeatingTimer>(kRedraw, redraw, &Redraw::fire), awake);
    control.emplace(
        RecordingsFolder(folder.path()), RecordingControl::Way{connector, std::nullopt, wishes()},
        scene.clock, [this] { return awake + asleep; }, [this] { return asleep; });
    control->start();
    EXPECT_TRUE(control->view().isRecording) << control->view().outcome;
  }
  ~WholeNight() override { scene.validator.validator->setObserver(nullptr); }

  static Bytes wishes() { return configuration({{kLevel}}); }

  // The service, as it is after a start, and the viewer's connection to it.
  void serve() {
    core = service::ServiceCore::create(std::make_unique<FakeSource>(source), scene.clock,
                                        std::make_unique<service::StateFile>(state.path()));
    connector = service::makeInProcessConnector(core);
    viewer = connector->connect("qelwatch", [this](std::string_view, const tesk::Message& event) {
      scene.validator.validator->metricsDidUpdate(event.entries());
    });
  }
  void stopService() {
    control.reset();
    viewer.reset();
    connector.reset();
    core.reset();
  }

  void pass(std::chrono::milliseconds time) {
    scene.clock.timeMs += static_cast<std::uint64_t>(time.count());
    awake += time;
  }
  void sleep() {
    scene.clock.timeMs += static_cast<std::uint64_t>(std::chrono::milliseconds(kSleep).count());
    asleep += kSleep;
  }
  void report() { source->send(metricEvent(kLevel, scene.clock.timeMs, level(-90))); }
  // A report, a look at the timers and at the recording each second.
  void stayAwake() {
    for (auto passed = 0s; passed < kAwake; passed += 1s) {
      report();
      pass(1s);
      if (*timers.nextDue() <= awake) timers.fireDue(awake);
      control->tick();
    }
  }
  std::vector<RecordedEvent> stopAndRead() {
    const std::string path = folder.path() + "/" + control->fileName();
    control->stop();
    return eventsOf(path);
  }

  const TemporaryFolder folder;
  const TemporaryFolder state;
  Scene scene;
  std::chrono::steady_clock::time_point awake{1h};
  std::chrono::milliseconds asleep{30min};  // before all this
  const std::shared_ptr<Redraw> redraw = std::make_shared<Redraw>();
  RunLoop timers;
  const std::shared_ptr<FakeSourceState> source = std::make_shared<FakeSourceState>();
  std::shared_ptr<service::ServiceCore> core;
  std::shared_ptr<tesk::Connector> connector;
  std::unique_ptr<tesk::Transport> viewer;
  std::optional<RecordingControl> control;
};

TEST_F(WholeNight, tellsTheRightAgesAndFiresNoTimerForTheTimeAsleep) {
  scene.cell({});
  for (int i = 0; i < kSleeps; ++i) {
    stayAwake();
    const int before = redraw->fired;
    sleep();
    if (*timers.nextDue() <= awake) timers.fireDue(awake);
    EXPECT_LE(redraw->fired, before + 1);
    const NowPage page = nowPage(scene.viewpoint(), {});
    EXPECT_EQ(page.level.age, "2 h old");
    EXPECT_EQ(page.ageMs, std::chrono::milliseconds(kSleep + 1s).count());
    EXPECT_FALSE(freshness({}, scene.viewpoint()).isFlowing);
    report();
    EXPECT_FALSE(nowPage(scene.viewpoint(), {}).level.isOld);
    EXPECT_TRUE(freshness({}, scene.viewpoint()).isFlowing);
  }
  EXPECT_LE(redraw->fired, kSleeps * (kAwake / kRedraw + 1));
  EXPECT_EQ(std::ranges::count(scene.history.happenings(), HappeningKind::gap, &Happening::kind),
            kSleeps);
}

TEST_F(WholeNight, isRecordedWholeAndSaysWhereItSlept) {
  for (int i = 0; i < kSleeps; ++i) {
    stayAwake();
    sleep();
    control->tick();
  }
  stayAwake();
  EXPECT_TRUE(control->view().text.starts_with("8:05:00, ")) << control->view().text;
  std::vector<std::chrono::milliseconds> sleeps;
  std::size_t reports = 0;
  for (const RecordedEvent& event : stopAndRead()) {
    if (event.kind == RecordedKind::metric) ++reports;
    if (const auto slept = sleepOf(event)) sleeps.push_back(*slept);
  }
  EXPECT_EQ(sleeps, std::vector<std::chrono::milliseconds>(kSleeps, kSleep));
  EXPECT_EQ(reports, (kSleeps + 1) * static_cast<std::size_t>(kAwake / 1s));
}

TEST_F(WholeNight, losesNothingThatWasSet) {
  const auto asked = core->configurationSizes();
  EXPECT_EQ(asked.size(), 2U) << "the viewer's and the recorder's";
  for (int i = 0; i < kSleeps; ++i) {
    stayAwake();
    sleep();
  }
  EXPECT_EQ(core->configurationSizes(), asked);
  EXPECT_TRUE(control->view().isRecording);
  const auto reports = core->status().delivered;
  report();
  EXPECT_EQ(core->status().delivered, reports + 2) << "to the viewer and to the recorder";

  control->stop();
  const auto kept = core->configurationSizes();
  EXPECT_EQ(kept, (std::map<std::int64_t, std::uint32_t>{{2, 1}}));
  stopService();
  serve();
  EXPECT_EQ(core->configurationSizes(), kept) << "a start of the service in the morning";
}

}  // namespace
}  // namespace qel::testing
