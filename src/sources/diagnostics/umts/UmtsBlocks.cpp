#include "sources/diagnostics/umts/UmtsBlocks.h"

#include <algorithm>
#include <array>

#include "rrc/umts/SystemInformation.h"
#include "sources/Metrics.h"

namespace qel::diagnostics {
namespace {

namespace umts = rrc::umts;

// A cell's blocks are all read within that time.
constexpr std::uint64_t kReadingMs = 5'000;

constexpr int kStepDb = 2;  // of the levels for searching

template <class Block>
void dropOlder(std::optional<UmtsBlock<Block>>& block, std::uint64_t timeMs) {
  if (block && timeMs - block->timeMs > kReadingMs) block.reset();
}

// Only this block names its cell: what was read long before it belongs to another one.
void beginCell(UmtsBroadcast& broadcast, std::uint64_t timeMs) {
  dropOlder(broadcast.paging, timeMs);
  dropOlder(broadcast.packetAccess, timeMs);
  dropOlder(broadcast.fachMeasurements, timeMs);
  dropOlder(broadcast.priorities, timeMs);
}

std::optional<std::int32_t> inDb(const std::optional<int>& steps) {
  return steps ? std::optional<std::int32_t>(*steps * kStepDb) : std::nullopt;
}

std::vector<UmtsFrequency> frequenciesFrom(const std::vector<umts::PrioritisedFrequency>& list) {
  std::vector<UmtsFrequency> frequencies;
  for (const auto& [channel, priority] : list) frequencies.push_back({channel, priority});
  return frequencies;
}

bool namesServingCell(const UmtsPicture& umts) {
  const auto& selection = umts.broadcast.selection;
  return umts.cell && selection && selection->block.cellId == umts.cell->cellId;
}

// Each gives false when the bits are no such block.

bool readBlock1(ByteView block, std::uint64_t timeMs, Picture& picture, Told& told) {
  constexpr std::uint32_t kFrameMs = 10;
  const auto sib = umts::readSib1(block);
  if (!sib) return false;
  UmtsPaging paging;
  if (!sib->drxCoefficients.empty())
    paging.cycleMs = kFrameMs << *std::ranges::min_element(sib->drxCoefficients);
  picture.umts.broadcast.paging = {paging, timeMs};
  told.tell(metric::kUmtsRrcConfig);
  return true;
}

bool readBlock3(ByteView block, std::uint64_t timeMs, Picture& picture, Told& told) {
  const auto sib = umts::readSib3(block);
  if (!sib) return false;
  UmtsBroadcast& broadcast = picture.umts.broadcast;
  const auto& before = broadcast.selection;
  if (!before || before->block.cellId != sib->cellId) beginCell(broadcast, timeMs);
  broadcast.selection = {{.cellId = sib->cellId,
                          .barred = sib->barred,
                          .fdd = sib->fdd,
                          .intraSearchDb = inDb(sib->intraSearch),
                          .interSearchDb = inDb(sib->interSearch),
                          .gsmSearchDb = inDb(sib->gsmSearch)},
                         timeMs};
  told.tell(metric::kUmtsSelRes);
  return true;
}

bool readBlock5(ByteView block, std::uint64_t timeMs, Picture& picture, Told& told) {
  const auto sib = umts::readSib5(block);
  if (!sib) return false;
  UmtsPicture& now = picture.umts;
  const UmtsPacketAccess access{sib->hsdpa, sib->edch};
  const bool changed = !now.broadcast.packetAccess || now.broadcast.packetAccess->block != access;
  const bool serving = picture.technology == Technology::umts && namesServingCell(now);
  now.broadcast.packetAccess = {access, timeMs};
  told.tell(metric::kUmtsSelRes);
  if (changed && serving) told.tell(metric::kUmtsCellInfo);
  return true;
}

bool readBlock11(ByteView block, std::uint64_t timeMs, Picture& picture, Told& told) {
  const auto sib = umts::readSib11(block);
  if (!sib) return false;
  picture.umts.broadcast.fachMeasurements = {sib->fachMeasurementOccasions, timeMs};
  told.tell(metric::kUmtsSelRes);
  return true;
}

bool readBlock19(ByteView block, std::uint64_t timeMs, Picture& picture, Told& told) {
  const auto sib = umts::readSib19(block);
  if (!sib) return false;
  picture.umts.broadcast.priorities = {{.own = sib->priority,
                                        .umts = frequenciesFrom(sib->utraFdd),
                                        .gsm = frequenciesFrom(sib->gsm),
                                        .lte = frequenciesFrom(sib->eutra)},
                                       timeMs};
  told.tell(metric::kUmtsSelRes);
  return true;
}

struct Row {
  unsigned type;
  bool (*read)(ByteView block, std::uint64_t timeMs, Picture& picture, Told& told);
};
constexpr std::array kRows = {
    Row{1, readBlock1},   Row{3, readBlock3},   Row{5, readBlock5},
    Row{11, readBlock11}, Row{67, readBlock19},
};

}  // namespace

Outcome readUmtsBlock(unsigned type, ByteView block, std::uint64_t timeMs, Picture& picture,
                      Told& told) {
  const auto* row = std::ranges::find(kRows, type, &Row::type);
  if (row == kRows.end()) return Outcome::notOurs;
  return row->read(block, timeMs, picture, told) ? Outcome::understood : Outcome::damaged;
}

}  // namespace qel::diagnostics
