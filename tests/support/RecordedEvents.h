// What stands in a recording, for a test.
#pragma once

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "recording/RecordingReader.h"

namespace qel::testing {

// All of it; a recording with a fault fails the test.
inline std::vector<RecordedEvent> eventsOf(const std::string& path) {
  RecordingFault fault;
  const auto reader = RecordingReader::open(path, RecordingReader::BadLines::fail, fault);
  std::vector<RecordedEvent> events;
  while (auto event = reader ? reader->next() : std::nullopt) events.push_back(std::move(*event));
  EXPECT_TRUE(reader && !reader->fault()) << fault.message;
  return events;
}

}  // namespace qel::testing
