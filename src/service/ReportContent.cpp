#include "service/ReportContent.h"

#include <algorithm>
#include <array>

namespace qel::service {
namespace {

// A metric whose table draws a first row unasked.
struct FirstRow {
  std::uint32_t metric;
  Name list;  // whose first entry it draws; empty: the first value of the report itself
};

constexpr std::array kFirstRows = {
    FirstRow{20330, "inst_values"},  // LTE RSRP, RSRQ and SINR
    FirstRow{53506, "rx_info"},      // UMTS serving cell measurement
    FirstRow{54027, ""},             // LTE component carriers
    FirstRow{11788, ""},             // GSM serving cell
    FirstRow{53249, ""},             // GSM idle configuration
    FirstRow{53250, ""},             // GSM idle serving cell measurement
    FirstRow{53260, ""},             // GSM packet configuration
};

bool hasFirst(const FirstRow& row, const Dictionary& record) {
  if (row.list.view().empty()) return record.size() > 0;
  const Value* value = record.find(row.list);
  const List* list = value ? value->asList() : nullptr;
  return list && !list->empty();
}

}  // namespace

ReportContent reportContent(const MetricMessage& message, ByteView payload) {
  const auto row = std::ranges::find(kFirstRows, message.identifier, &FirstRow::metric);
  if (row == kFirstRows.end()) {
    return message.isReadable(payload) ? ReportContent::drawable : ReportContent::undecodable;
  }
  const auto record = message.describe(payload);
  if (!record) return ReportContent::undecodable;
  return hasFirst(*row, *record) ? ReportContent::drawable : ReportContent::missing;
}

}  // namespace qel::service
