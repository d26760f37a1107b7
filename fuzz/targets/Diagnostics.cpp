// What a modem may say on its diagnostics port, packet by packet, through the readers to reports.

#include <vector>

#include "fuzz/support/Law.h"
#include "fuzz/support/Target.h"
#include "messages/catalogue/MetricMessages.h"
#include "sources/diagnostics/DiagnosticsReader.h"
#include "sources/diagnostics/gsm/GsmTables.h"
#include "sources/diagnostics/lte/LteTables.h"
#include "sources/diagnostics/nas/NasTables.h"
#include "sources/diagnostics/sim/SimTables.h"
#include "sources/diagnostics/umts/UmtsTables.h"

namespace qel::fuzz {
namespace {

using namespace diagnostics;

constexpr std::size_t kMostPackets = 64;
constexpr std::uint64_t kBeginMs = 1'790'000'000'000;
constexpr std::uint16_t kNobodysCode = 0xFFFF;

template <class Row, class Key>
std::vector<Key> keysOf(std::initializer_list<std::span<const Row>> tables, Key Row::*key) {
  std::vector<Key> keys;
  for (const auto table : tables) {
    for (const Row& row : table) keys.push_back(row.*key);
  }
  return keys;
}

const std::vector<std::uint16_t> kLogs =
    keysOf({lteLogs(), umtsLogs(), gsmLogs(), nasLogs(), simLogs()}, &LogRow::code);
const std::vector<std::uint16_t> kEvents =
    keysOf({lteEvents(), umtsEvents(), gsmEvents(), nasEvents(), simEvents()}, &EventRow::id);
const std::vector<std::uint32_t> kReports = keysOf(
    {lteReports(), umtsReports(), gsmReports(), nasReports(), simReports()}, &ReportRow::metric);

using Reports = std::vector<std::optional<Bytes>>;

Reports reportsOf(const DiagnosticsReader& reader) {
  Reports reports;
  for (const std::uint32_t metric : kReports) reports.push_back(reader.report(metric, kBeginMs));
  return reports;
}

// What is known or is not, of two bytes; a code that somebody reads comes more often.
std::uint16_t codeOf(Input& input, const std::vector<std::uint16_t>& known, bool any) {
  const auto number = input.number<std::uint16_t>();
  return any || known.empty() ? number : known[number % known.size()];
}

void expectReadable(const DiagnosticsReader& reader, const Told& told) {
  for (const std::uint32_t metric : told) {
    const auto payload = reader.report(metric, kBeginMs);
    const MetricMessage* message = findMetricMessage(metric);
    law(!payload || !message || message->isReadable(*payload), "every report can be read");
  }
}

std::uint64_t damagedIn(const DiagnosticsReader& reader) { return reader.counts().total().damaged; }

void takePacket(Input& input, std::uint64_t timeMs, DiagnosticsReader& reader) {
  const std::uint8_t kind = input.byte();
  const bool isEvent = (kind & 1) != 0;
  const bool anyCode = (kind & 2) != 0;
  const std::uint16_t code = codeOf(input, isEvent ? kEvents : kLogs, anyCode);
  const Bytes body = input.piece();
  reader.take(LogPacket{kNobodysCode, timeMs, 1, {}});  // what is too old goes
  const Reports before = reportsOf(reader);
  const std::uint64_t damagedBefore = damagedIn(reader);
  const Told& told = isEvent ? reader.take(ModemEvent{code, timeMs, 1, body})
                             : reader.take(LogPacket{code, timeMs, 1, body});
  expectReadable(reader, told);
  if (damagedIn(reader) == damagedBefore) return;
  law(told.empty(), "a damaged packet tells nothing");
  law(reportsOf(reader) == before, "a damaged packet changes nothing");
}

}  // namespace

void tryInput(Input input) {
  DiagnosticsReader reader;
  std::uint64_t timeMs = kBeginMs;
  for (std::size_t left = kMostPackets; left > 0 && !input.empty(); --left) {
    timeMs += input.number<std::uint16_t>();
    takePacket(input, timeMs, reader);
  }
  reader.forget();
  for (const auto& report : reportsOf(reader)) law(!report, "nothing is known of a new modem");
}

}  // namespace qel::fuzz
