// Recording from the viewer, over the connections that it really has.

#include <gtest/gtest.h>

#include <chrono>
#include <optional>
#include <set>
#include <thread>

#include "base/FileContent.h"
#include "base/LogSink.h"
#include "bus/ServiceProcess.h"
#include "recording/Mark.h"
#include "recording/RecordingReader.h"
#include "service/InProcessConnector.h"
#include "support/RecordedLines.h"
#include "tesk/bus/ServiceStatus.h"
#include "ui/pages/RecordingControl.h"

namespace qel::testing {
namespace {

using namespace std::chrono_literals;

class ViewerRecording : public ::testing::Test {
 protected:
  ViewerRecording() { setSystemLog(nullptr); }

  RecordingControl::Way way(std::shared_ptr<tesk::Connector> connector) const {
    return {std::move(connector), std::nullopt, contentOfFile(QEL_CONFIGURATION, 4096)};
  }
  // Waits until so many events are recorded, a minute at most.
  static bool records(RecordingControl& control, int events) {
    const auto end = std::chrono::steady_clock::now() + 60s;
    while (std::chrono::steady_clock::now() < end) {
      control.tick();
      const std::string& text = control.view().text;
      if (std::stoi(text.substr(text.find(", ") + 2)) >= events) return true;
      std::this_thread::sleep_for(20ms);
    }
    return false;
  }

  TemporaryFolder folder;
};

TEST_F(ViewerRecording, holdsWhatTheModemReportsBesideTheViewer) {
  sources::SourceError error;
  const auto connector = service::makeInProcessConnector("simulated,speed=20", error);
  ASSERT_TRUE(connector) << error.message;
  RecordingControl control{RecordingsFolder(folder.path()), way(connector)};
  control.start();
  ASSERT_TRUE(control.view().isRecording) << control.view().outcome;
  const std::string path = folder.path() + "/" + control.fileName();
  control.mark();
  EXPECT_TRUE(records(control, 300)) << control.view().text;
  control.stop();

  RecordingFault fault;
  const auto reader = RecordingReader::open(path, RecordingReader::BadLines::fail, fault);
  ASSERT_TRUE(reader) << fault.message;
  std::set<std::int64_t> metrics;
  std::size_t marks = 0;
  std::size_t events = 0;
  for (; auto event = reader->next(); ++events) {
    if (markOf(*event)) ++marks;
    if (const Value* metric = event->entries.find(kRecordedMetricKey)) {
      metrics.insert(*metric->asInt64());
    }
  }
  EXPECT_FALSE(reader->fault());
  EXPECT_GE(events, 300U);
  EXPECT_EQ(marks, 1U);
  EXPECT_GT(metrics.size(), 10U);
  EXPECT_TRUE(metrics.contains(MetricValidator::K_SIM_FILE_INFO)) << "asked for at the beginning";
}

TEST_F(ViewerRecording, goesOnWhenTheServiceOnTheBusComesBack) {
  const PrivateBus bus;
  std::optional<ServiceProcess> service(std::in_place, bus, "simulated,speed=20");
  ASSERT_TRUE(Client(bus, "first").waitForReachable(true));
  Client watch(bus, "watch");
  RecordingControl control{RecordingsFolder(folder.path()),
                           way(tesk::bus::makeBusConnector({bus.address()}))};
  control.start();
  ASSERT_TRUE(control.view().isRecording) << control.view().outcome;
  EXPECT_TRUE(records(control, 50)) << control.view().text;
  service.reset();
  ASSERT_TRUE(watch.waitForReachable(false));
  service.emplace(bus, "simulated,speed=20");
  ASSERT_TRUE(watch.waitForReachable(true));
  control.serviceCameBack();
  control.tick();
  const std::string before = control.view().text;
  EXPECT_TRUE(records(control, std::stoi(before.substr(before.find(", ") + 2)) + 50)) << before;
  control.stop();
  EXPECT_TRUE(control.view().outcome.starts_with("Kept as ")) << control.view().outcome;
  std::string why;
  const auto status = tesk::bus::readServiceStatus({bus.address()}, why);
  ASSERT_TRUE(status) << why;
  EXPECT_TRUE(status->configurations.empty()) << "nothing is asked for any more";
}

}  // namespace
}  // namespace qel::testing
