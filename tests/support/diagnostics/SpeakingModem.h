// A modem that says something, and what becomes of it.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "base/Bytes.h"
#include "sources/diagnostics/DiagnosticsReader.h"

namespace qel::diagnostics::test {

// A modem whose packets a reader takes. Time goes by only when told.
class SpeakingModem {
 public:
  // The metrics that it told something about, in order.
  std::vector<std::uint32_t> send(std::uint16_t code, ByteView body);
  std::vector<std::uint32_t> sendEvent(std::uint16_t id, ByteView payload);
  void wait(std::uint64_t milliseconds) { _timeMs += milliseconds; }
  void setTime(std::uint64_t milliseconds) { _timeMs = milliseconds; }

  // The metric as JSON without its time; empty when there is nothing to say.
  std::string said(std::uint32_t metric) const;

  const DiagnosticsReader& reader() const { return _reader; }
  // How many packets came to that.
  std::uint64_t understood() const { return _reader.counts().total().understood; }
  std::uint64_t damaged() const { return _reader.counts().total().damaged; }
  std::uint64_t ofUnknownVersion() const { return _reader.counts().total().unknownVersion; }

 private:
  DiagnosticsReader _reader;
  std::uint64_t _timeMs = 1'790'000'000'000;
};

}  // namespace qel::diagnostics::test
