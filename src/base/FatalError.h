// The one way out for a broken contract.
#pragma once

#include <functional>
#include <string_view>

namespace qel {

// Runs the handlers of atFatalError, writes `reason` as one line on standard error and aborts the
// process (SIGABRT). Any thread.
[[noreturn]] void fatalError(std::string_view reason);

// Work that must not be lost with the process, such as flushing buffered lines. Called once, on
// the failing thread; it must not call fatalError. Registered at start-up, before other threads.
void atFatalError(std::function<void()> handler);

}  // namespace qel
