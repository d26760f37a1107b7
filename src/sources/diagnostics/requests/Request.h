// All that is ever said to a modem on its diagnostics port.
#pragma once

#include <cstdint>
#include <string_view>

#include "base/Bytes.h"
#include "sources/diagnostics/requests/LogMask.h"

namespace qel::diagnostics {

// The port understands requests that write the modem's memory, dial or break it. Ports send objects
// of this class alone, and only the functions below make them: questions about the modem's version,
// and which logs and events it is to send.
class Request {
 public:
  static Request version();
  static Request build();
  static Request messagesOff();
  static Request eventsOff();
  static Request eventsOn();
  static Request eventMask(ByteView bits);  // bit i of them stands for event i
  static Request logsOff();
  static Request logRanges();
  static Request setLogMask(const LogMask& mask);
  static Request getLogMask(unsigned equipment);

  std::string_view name() const { return _name; }
  ByteView packet() const { return _packet; }

  enum class Answer : std::uint8_t { none, good, refused };
  // What the packet is to this request. Another's answer, as a router sends to all, is none.
  Answer answerIn(ByteView packet) const;

 private:
  enum class Kind : std::uint8_t { command, logConfiguration, logConfigurationOfEquipment };

  Request(std::string_view name, Kind kind, Bytes packet);
  static Request logConfiguration(std::string_view name, Kind kind, std::uint32_t operation,
                                  Bytes arguments);
  bool isOurs(ByteView answer) const;

  std::string_view _name;
  Kind _kind;
  Bytes _packet;
};

}  // namespace qel::diagnostics
