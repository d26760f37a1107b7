#include "tools/RecordProgress.h"

#include <unistd.h>

#include <array>
#include <cstdio>
#include <utility>

#include "base/NonBlockingWriter.h"
#include "base/TerminalText.h"

namespace qel::tools {
namespace {

std::string sizeText(std::uint64_t bytes) {
  constexpr std::array kUnits = {"kB", "MB", "GB", "TB"};
  if (bytes < 1000) return std::to_string(bytes) + " bytes";
  double size = static_cast<double>(bytes) / 1000;
  std::size_t unit = 0;
  for (; size >= 1000 && unit + 1 < kUnits.size(); ++unit) size /= 1000;
  std::array<char, 32> text;
  std::snprintf(text.data(), text.size(), "%.1f %s", size, kUnits[unit]);
  return text.data();
}

std::string durationText(std::chrono::seconds duration) {
  const long long seconds = duration.count();
  std::array<char, 48> text;
  std::snprintf(text.data(), text.size(), "%lld:%02lld:%02lld", seconds / 3600, seconds / 60 % 60,
                seconds % 60);
  return text.data();
}

// What goes at once: a terminal that was stopped must not stop the recording.
void put(const std::string& text) {
  writeBriefly(STDERR_FILENO, text, std::chrono::milliseconds(0));
}

}  // namespace

std::string progressText(const Recorder::Progress& progress, std::chrono::seconds duration) {
  return std::to_string(progress.events) + " events, " + sizeText(progress.bytes) + ", " +
         durationText(duration);
}

RecordProgress::RecordProgress() : _isTerminal(::isatty(STDERR_FILENO) == 1) {}

void RecordProgress::clear() {
  if (std::exchange(_shown, false)) put("\r\x1B[K");
}

void RecordProgress::show(const std::string& text) {
  if (!_isTerminal) return;
  clear();
  put(forTerminal(text));
  _shown = true;
}

void RecordProgress::say(const std::string& text) {
  clear();
  complain("qelctl", text);
}

}  // namespace qel::tools
