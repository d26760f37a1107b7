// recorded-jumps SAMPLE: what it costs to open a recording of 100 MB and to jump within it. Prints
// table rows. The recording is the sample again and again, one after the other, as plain text.

#include <stdlib.h>
#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <memory>
#include <random>

#include "history/recorded/RecordedHistory.h"
#include "programs/Figures.h"
#include "recording/EventLine.h"

namespace qel::benchmarks {
namespace {

constexpr std::size_t kBytes = 100'000'000;
constexpr std::uint64_t kBetweenDrives = 1000;  // milliseconds
constexpr int kJumps = 1000;
constexpr double kPieceMs = 8;

std::vector<RecordedEvent> eventsOf(const std::string& sample) {
  RecordingFault fault;
  const auto reader = RecordingReader::open(sample, RecordingReader::BadLines::fail, fault);
  std::vector<RecordedEvent> events;
  while (auto event = reader ? reader->next() : std::nullopt) events.push_back(std::move(*event));
  return events;
}

void write(const std::string& path, std::vector<RecordedEvent> events) {
  std::ofstream file(path, std::ios::binary);
  const std::uint64_t drive = events.back().timeMs - events.front().timeMs + kBetweenDrives;
  for (std::size_t written = 0; written < kBytes;) {
    for (RecordedEvent& event : events) {
      const std::string line = eventLine(event) + "\n";
      file << line;
      written += line.size();
      event.timeMs += drive;
    }
  }
}

double residentMb() {
  std::ifstream statm("/proc/self/statm");
  double pages = 0;
  statm >> pages >> pages;
  return pages * static_cast<double>(::sysconf(_SC_PAGESIZE)) / 1e6;
}

void measure(const std::string& path) {
  RecordingFault fault;
  const double before = residentMb();
  const auto start = Clock::now();
  const auto history = RecordedHistory::open(path, fault);
  std::vector<double> pieces;
  for (bool more = true; more;) {
    const auto piece = Clock::now();
    do {
      more = history->readOn(256);
    } while (more && Milliseconds(Clock::now() - piece).count() < kPieceMs);
    pieces.push_back(Milliseconds(Clock::now() - piece).count());
  }
  const double openedMs = Milliseconds(Clock::now() - start).count();
  const double held = residentMb() - before;

  std::mt19937_64 engine(1);
  std::uniform_int_distribution<std::uint64_t> moments(history->beginMs(), history->endMs());
  std::vector<double> jumps;
  for (int i = 0; i < kJumps; ++i) {
    const std::uint64_t moment = moments(engine);
    const auto jump = Clock::now();
    MetricStore shown = history->storeAt(moment);
    jumps.push_back(Milliseconds(Clock::now() - jump).count());
  }
  const auto& notes = history->notes();
  printRow("a recording of 100 MB opened: " + std::to_string(history->events()) + " events",
           text(openedMs / 1000, "s"), "", "");
  printRow("of that the longest piece without a frame", text(percentile(pieces, 1), "ms"), "", "");
  printRow("memory that it holds", text(held, "MB", 0), "", "");
  printRow("a jump to any of its moments", text(median(jumps), "ms"), "", "< 100 ms");
  printRow("the longest of 1,000", text(percentile(jumps, 1), "ms"), "", "< 100 ms");
  for (const std::string& note : notes) std::cerr << note << '\n';
}

}  // namespace
}  // namespace qel::benchmarks

int main(int argc, char** argv) {
  using namespace qel::benchmarks;
  const auto events = argc == 2 ? eventsOf(argv[1]) : std::vector<qel::RecordedEvent>();
  if (events.empty()) {
    std::cerr << "recorded-jumps SAMPLE\n";
    return EXIT_FAILURE;
  }
  std::string folder = (std::filesystem::temp_directory_path() / "recorded-jumps-XXXXXX").string();
  if (!::mkdtemp(folder.data())) return EXIT_FAILURE;
  const std::string path = folder + "/long.jsonl";
  write(path, events);
  measure(path);
  std::filesystem::remove_all(folder);
}
