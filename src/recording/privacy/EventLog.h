// What becomes of events in a log.
#pragma once

#include <cstdint>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "base/LogSink.h"
#include "recording/privacy/IdentityHider.h"

namespace qel {

enum class LoggedEvents : std::uint8_t {
  full,    // as they came, with the identities in their payloads
  hidden,  // as `qelctl record` would keep them: with pseudonyms
  none,
};

// "full", "hidden" and "none".
std::vector<std::string> loggedEventsNames();
std::optional<LoggedEvents> loggedEventsNamed(std::string_view name);

// Hands lines on to another log, and events as it was told. Any thread. Pseudonyms are stable as
// long as this lives.
class EventLog final : public LogSink {
 public:
  EventLog(std::shared_ptr<LogSink> log, LoggedEvents events);
  void write(std::string_view line) override;
  bool wantsLines() const override { return _log->wantsLines(); }
  void writeEvent(std::string_view text, const Dictionary& event) override;
  void flush() override;

 private:
  Dictionary withoutIdentities(const Dictionary& event);

  const std::shared_ptr<LogSink> _log;
  const LoggedEvents _events;
  std::mutex _mutex;
  std::optional<IdentityHider> _hider;
};

}  // namespace qel
