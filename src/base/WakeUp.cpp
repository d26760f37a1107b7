#include "base/WakeUp.h"

#include <sys/eventfd.h>
#include <unistd.h>

#include <cerrno>
#include <cstdint>
#include <system_error>

namespace qel {

WakeUp::WakeUp() : _descriptor(::eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK)) {
  if (_descriptor < 0) throw std::system_error(errno, std::generic_category(), "eventfd");
}

WakeUp::~WakeUp() { ::close(_descriptor); }

void WakeUp::signal() const {
  const std::uint64_t one = 1;
  // Fails only when the counter is full, and then the other side wakes up anyway.
  [[maybe_unused]] const auto written = ::write(_descriptor, &one, sizeof one);
}

void WakeUp::clear() const {
  std::uint64_t count = 0;
  [[maybe_unused]] const auto taken = ::read(_descriptor, &count, sizeof count);
}

}  // namespace qel
