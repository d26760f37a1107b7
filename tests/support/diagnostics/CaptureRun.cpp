#include "support/diagnostics/CaptureRun.h"

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>

#include "sources/diagnostics/DiagnosticsReader.h"
#include "sources/diagnostics/packets/PacketReader.h"
#include "sources/diagnostics/port/FrameReader.h"

namespace qel::diagnostics::test {
namespace {

namespace fs = std::filesystem;

constexpr const char* kFactsEnd = ".facts.jsonl";

fs::path folder() {
  const char* name = std::getenv("QEL_DIAG_CAPTURES");
  return name ? name : "";
}

// Builds what each packet told.
class Teller final : public PacketSink {
 public:
  void log(const LogPacket& packet) override { keep(packet, packet.timeMs); }
  void event(const ModemEvent& event) override { keep(event, event.timeMs); }

  std::size_t number = 0;
  std::vector<ToldMetric> told;

 private:
  template <class Packet>
  void keep(const Packet& packet, std::uint64_t timeMs) {
    DiagnosticsReader& reader = packet.radio == 2 ? _second : _first;
    for (const std::uint32_t metric : reader.take(packet)) {
      const auto payload = reader.report(metric, timeMs);
      if (payload) told.push_back({number, timeMs, metric, *payload});
    }
  }

  DiagnosticsReader _first{1};
  DiagnosticsReader _second{2};
};

}  // namespace

std::vector<std::string> captureNames() {
  std::vector<std::string> names;
  if (folder().empty()) return names;
  for (const auto& entry : fs::directory_iterator(folder())) {
    if (entry.path().extension() == ".qmdl") names.push_back(entry.path().stem());
  }
  std::sort(names.begin(), names.end());
  return names;
}

std::vector<ToldMetric> readCapture(const std::string& name) {
  std::ifstream file(folder() / (name + ".qmdl"), std::ios::binary);
  const Bytes stream{std::istreambuf_iterator<char>(file), {}};
  Teller teller;
  PacketReader packets(teller);
  FrameReader frames;
  frames.add(stream, [&](ByteView packet) {
    ++teller.number;
    packets.take(packet);
  });
  return std::move(teller.told);
}

std::vector<nlohmann::json> factsOf(const std::string& name) {
  std::vector<nlohmann::json> facts;
  std::ifstream file(folder() / (name + kFactsEnd));
  for (std::string line; std::getline(file, line);) facts.push_back(nlohmann::json::parse(line));
  return facts;
}

}  // namespace qel::diagnostics::test
