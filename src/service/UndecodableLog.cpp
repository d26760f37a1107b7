#include "service/UndecodableLog.h"

#include <string>

#include "base/LogSink.h"

namespace qel::service {
namespace {

constexpr std::uint64_t kLineEveryMs = 10'000;

}  // namespace

void UndecodableLog::note(std::string_view reason) {
  std::string line = _beginning;
  {
    const std::lock_guard lock(_mutex);
    const std::uint64_t nowMs = _clock.nowMs();
    // A clock that was set back must not silence the log.
    if (_lastLineMs && nowMs >= *_lastLineMs && nowMs - *_lastLineMs < kLineEveryMs) {
      ++_keptBack;
      return;
    }
    _lastLineMs = nowMs;
    line += reason;
    if (_keptBack > 0) line += ", and " + std::to_string(_keptBack) + " before it";
    _keptBack = 0;
  }
  systemLog().write(line);
}

}  // namespace qel::service
