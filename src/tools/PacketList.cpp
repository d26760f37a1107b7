#include "tools/PacketList.h"

#include <array>
#include <cstdio>

#include "base/Rendering.h"
#include "sources/diagnostics/PacketTable.h"

namespace qel::tools {
namespace {

using diagnostics::PacketCounts;
using diagnostics::RawLogEvents;
using Kind = PacketCounts::Kind;
using Row = PacketCounts::Row;

std::string hex(unsigned number, int digits) {
  std::array<char, 16> text;
  std::snprintf(text.data(), text.size(), "%0*X", digits, number);
  return text.data();
}

// Logs are known by their numbers in hexadecimal, events in decimal.
std::string codeOf(const Kind& kind) {
  return kind.isEvent ? std::to_string(kind.code) : hex(kind.code, 4);
}

std::string_view nameOf(const Kind& kind) {
  if (kind.isEvent) {
    const auto* row = diagnostics::findEvent(kind.code);
    return row ? row->name : std::string_view();
  }
  const auto* row = diagnostics::findLog(kind.code);
  return row ? row->name : std::string_view();
}

std::string listOf(const RawLogEvents& events, std::uint64_t Row::*count) {
  std::string list;
  for (const auto& [kind, row] : events.counts()) {
    if (row.*count > 0)
      list += (list.empty() ? "" : ", ") + nameInShort(kind) + " " + std::to_string(row.*count);
  }
  return list;
}

std::string framesOf(const RawLogEvents& events) {
  const auto& frames = events.log().frames();
  std::string text =
      std::to_string(frames.frames) + " frames, " + std::to_string(frames.badFrames) + " bad";
  if (frames.repaired > 0) text += ", " + std::to_string(frames.repaired) + " repaired";
  const std::uint64_t damaged = events.log().packets().damaged;
  if (damaged > 0) text += ", " + std::to_string(damaged) + " packets damaged";
  if (events.ofOtherRadios() > 0) {
    text += ", " + std::to_string(events.ofOtherRadios()) + " packets of other radios left out";
  }
  return text;
}

std::string tableLine(const std::array<std::string, 8>& cells) {
  std::array<char, 200> line;
  std::snprintf(line.data(), line.size(), "%-6.6s %-6.6s %7.7s %10s %10s %10s %8s  %.100s",
                cells[0].c_str(), cells[1].c_str(), cells[2].c_str(), cells[3].c_str(),
                cells[4].c_str(), cells[5].c_str(), cells[6].c_str(), cells[7].c_str());
  std::string text = line.data();
  text.erase(text.find_last_not_of(' ') + 1);
  return text;
}

std::string tableLine(const Kind& kind, const Row& row) {
  const auto number = [](std::uint64_t value) { return std::to_string(value); };
  return tableLine({kind.isEvent ? "event" : "log", codeOf(kind),
                    kind.version ? number(*kind.version) : "", number(row.all()),
                    number(row.understood), number(row.unknownVersion), number(row.damaged),
                    std::string(nameOf(kind))});
}

Dictionary counted(const Row& row) {
  return {{"packets", row.all()},
          {"understood", row.understood},
          {"unknown_version", row.unknownVersion},
          {"damaged", row.damaged},
          {"not_read", row.notOurs}};
}

Dictionary asJson(const Kind& kind, const Row& row) {
  Dictionary told = {{"kind", kind.isEvent ? "event" : "log"}, {"code", codeOf(kind)}};
  told.set("version", kind.version ? Value(std::uint64_t{*kind.version}) : Value());
  told.set("name", nameOf(kind).empty() ? Value() : Value(nameOf(kind)));
  for (const auto& [key, value] : counted(row)) told.set(key, value);
  return told;
}

}  // namespace

std::string nameInShort(const Kind& kind) {
  std::string text = (kind.isEvent ? "event " : "") + codeOf(kind);
  if (kind.version) text += "/" + std::to_string(*kind.version);
  return text;
}

std::vector<std::string> summaryOf(const RawLogEvents& events) {
  std::vector<std::string> lines = {events.log().name() + ": " + framesOf(events)};
  const auto add = [&](const char* what, std::uint64_t Row::*count) {
    const std::string list = listOf(events, count);
    if (!list.empty()) lines.push_back(what + list);
  };
  add("understood: ", &Row::understood);
  add("of unknown version: ", &Row::unknownVersion);
  add("damaged: ", &Row::damaged);
  add("not read: ", &Row::notOurs);
  return lines;
}

std::vector<std::string> packetsAsTable(const RawLogEvents& events) {
  std::vector<std::string> lines = {tableLine(
      {"kind", "code", "version", "packets", "understood", "unknown", "damaged", "name"})};
  for (const auto& [kind, row] : events.counts()) lines.push_back(tableLine(kind, row));
  const auto& others = events.log().packets().others;
  for (unsigned command = 0; command < others.size(); ++command) {
    if (others[command] == 0) continue;
    lines.push_back(tableLine({"answer", hex(command, 2), "", std::to_string(others[command]), "",
                               "", "", "neither log nor event"}));
  }
  lines.push_back(framesOf(events));
  return lines;
}

std::string packetsAsJson(const RawLogEvents& events) {
  List packets;
  for (const auto& [kind, row] : events.counts()) packets.emplace_back(asJson(kind, row));
  List answers;
  const auto& others = events.log().packets().others;
  for (unsigned command = 0; command < others.size(); ++command) {
    if (others[command] == 0) continue;
    answers.emplace_back(Dictionary{{"command", hex(command, 2)}, {"packets", others[command]}});
  }
  const auto& frames = events.log().frames();
  const Dictionary told = {{"file", events.log().name()},
                           {"bytes", frames.bytes},
                           {"frames", frames.frames},
                           {"bad_frames", frames.badFrames},
                           {"repaired_frames", frames.repaired},
                           {"damaged_packets", events.log().packets().damaged},
                           {"other_radios", events.ofOtherRadios()},
                           {"packets", std::move(packets)},
                           {"other_packets", std::move(answers)}};
  return jsonText(told);
}

}  // namespace qel::tools
