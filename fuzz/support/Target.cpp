#include "fuzz/support/Target.h"

#include "base/LogSink.h"

// Called by libFuzzer with each input, in a buffer of exactly its size.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static const bool quiet = [] {
    qel::setStandardOutput(nullptr);
    qel::setSystemLog(nullptr);
    return true;
  }();
  static_cast<void>(quiet);
  qel::fuzz::tryInput(qel::fuzz::Input(data, size));
  return 0;
}
