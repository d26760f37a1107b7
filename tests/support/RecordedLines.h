// Recordings that are written for a test.
#pragma once

#include <stdlib.h>

#include <cstdint>
#include <filesystem>
#include <fstream>
#include <string>

#include "base/Bytes.h"
#include "messages/lte_serving.h"
#include "metrics/MetricValidator.h"
#include "recording/EventLine.h"

namespace qel::testing {

inline RecordedEvent metricEvent(std::uint64_t timeMs, std::int64_t metric, Bytes payload) {
  return {timeMs,
          RecordedKind::metric,
          {{kRecordedMetricKey, metric}, {kRecordedPayloadKey, std::move(payload)}}};
}

// A report of an LTE serving cell.
inline RecordedEvent lteCell(std::uint64_t timeMs, std::uint32_t code) {
  KCellularLteScellInfo message;
  message.setPhyCellId(code);
  message.setDlFreq(1300);
  message.setCellId(1000 + code);
  return metricEvent(timeMs, MetricValidator::K_LTE_SCELL_INFO, message.data());
}

inline std::string lineOf(const RecordedEvent& event) { return eventLine(event) + "\n"; }

// A folder that is gone with the test.
class TemporaryFolder {
 public:
  TemporaryFolder() {
    std::string pattern = (std::filesystem::temp_directory_path() / "qel-XXXXXX").string();
    _path = ::mkdtemp(pattern.data());
  }
  ~TemporaryFolder() { std::filesystem::remove_all(_path); }
  const std::string& path() const { return _path; }
  // The path of the file of that name, which is written with this content.
  std::string file(const std::string& name, const std::string& content) const {
    std::ofstream(_path + "/" + name, std::ios::binary) << content;
    return _path + "/" + name;
  }
  bool has(const std::string& name) const { return std::filesystem::exists(_path + "/" + name); }

 private:
  std::string _path;
};

}  // namespace qel::testing
