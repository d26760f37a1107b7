#include "base/LogSink.h"

#include <unistd.h>

#include <cstdlib>

#include "base/DescriptorSink.h"
#include "base/DroppedOutput.h"
#include "base/FatalError.h"
#include "base/LineBuffer.h"
#include "base/Rendering.h"
#include "base/SystemLogSink.h"

namespace qel {
namespace {

using Sink = std::shared_ptr<LogSink>;

constinit thread_local unsigned dropping = 0;

Sink& standardOutputSlot();
void flushStandardOutput() { standardOutputSlot()->flush(); }

// Apart from what every line asks for.
[[gnu::noinline]] Sink* makeStandardOutputSlot() {
  std::atexit(flushStandardOutput);
  atFatalError(flushStandardOutput);
  return new Sink(std::make_shared<DescriptorSink>(STDOUT_FILENO));
}

// Neither slot is ever destroyed: threads may log while the process ends.
Sink& standardOutputSlot() {
  static auto& sink = *makeStandardOutputSlot();
  return sink;
}

Sink& systemLogSlot() {
  static auto& sink =
      *new Sink(std::make_shared<SystemLogSink>("qelwatch", SystemLogSink::Echo::none));
  return sink;
}

[[gnu::noinline]] LogSink& noOutput() {
  static auto& none = *new NullSink();
  return none;
}

Sink orNull(Sink sink) { return sink ? std::move(sink) : std::make_shared<NullSink>(); }

}  // namespace

void LogSink::writeEvent(std::string_view text, const Dictionary& event) {
  static thread_local LineBuffer line;
  line.clear();
  line.append(text);
  appendJson(line, event);
  write(line.view());
}

DroppedOutput::DroppedOutput() { ++dropping; }
DroppedOutput::~DroppedOutput() { --dropping; }

LogSink& standardOutput() {
  if (dropping != 0) [[unlikely]]
    return noOutput();
  return *standardOutputSlot();
}
LogSink& systemLog() { return *systemLogSlot(); }
void setStandardOutput(Sink sink) { standardOutputSlot() = orNull(std::move(sink)); }
void setSystemLog(Sink sink) { systemLogSlot() = orNull(std::move(sink)); }

}  // namespace qel
