#include "support/diagnostics/PseudoModem.h"

#include <fcntl.h>
#include <poll.h>
#include <stdlib.h>
#include <unistd.h>

#include <array>
#include <stdexcept>
#include <utility>

#include "support/diagnostics/Packets.h"

namespace qel::diagnostics::test {

using Steady = std::chrono::steady_clock;

PseudoModem::PseudoModem(ModemBrain brain)
    : _master(::posix_openpt(O_RDWR | O_NOCTTY | O_NONBLOCK | O_CLOEXEC)),
      _brain(std::move(brain)) {
  std::array<char, 64> name{};
  if (_master < 0 || ::grantpt(_master) != 0 || ::unlockpt(_master) != 0 ||
      ::ptsname_r(_master, name.data(), name.size()) != 0) {
    throw std::runtime_error("no pseudo-terminal");
  }
  _path = name.data();
  _thread = std::thread([this] { play(); });
}

PseudoModem::~PseudoModem() { unplug(); }

void PseudoModem::unplug() {
  {
    const std::lock_guard lock(_mutex);
    _ending = true;
  }
  _wakeUp.signal();
  if (_thread.joinable()) _thread.join();
  if (_master >= 0) ::close(std::exchange(_master, -1));
}

void PseudoModem::sendBytes(ByteView bytes) {
  const auto give_up = Steady::now() + std::chrono::seconds{20};
  while (!bytes.empty() && Steady::now() < give_up) {
    const ssize_t count = ::write(_master, bytes.data(), bytes.size());
    if (count > 0) {
      bytes = bytes.subspan(static_cast<std::size_t>(count));
    } else {
      pollfd room{_master, POLLOUT, 0};
      ::poll(&room, 1, 10);
    }
  }
}

void PseudoModem::send(ByteView packet) { sendBytes(framed(packet)); }

bool PseudoModem::sendLog(std::uint16_t code, ByteView body, std::uint64_t timeMs) {
  if (!with([code](const ModemBrain& brain) { return brain.sends(code); })) return false;
  send(logPacket(code, body, timeMs));
  return true;
}

void PseudoModem::stream(unsigned perSecond, std::function<Bytes()> nextBytes) {
  const std::lock_guard lock(_mutex);
  _nextBytes = std::move(nextBytes);
  _pause = std::chrono::nanoseconds{std::chrono::seconds{1}} / perSecond;
  _streamAt = Steady::now();
  _wakeUp.signal();
}

void PseudoModem::play() {
  while (true) {
    Steady::time_point until;
    {
      const std::lock_guard lock(_mutex);
      if (_ending) return;
      until = _streamAt;
    }
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(until - Steady::now()).count();
    const int timeout = until == Steady::time_point::max()
                            ? 1000
                            : static_cast<int>(std::max<std::int64_t>(left, 0));
    std::array<pollfd, 2> waited{pollfd{_master, POLLIN, 0},
                                 pollfd{_wakeUp.descriptor(), POLLIN, 0}};
    // While nobody has the terminal open there is a hang-up all the time.
    if (::poll(waited.data(), waited.size(), timeout) > 0 && (waited[0].revents & POLLIN) == 0 &&
        (waited[0].revents & POLLHUP) != 0) {
      ::poll(&waited[1], 1, 2);
    }
    _wakeUp.clear();
    if ((waited[0].revents & POLLIN) != 0) receive();
    streamDue();
  }
}

void PseudoModem::receive() {
  std::array<std::uint8_t, 4096> bytes;
  const ssize_t count = ::read(_master, bytes.data(), bytes.size());
  if (count <= 0) return;
  std::vector<Bytes> answers;
  {
    const std::lock_guard lock(_mutex);
    _frames.add(ByteView(bytes).first(static_cast<std::size_t>(count)), [&](ByteView request) {
      for (Bytes& answer : _brain.answersTo(request)) answers.push_back(std::move(answer));
    });
  }
  for (const Bytes& answer : answers) send(answer);
}

void PseudoModem::streamDue() {
  Bytes bytes;
  {
    const std::lock_guard lock(_mutex);
    if (Steady::now() < _streamAt || !_nextBytes) return;
    bytes = _nextBytes();
    _streamAt += _pause;
  }
  [[maybe_unused]] const auto written = ::write(_master, bytes.data(), bytes.size());
}

}  // namespace qel::diagnostics::test
