// What a line of a recording costs in memory is bound by its size, whatever is in it.
#include <gtest/gtest.h>

#include <string>

#include "recording/EventLine.h"
#include "recording/RecordingReader.h"
#include "recording/TemporaryFile.h"
#include "support/CountedMemory.h"

namespace qel {
namespace {

using testing::CountedMemory;
using testing::TemporaryFile;

constexpr std::size_t kLineBytes = 1024 * 1024;
// Two chunks of the file, and the inflating library's own memory.
constexpr std::size_t kOnceBytes = 256 * 1024;

std::size_t bytesToRead(const std::string& content) {
  const TemporaryFile file(".jsonl", content);
  const CountedMemory memory;
  RecordingFault fault;
  const auto reader = RecordingReader::open(file.path(), RecordingReader::BadLines::skip, fault);
  while (reader->next()) {
  }
  return memory.most();
}

// Took thirty times a line of 16 MB.
TEST(LineMemory, ALineTakesAtMostTwentyTimesTheLongestOne) {
  for (const char* start : {"[", "{", "[{"}) {
    for (const char* part : {"0,", "[],", "{},", "\"\",", "{\"\":0},", "\"a\":1,", "[",
                             "{\"\":", "\"aaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaa\","}) {
      std::string line = R"({"time_ms": 1, "event": "trigger", "x": )" + std::string(start);
      while (line.size() + 64 < kLineBytes) line += part;
      EXPECT_LE(bytesToRead(line + "\n"), 20 * kLineBytes + kOnceBytes) << start << part;
    }
  }
}

TEST(LineMemory, APayloadTakesAtMostTenTimesItsLine) {
  std::string line = R"({"time_ms": 1, "event": "metric", "kKeyMetricID": 1, "kKeyPayload": ")";
  line += std::string((kLineBytes - 200) / 4 * 4, 'A') + "\"";
  EXPECT_LE(bytesToRead(line + "}\n"), 10 * kLineBytes + kOnceBytes);
  EXPECT_LE(bytesToRead(line + ", \"x\": null}\n"), 10 * kLineBytes + kOnceBytes) << "not plain";
}

TEST(LineMemory, AnEndlessLineTakesNoMoreThanTheLongest) {
  EXPECT_LE(bytesToRead(std::string(64 * kLineBytes, '[') + "\n"), 4 * kLineBytes + kOnceBytes);
}

TEST(LineMemory, WhatDecompressesToMuchTakesLittle) {
  const std::string bomb = testing::gzipped(std::string(64 * kLineBytes, '['));
  EXPECT_LE(bytesToRead(bomb), 4 * kLineBytes + kOnceBytes);
}

}  // namespace
}  // namespace qel
