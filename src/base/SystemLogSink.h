// The system log of the machine.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "base/DescriptorSink.h"
#include "base/LogSink.h"

namespace qel {

// syslog(3) at level "info" under the program's name, and standard error too when asked. One at a
// time in a process: syslog's name is the process's.
class SystemLogSink final : public LogSink {
 public:
  enum class Echo : std::uint8_t { none, standardError };

  SystemLogSink(std::string program, Echo echo);
  ~SystemLogSink() override;
  void write(std::string_view line) override;

 private:
  std::string _program;  // openlog keeps the pointer
  Echo _echo;
  StandardErrorSink _standardError;
};

}  // namespace qel
