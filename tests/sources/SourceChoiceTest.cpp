#include "sources/SourceChoice.h"

#include <gmock/gmock.h>

#include "recording/TemporaryFile.h"
#include "service/InProcessConnector.h"

namespace qel {
namespace {

using namespace sources;
using service::makeInProcessConnector;
using ::testing::HasSubstr;

template <class Choice>
Choice choiceOf(std::string_view text) {
  SourceError error;
  const auto choice = parseSourceChoice(text, error);
  if (choice && std::holds_alternative<Choice>(*choice)) return std::get<Choice>(*choice);
  ADD_FAILURE() << text << ": " << error.message;
  return {};
}

TEST(SourceChoice, ASimulatedDriveNeedsNothingMore) {
  const auto choice = choiceOf<SimulatedChoice>("simulated");
  EXPECT_EQ(choice.seed, 1U);
  EXPECT_EQ(choice.speed, 1);
  EXPECT_FALSE(choice.startMs);
}

TEST(SourceChoice, ASimulatedDriveTakesItsOptionsInAnyOrder) {
  const auto choice = choiceOf<SimulatedChoice>("simulated,start=1500000000000,speed=60,seed=42");
  EXPECT_EQ(choice.seed, 42U);
  EXPECT_EQ(choice.speed, 60);
  EXPECT_EQ(choice.startMs, 1500000000000U);
  EXPECT_EQ(choiceOf<SimulatedChoice>("simulated,speed=0.5").speed, 0.5);
}

TEST(SourceChoice, ARecordingNamesItsFile) {
  const auto choice = choiceOf<RecordingChoice>("recording:/tmp/a.jsonl");
  EXPECT_EQ(choice.path, "/tmp/a.jsonl");
  EXPECT_EQ(choice.speed, 1);
  EXPECT_FALSE(choice.loops);
}

TEST(SourceChoice, ARecordingTakesOptionsAfterItsFile) {
  for (const char* text : {"recording:a,speed=10,loop", "recording:a,loop,speed=10"}) {
    const auto choice = choiceOf<RecordingChoice>(text);
    EXPECT_EQ(choice.path, "a");
    EXPECT_EQ(choice.speed, 10);
    EXPECT_TRUE(choice.loops);
  }
}

TEST(SourceChoice, AFileNameMayHaveCommasAndColons) {
  EXPECT_EQ(choiceOf<RecordingChoice>("recording:C:a,b=1,c.gz,loop").path, "C:a,b=1,c.gz");
  EXPECT_EQ(choiceOf<RecordingChoice>("recording:a,loop,b").path, "a,loop,b");
}

TEST(SourceChoice, ADiagnosticsPortIsADeviceOrASocketOrWhateverIsThere) {
  EXPECT_EQ(choiceOf<DiagnosticsPlace>("diag").place, "");
  EXPECT_EQ(choiceOf<DiagnosticsPlace>("diag,radio=2").radio, 2U);
  const auto device = choiceOf<DiagnosticsPlace>("diag:/dev/ttyUSB0,radio=2");
  EXPECT_EQ(device.place, "/dev/ttyUSB0");
  EXPECT_EQ(device.radio, 2U);
  EXPECT_EQ(choiceOf<DiagnosticsPlace>("diag:@diag").place, "@diag");
}

TEST(SourceChoice, ARawLogIsAFileThatNeedNotBeThereYet) {
  const auto choice = choiceOf<DiagnosticsPlace>("diag:a,b.qmdl,radio=2,speed=10");
  EXPECT_EQ(choice.place, "a,b.qmdl");
  EXPECT_EQ(choice.speed, 10);
  EXPECT_EQ(choice.radio, 2U);
  EXPECT_FALSE(choiceOf<DiagnosticsPlace>("diag:a.mi2log").speed);
}

TEST(SourceChoice, APortAndModemManagerMayBeOneSource) {
  const auto plain = choiceOf<CombinedChoice>("diag+modem-manager");
  EXPECT_EQ(plain.port.place, "");
  EXPECT_TRUE(plain.isPortMissed);
  const auto named =
      choiceOf<CombinedChoice>("diag:/dev/ttyUSB0,radio=2+modem-manager:123456789012345,bus=a+b");
  EXPECT_EQ(named.port.place, "/dev/ttyUSB0");
  EXPECT_EQ(named.port.radio, 2U);
  EXPECT_EQ(named.manager.imei, "123456789012345");
  EXPECT_EQ(named.manager.bus, "a+b");
}

TEST(SourceChoice, AutoTakesBothAndMissesNoPort) {
  const auto choice = choiceOf<CombinedChoice>("auto");
  EXPECT_EQ(choice.port.place, "");
  EXPECT_EQ(choice.manager.bus, "system");
  EXPECT_FALSE(choice.isPortMissed);
  EXPECT_EQ(choiceOf<CombinedChoice>("auto,bus=session").manager.bus, "session");
}

TEST(SourceChoice, WhatIsNoSourceIsWrongUsageAndNamed) {
  const std::pair<const char*, const char*> bad[] = {
      {"", "unknown source \"\""},
      {"modem", "unknown source \"modem\""},
      {"simulatedx", "unknown source"},
      {"simulated,", "bad option \"\""},
      {"simulated,loop", "bad option \"loop\""},
      {"simulated,seed=", "bad option \"seed=\""},
      {"simulated,seed=-1", "bad option \"seed=-1\""},
      {"simulated,seed=1x", "bad option \"seed=1x\""},
      {"simulated,seed=99999999999999999999", "bad option"},
      {"simulated,speed=0", "bad option \"speed=0\""},
      {"simulated,speed=nan", "bad option"},
      {"simulated,speed=inf", "bad option"},
      {"simulated,speed=1e7", "bad option"},
      {"simulated,seed=1,,speed=2", "bad option \"\""},
      {"simulated,colour=5", "bad option \"colour=5\""},
      {"recording:", "no file named"},
      {"recording:,loop", "no file named"},
      {"recording:a,speed=0", "bad option \"speed=0\""},
      {"recording:a,speed=fast", "bad option \"speed=fast\""},
      {"diagx", "unknown source"},
      {"diag:", "no port or file named"},
      {"diag,radio=0", "bad option \"radio=0\""},
      {"diag,radio=x", "bad option \"radio=x\""},
      {"diag,colour=5", "bad option \"colour=5\""},
      {"diag,speed=2", "a port has no speed"},
      {"diag:/dev/ttyUSB0,speed=2", "a port has no speed"},
      {"diag:a.qmdl,speed=fast", "bad option \"speed=fast\""},
      {"diag:a.qmdl+modem-manager", "a file and ModemManager do not go together"},
      {"diag+modem-manager:x", "bad modem \":x\""},
      {"diag+nothing", "bad option"},
      {"autox", "unknown source"},
      {"auto,loop", "bad option \"loop\""},
  };
  for (const auto& [text, reason] : bad) {
    SourceError error;
    EXPECT_FALSE(parseSourceChoice(text, error)) << text;
    EXPECT_EQ(error.exitCode, 64) << text;
    EXPECT_THAT(error.message, HasSubstr(reason));
    EXPECT_EQ(error.message.find('\n'), std::string::npos);
  }
}

SourceError errorFor(const std::string& choice) {
  SourceError error;
  EXPECT_FALSE(makeInProcessConnector(choice, error)) << choice;
  return error;
}

TEST(MakeInProcessConnector, SaysByExitCodeWhyThereIsNoSource) {
  EXPECT_EQ(errorFor("nonsense").exitCode, 64);
  const SourceError missing = errorFor("recording:/nowhere/at.all");
  EXPECT_EQ(missing.exitCode, 66);
  EXPECT_EQ(missing.message, "/nowhere/at.all: No such file or directory");
  EXPECT_EQ(errorFor("recording:/tmp").exitCode, 66);
  const testing::TemporaryFile bad(".jsonl", "{\"time_ms\": 1, \"event\": \"trigger\"}\nno\n");
  const SourceError damaged = errorFor("recording:" + bad.path());
  EXPECT_EQ(damaged.exitCode, 65);
  EXPECT_THAT(damaged.message, HasSubstr(bad.path() + ":2: not JSON"));
  const testing::TemporaryFile empty;
  EXPECT_EQ(errorFor("recording:" + empty.path()).exitCode, 65);
}

TEST(MakeInProcessConnector, ARecordingThatWasCutOffIsPlayedUpToThere) {
  const testing::TemporaryFile file(".jsonl", "{\"time_ms\": 1, \"event\": \"trigger\"}\n{\"ti");
  SourceError error;
  EXPECT_TRUE(makeInProcessConnector("recording:" + file.path(), error)) << error.message;
}

}  // namespace
}  // namespace qel
