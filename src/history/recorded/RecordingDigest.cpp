#include "history/recorded/RecordingDigest.h"

#include <algorithm>
#include <array>
#include <limits>
#include <utility>

#include "history/recorded/OpenedRecording.h"
#include "metrics/MetricValidator.h"

namespace qel {
namespace {

constexpr std::size_t kMostCells = 65536;
constexpr std::array kServingCellMetrics = {MetricValidator::K_LTE_SCELL_INFO,
                                            MetricValidator::K_UMTS_SCELL_INFO,
                                            MetricValidator::K_GSM_SCELL_INFO};

std::uint64_t orNone(const std::optional<std::uint32_t>& number) {
  return number ? *number : std::numeric_limits<std::uint64_t>::max();
}

}  // namespace

std::unique_ptr<RecordingDigest> RecordingDigest::open(const std::string& path,
                                                       RecordingFault& fault) {
  auto reader = openedRecording(path, fault);
  if (!reader) return nullptr;
  return std::unique_ptr<RecordingDigest>(new RecordingDigest(std::move(reader)));
}

RecordingDigest::RecordingDigest(std::unique_ptr<RecordingReader> reader)
    : _reader(std::move(reader)), _dispatcher(&_history) {}

void RecordingDigest::take(const RecordedEvent& event) {
  if (_events++ == 0) _beginMs = _endMs = event.timeMs;
  _endMs = std::max(_endMs, event.timeMs);
  const Value* metric = event.entries.find(kRecordedMetricKey);
  if (!metric || !std::ranges::count(kServingCellMetrics, metric->asInt64())) return;
  if (!QuietDispatcher::isReadable(event.entries)) return;
  _dispatcher.take(event.entries, _endMs);
  const auto cell = _history.servingCell(_endMs);
  if (!cell || _cells.size() >= kMostCells) return;
  _cells.emplace(cell->technology, orNone(cell->channel), orNone(cell->code), orNone(cell->cellId));
}

// In order, a cell without identity comes right behind those of its channel and code.
std::size_t RecordingDigest::cells() const {
  std::size_t count = 0;
  const auto* before = static_cast<const Key*>(nullptr);
  for (const Key& key : _cells) {
    const auto& [technology, channel, code, identity] = key;
    const bool isKnown =
        identity == orNone(std::nullopt) && before && *before >= Key{technology, channel, code, 0};
    if (!isKnown) ++count;
    before = &key;
  }
  return count;
}

bool RecordingDigest::readOn(std::size_t events) {
  for (; events > 0; --events) {
    const auto event = _reader->next();
    if (!event) return false;
    take(*event);
  }
  return true;
}

}  // namespace qel
