#include "base/SystemLogSink.h"

#include <syslog.h>

namespace qel {

SystemLogSink::SystemLogSink(std::string program, Echo echo)
    : _program(std::move(program)), _echo(echo) {
  ::openlog(_program.c_str(), LOG_PID, LOG_USER);
}

SystemLogSink::~SystemLogSink() { ::closelog(); }

void SystemLogSink::write(std::string_view line) {
  ::syslog(LOG_INFO, "%.*s", static_cast<int>(line.size()), line.data());
  if (_echo == Echo::standardError) _standardError.write(line);
}

}  // namespace qel
