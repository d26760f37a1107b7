#include "sources/diagnostics/DiagnosticsFacts.h"

#include <array>
#include <cstdio>

namespace qel::diagnostics {
namespace {

constexpr std::chrono::seconds kHalf{5};

std::string nameOf(const PacketCounts::Kind& kind) {
  if (kind.isEvent) return "event " + std::to_string(kind.code);
  std::array<char, 16> code{};
  std::snprintf(code.data(), code.size(), "log %04X", kind.code);
  std::string name = code.data();
  if (kind.version) name += " version " + std::to_string(*kind.version);
  return name;
}

std::string wordsOf(const PacketCounts::Row& row) {
  std::string words;
  const auto add = [&words](std::uint64_t count, const char* what) {
    if (count == 0) return;
    words += (words.empty() ? "" : ", ") + std::to_string(count) + what;
  };
  add(row.understood, " understood");
  add(row.unknownVersion, " of an unknown version");
  add(row.damaged, " damaged");
  add(row.notOurs, " not read");
  return words;
}

}  // namespace

void ByteRate::note(std::uint64_t bytes, Clock::time_point now) {
  if (bytes < _last.bytes || _first.at == Clock::time_point()) {
    _first = _middle = {bytes, now};
  }
  if (now >= _middle.at + kHalf) {
    _first = _middle;
    _middle = {bytes, now};
  }
  _last = {bytes, now};
}

std::uint64_t ByteRate::perSecond(Clock::time_point now) const {
  const auto ms = std::chrono::duration_cast<std::chrono::milliseconds>(now - _first.at).count();
  if (ms < 1000 || now >= _last.at + 2 * kHalf) return 0;
  return (_last.bytes - _first.bytes) * 1000 / static_cast<std::uint64_t>(ms);
}

sources::SourceFacts factsOf(const PortFacts& port, const PacketCounts& counts) {
  sources::SourceFacts facts;
  const auto add = [&facts](std::string name, std::string value) {
    if (!value.empty()) facts.rows.emplace_back(std::move(name), std::move(value));
  };
  add("port", port.port);
  add("device", port.modem);
  if (port.build) {
    add("chip", std::to_string(port.build->chip));
    add("model", port.build->model);
    add("build", port.build->build);
  }
  if (port.version) {
    if (!port.build || port.build->model.empty()) add("model", port.version->model);
    add("compiled", port.version->compiled);
  }
  if (!port.port.empty()) {
    add("bytes a second", std::to_string(port.bytesPerSecond));
    add("frames", std::to_string(port.frames.frames));
    add("bad frames", std::to_string(port.frames.badFrames));
    add("repaired frames", std::to_string(port.frames.repaired));
    add("packets not asked for", std::to_string(port.unwantedPackets));
    add("masks of others", std::to_string(port.replacedMasks));
  }
  for (const auto& [kind, row] : counts.rows()) add(nameOf(kind), wordsOf(row));
  add("further kinds", wordsOf(counts.ofFurtherKinds()));
  return facts;
}

}  // namespace qel::diagnostics
