#include "tools/RecordProgress.h"

#include <unistd.h>

#include <utility>

#include "base/Amounts.h"
#include "base/NonBlockingWriter.h"
#include "base/TerminalText.h"

namespace qel::tools {
namespace {

// What goes at once: a terminal that was stopped must not stop the recording.
void put(const std::string& text) {
  writeBriefly(STDERR_FILENO, text, std::chrono::milliseconds(0));
}

}  // namespace

std::string progressText(const capture::Recorder::Progress& progress,
                         std::chrono::seconds duration) {
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
