#include "tools/PacketReport.h"

#include <algorithm>
#include <array>
#include <cstdio>
#include <utility>

#include "sources/diagnostics/PacketTable.h"
#include "tools/PacketList.h"

namespace qel::tools {
namespace {

using diagnostics::PacketCounts;

// There are no modems of more radios: such a packet is damaged.
bool isCounted(unsigned radio) {
  constexpr unsigned kMostRadios = 16;
  return radio <= kMostRadios;
}

}  // namespace

diagnostics::DiagnosticsReader& PacketReport::readerOf(unsigned radio) {
  const unsigned number = std::max(radio, 1U);
  return _readers.try_emplace(number, number).first->second;
}

void PacketReport::measure(const Kind& kind, std::size_t length) {
  if (_lengths.size() >= PacketCounts::kMostRows && !_lengths.contains(kind)) return;
  Lengths& lengths = _lengths.try_emplace(kind, Lengths{length, length}).first->second;
  lengths = {std::min(lengths.shortest, length), std::max(lengths.longest, length)};
}

void PacketReport::log(const diagnostics::LogPacket& packet) {
  if (!isCounted(packet.radio)) return;
  const auto* row = diagnostics::findLog(packet.code);
  const auto version = row && row->version ? row->version(packet.body) : std::nullopt;
  measure({false, packet.code, version}, packet.body.size());
  readerOf(packet.radio).take(packet);
}

void PacketReport::event(const diagnostics::ModemEvent& event) {
  if (!isCounted(event.radio)) return;
  measure({true, event.id, std::nullopt}, event.payload.size());
  readerOf(event.radio).take(event);
}

void PacketReport::answer(ByteView packet) {
  constexpr std::uint8_t kBuildAnswer = 0x7C;
  if (!packet.empty() && packet[0] == kBuildAnswer)
    note(std::nullopt, diagnostics::buildIn(packet));
}

void PacketReport::note(const std::optional<diagnostics::ModemVersion>& version,
                        const std::optional<diagnostics::ModemBuild>& build) {
  if (version) _version = version;
  if (build) _build = build;
}

void PacketReport::addKinds(std::vector<std::string>& lines, unsigned radio,
                            const PacketCounts& counts) const {
  for (const auto& [kind, row] : counts.rows()) {
    const auto lengths = _lengths.find(kind);
    std::string line = "radio " + std::to_string(radio) + ", " + nameInShort(kind) + ": " +
                       std::to_string(row.all()) + " packets";
    if (lengths != _lengths.end()) {
      line += ", " + std::to_string(lengths->second.shortest) + " to " +
              std::to_string(lengths->second.longest) + " bytes";
    }
    const auto add = [&line](std::uint64_t count, const char* what) {
      if (count > 0) line += ", " + std::to_string(count) + what;
    };
    add(row.understood, " passed the checks of their layout");
    add(row.unknownVersion, " of an unknown version");
    add(row.damaged, " failed them");
    add(row.notOurs, " not read");
    lines.push_back(std::move(line));
  }
}

std::vector<std::string> PacketReport::lines(const diagnostics::FrameReader::Counts& frames) const {
  std::vector<std::string> lines = {"qelctl " QEL_VERSION};
  if (_build) {
    lines.push_back("chip: " + std::to_string(_build->chip));
    lines.push_back("build: " + _build->build);
    if (!_build->model.empty()) lines.push_back("model: " + _build->model);
  }
  if (_version) {
    lines.push_back("model: " + _version->model);
    lines.push_back("compiled: " + _version->compiled);
  }
  lines.push_back("frames: " + std::to_string(frames.frames) + " good, " +
                  std::to_string(frames.badFrames) + " bad, " + std::to_string(frames.repaired) +
                  " repaired, " + std::to_string(frames.bytes) + " bytes");
  for (const auto& [radio, reader] : _readers) addKinds(lines, radio, reader.counts());
  return lines;
}

}  // namespace qel::tools
