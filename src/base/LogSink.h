// Where lines of text go: the system log or standard output.
#pragma once

#include <memory>
#include <string_view>

namespace qel {

class Dictionary;

// Takes whole lines without their newline. Any thread.
class LogSink {
 public:
  virtual ~LogSink() = default;
  virtual void write(std::string_view line) = 0;
  // Whether lines go anywhere: one that is dear to make need not be made for nobody.
  virtual bool wantsLines() const { return true; }
  // A line about an event: `text` and the event as JSON. A sink may want to know that it is one.
  virtual void writeEvent(std::string_view text, const Dictionary& event);
  // Hands on what the sink still holds.
  virtual void flush() {}
};

// Drops every line.
class NullSink final : public LogSink {
 public:
  void write(std::string_view) override {}
  bool wantsLines() const override { return false; }
  void writeEvent(std::string_view, const Dictionary&) override {}
};

// The two sinks of the process. At first standard output is the real one, line by line, and the
// system log is syslog. Setting is for start-up and tests, before other threads log; an empty
// pointer drops every line. Standard output is flushed when the process ends by itself, and before
// a fatal error ends it.
LogSink& standardOutput();
LogSink& systemLog();
void setStandardOutput(std::shared_ptr<LogSink> sink);
void setSystemLog(std::shared_ptr<LogSink> sink);

}  // namespace qel
