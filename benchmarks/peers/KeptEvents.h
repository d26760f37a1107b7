// A metric event as one would take it who counts instructions: a record a metric that is read into
// again, one buffer for the lines, and the text of the time kept for a minute. Derives nothing for
// the screens.
#pragma once

#include <array>
#include <memory>
#include <optional>

#include "Payload.h"
#include "base/LogSink.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "metrics/DispatchTable.h"
#include "peers/KeptTime.h"
#include "peers/Line.h"

namespace qel::bench {

// A Record is made for a metric; it reads a payload and gives the time of the report, or nothing,
// and appends its text with that time.
template <class Record>
class KeptValidator {
 public:
  void take(std::int64_t metric, ByteView payload) {
    _line.clear();
    _line.literal("Metric ID in Hex = ");
    _line.upperHexadecimal(metric);
    LogSink& out = standardOutput();
    out.write(_line.view());
    const DispatchRow* row = findDispatchRow(metric);
    if (!row) return out.write("I dont care for this Metric");

    auto& record = _records[static_cast<std::size_t>(row - dispatchTable().data())];
    if (!record) record.emplace(static_cast<std::uint32_t>(metric - kMetricEventBase));
    const auto time = record->read(payload);
    _line.clear();
    _line.append(row->logText);
    record->appendText(time ? _time.at(*time) : std::string_view(), _line);
    out.write(_line.view());
    out.write("Received Valid Metric");
  }

 private:
  std::array<std::optional<Record>, 29> _records;  // the newest of each metric
  Line _line;
  KeptTime _time;
};

template <class Record>
auto keptEvents(const std::vector<Payload>& payloads) {
  const auto validator = std::make_shared<KeptValidator<Record>>();
  return [&payloads, validator](std::size_t i) {
    validator->take(payloads[i].metric + kMetricEventBase, payloads[i].bytes);
  };
}

}  // namespace qel::bench
