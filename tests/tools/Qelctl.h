// qelctl as its users run it.
#pragma once

#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <string>
#include <vector>

#include "base/Bytes.h"
#include "messages/runtime/PBCodable.h"
#include "support/Subprocess.h"

namespace qel::testing {

inline Outcome qelctl(const std::vector<std::string>& arguments, const std::string& input = "") {
  ::setenv("TZ", "UTC0", 1);
  return run(QEL_QELCTL, arguments, input);
}

inline std::vector<std::string> linesOf(const std::string& text) {
  std::vector<std::string> lines;
  std::size_t start = 0;
  for (std::size_t end = 0; (end = text.find('\n', start)) != std::string::npos; start = end + 1) {
    lines.push_back(text.substr(start, end - start));
  }
  if (start < text.size()) lines.push_back(text.substr(start));
  return lines;
}

inline std::string metricLine(std::int64_t identifier, ByteView payload) {
  return R"({"time_ms": 1, "event": "metric", "kKeyMetricID": )" + std::to_string(identifier) +
         R"(, "kKeyProfileID": 0, "kKeyPayload": ")" + base64Text(payload) + "\"}\n";
}

inline std::string metricLine(std::int64_t identifier, const PBCodable& message) {
  return metricLine(identifier, message.data());
}

inline constexpr const char* kTriggerLine =
    "{\"time_ms\": 2, \"event\": \"trigger\", \"kKeyTriggerID\": 8323091}\n";

// A recording that is gone with the test.
class TemporaryRecording {
 public:
  explicit TemporaryRecording(const std::string& content, const std::string& name = "test.jsonl")
      : _path(::testing::TempDir() + std::to_string(::getpid()) + "_" + name) {
    std::ofstream(_path, std::ios::binary) << content;
  }
  ~TemporaryRecording() { std::remove(_path.c_str()); }
  const std::string& path() const { return _path; }

 private:
  std::string _path;
};

}  // namespace qel::testing
