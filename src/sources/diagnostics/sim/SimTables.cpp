#include "sources/diagnostics/sim/SimTables.h"

#include <array>
#include <memory>

#include "messages/runtime/MessageReader.h"
#include "messages/sim.h"
#include "sources/Metrics.h"
#include "sources/diagnostics/sim/CardTraceLog.h"

namespace qel::diagnostics {
namespace {

std::optional<Bytes> simFiles(const Picture& picture, std::uint64_t timeMs) {
  if (picture.sim.files.empty()) return std::nullopt;
  KCellularSimCardFiles message;
  message.setTimestamp(timeMs);
  for (const SimFile& file : picture.sim.files) {
    auto entry = makeMessage<ElementaryFile>();
    entry->setEfId(file.identifier);
    entry->setContent(file.content);
    message.addEfList(entry);
  }
  return message.data();
}

constexpr std::array kLogs = {LogRow{0x1098, "SIM card", readCardTrace, nullptr}};
constexpr std::array kReports = {ReportRow{metric::kSimFiles, simFiles}};

}  // namespace

std::span<const LogRow> simLogs() { return kLogs; }

std::span<const EventRow> simEvents() { return {}; }

std::span<const ReportRow> simReports() { return kReports; }

void age(SimPicture& /*picture*/, std::uint64_t /*nowMs*/) {}

}  // namespace qel::diagnostics
