// Recording from the viewer, over the very connection that it has with --source simulated.

#include <gtest/gtest.h>

#include <chrono>
#include <set>
#include <thread>

#include "base/FileContent.h"
#include "base/LogSink.h"
#include "recording/Mark.h"
#include "recording/RecordingReader.h"
#include "service/InProcessConnector.h"
#include "support/RecordedLines.h"
#include "ui/pages/RecordingControl.h"

namespace qel::testing {
namespace {

using namespace std::chrono_literals;

TEST(ViewerRecording, holdsWhatTheModemReportsBesideTheViewer) {
  setSystemLog(nullptr);
  const TemporaryFolder folder;
  sources::SourceError error;
  const auto connector = service::makeInProcessConnector("simulated,speed=20", error);
  ASSERT_TRUE(connector) << error.message;
  const Bytes configuration = contentOfFile(QEL_CONFIGURATION, 4096);
  ASSERT_FALSE(configuration.empty());
  RecordingControl control{RecordingsFolder(folder.path()),
                           {connector, std::nullopt, configuration}};
  control.start();
  ASSERT_TRUE(control.view().isRecording) << control.view().outcome;
  const std::string path = folder.path() + "/" + control.fileName();
  control.mark();
  const auto end = std::chrono::steady_clock::now() + 60s;
  const auto isEnough = [&control] {
    control.tick();
    return std::stoi(control.view().text.substr(control.view().text.find(", ") + 2)) > 300;
  };
  while (!isEnough() && std::chrono::steady_clock::now() < end) std::this_thread::sleep_for(20ms);
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
  EXPECT_GT(events, 300U);
  EXPECT_EQ(marks, 1U);
  EXPECT_GT(metrics.size(), 10U);
  EXPECT_TRUE(metrics.contains(MetricValidator::K_SIM_FILE_INFO)) << "asked for at the beginning";
}

}  // namespace
}  // namespace qel::testing
