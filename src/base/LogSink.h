// Where lines of text go: the system log or standard output.
#pragma once

#include <memory>
#include <mutex>
#include <string>
#include <string_view>

namespace qel {

// Takes whole lines without their newline. Any thread.
class LogSink {
 public:
  virtual ~LogSink() = default;
  virtual void write(std::string_view line) = 0;
};

// The two sinks of the process. At first standard output is the real one and the system log is
// syslog. A sink that is set must outlive its use; setting is for start-up and tests, before other
// threads log. An empty sink drops every line.
LogSink& standardOutput();
LogSink& systemLog();
void setStandardOutput(std::shared_ptr<LogSink> sink);
void setSystemLog(std::shared_ptr<LogSink> sink);

// Drops every line.
class NullSink final : public LogSink {
 public:
  void write(std::string_view) override {}
};

// One line, one write to the descriptor, unbuffered. A failed write is remembered, not repeated.
class DescriptorSink final : public LogSink {
 public:
  explicit DescriptorSink(int descriptor) : _descriptor(descriptor) {}
  void write(std::string_view line) override;
  bool failed() const { return _error != 0; }
  int error() const { return _error; }

 private:
  std::mutex _mutex;
  std::string _line;
  int _descriptor;
  int _error = 0;
};

// syslog(3) at level "info" under the program's name, and standard error too when asked.
class SystemLogSink final : public LogSink {
 public:
  enum class Echo { none, standardError };
  SystemLogSink(std::string program, Echo echo);
  ~SystemLogSink() override;
  void write(std::string_view line) override;

 private:
  std::string _program;  // openlog keeps the pointer
  Echo _echo;
};

}  // namespace qel
