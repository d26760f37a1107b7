#include "tools/Output.h"

#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>

#include "base/FatalError.h"
#include "tools/ToolError.h"

namespace qel::tools {

Output::Output() : _sink(std::make_shared<BatchingSink>(STDOUT_FILENO)) {
  atFatalError([sink = _sink] { sink->flush(); });
}

void Output::line(std::string_view text) {
  _sink->write(text);
  check();
}

void Output::draw(std::string_view text) {
  _sink->draw(text);
  _sink->flushWhatGoes();
  check();
}

void Output::flush() {
  _sink->flush();
  check();
}

std::optional<BatchingSink::Clock::time_point> Output::flushWhenDue() {
  const auto due = _sink->flushWhenDue(BatchingSink::Clock::now());
  check();
  return due;
}

void Output::check() {
  const int error = _sink->error();
  if (error == 0) return;
  if (error == EPIPE) std::_Exit(EX_OK);
  throw ToolError(EX_IOERR, "standard output", std::strerror(error));
}

}  // namespace qel::tools
