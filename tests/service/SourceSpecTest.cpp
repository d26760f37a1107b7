#include "service/sources/SourceSpec.h"

#include <gmock/gmock.h>

#include "recording/TemporaryFile.h"
#include "service/InProcessConnector.h"

namespace qel {
namespace {

using namespace service;
using ::testing::HasSubstr;

template <class Spec>
Spec specOf(std::string_view text) {
  SourceError error;
  const auto spec = parseSourceSpec(text, error);
  if (spec && std::holds_alternative<Spec>(*spec)) return std::get<Spec>(*spec);
  ADD_FAILURE() << text << ": " << error.message;
  return {};
}

TEST(SourceSpec, ASimulatedDriveNeedsNothingMore) {
  const auto spec = specOf<SimulatedSpec>("simulated");
  EXPECT_EQ(spec.seed, 1U);
  EXPECT_EQ(spec.speed, 1);
  EXPECT_FALSE(spec.startMs);
}

TEST(SourceSpec, ASimulatedDriveTakesItsOptionsInAnyOrder) {
  const auto spec = specOf<SimulatedSpec>("simulated,start=1500000000000,speed=60,seed=42");
  EXPECT_EQ(spec.seed, 42U);
  EXPECT_EQ(spec.speed, 60);
  EXPECT_EQ(spec.startMs, 1500000000000U);
  EXPECT_EQ(specOf<SimulatedSpec>("simulated,speed=0.5").speed, 0.5);
}

TEST(SourceSpec, ARecordingNamesItsFile) {
  const auto spec = specOf<RecordingSpec>("recording:/tmp/a.jsonl");
  EXPECT_EQ(spec.path, "/tmp/a.jsonl");
  EXPECT_EQ(spec.speed, 1);
  EXPECT_FALSE(spec.loops);
}

TEST(SourceSpec, ARecordingTakesOptionsAfterItsFile) {
  for (const char* text : {"recording:a,speed=10,loop", "recording:a,loop,speed=10"}) {
    const auto spec = specOf<RecordingSpec>(text);
    EXPECT_EQ(spec.path, "a");
    EXPECT_EQ(spec.speed, 10);
    EXPECT_TRUE(spec.loops);
  }
}

TEST(SourceSpec, AFileNameMayHaveCommasAndColons) {
  EXPECT_EQ(specOf<RecordingSpec>("recording:C:a,b=1,c.gz,loop").path, "C:a,b=1,c.gz");
  EXPECT_EQ(specOf<RecordingSpec>("recording:a,loop,b").path, "a,loop,b");
}

TEST(SourceSpec, WhatIsNoSourceIsWrongUsageAndNamed) {
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
  };
  for (const auto& [text, reason] : bad) {
    SourceError error;
    EXPECT_FALSE(parseSourceSpec(text, error)) << text;
    EXPECT_EQ(error.exitCode, 64) << text;
    EXPECT_THAT(error.message, HasSubstr(reason));
    EXPECT_EQ(error.message.find('\n'), std::string::npos);
  }
}

SourceError errorFor(const std::string& spec) {
  SourceError error;
  EXPECT_FALSE(makeInProcessConnector(spec, error)) << spec;
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
