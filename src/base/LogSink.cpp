#include "base/LogSink.h"

#include <syslog.h>
#include <unistd.h>

#include <cerrno>

namespace qel {
namespace {

// Writes all of `text`; the error number of the write that failed, else 0.
int writeAll(int descriptor, std::string_view text) {
  while (!text.empty()) {
    const ssize_t written = ::write(descriptor, text.data(), text.size());
    if (written < 0 && errno == EINTR) continue;
    if (written < 0) return errno;
    text.remove_prefix(static_cast<std::size_t>(written));
  }
  return 0;
}

// Neither slot is ever destroyed: threads may log while the process ends.
std::shared_ptr<LogSink>& standardOutputSlot() {
  static auto& sink =
      *new std::shared_ptr<LogSink>(std::make_shared<DescriptorSink>(STDOUT_FILENO));
  return sink;
}

std::shared_ptr<LogSink>& systemLogSlot() {
  static auto& sink = *new std::shared_ptr<LogSink>(
      std::make_shared<SystemLogSink>("qelwatch", SystemLogSink::Echo::none));
  return sink;
}

std::shared_ptr<LogSink> orNull(std::shared_ptr<LogSink> sink) {
  return sink ? std::move(sink) : std::make_shared<NullSink>();
}

}  // namespace

LogSink& standardOutput() { return *standardOutputSlot(); }
LogSink& systemLog() { return *systemLogSlot(); }
void setStandardOutput(std::shared_ptr<LogSink> sink) {
  standardOutputSlot() = orNull(std::move(sink));
}
void setSystemLog(std::shared_ptr<LogSink> sink) { systemLogSlot() = orNull(std::move(sink)); }

void DescriptorSink::write(std::string_view line) {
  const std::lock_guard lock(_mutex);
  if (_error != 0) return;
  _line.assign(line);
  _line += '\n';
  _error = writeAll(_descriptor, _line);
}

SystemLogSink::SystemLogSink(std::string program, Echo echo)
    : _program(std::move(program)), _echo(echo) {
  ::openlog(_program.c_str(), LOG_PID, LOG_USER);
}

SystemLogSink::~SystemLogSink() { ::closelog(); }

void SystemLogSink::write(std::string_view line) {
  ::syslog(LOG_INFO, "%.*s", static_cast<int>(line.size()), line.data());
  if (_echo == Echo::standardError) writeAll(STDERR_FILENO, std::string(line) + '\n');
}

}  // namespace qel
