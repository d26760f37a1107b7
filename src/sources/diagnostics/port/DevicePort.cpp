#include "sources/diagnostics/port/DevicePort.h"

#include <fcntl.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <termios.h>

#include <array>
#include <cerrno>

#include "sources/diagnostics/port/SystemTrouble.h"

namespace qel::diagnostics {
namespace {

constexpr std::size_t kMostBytesOfATurn = 16384;

// No byte means anything to the terminal: all of them occur in frames.
bool makeRaw(int terminal) {
  termios settings{};
  if (::tcgetattr(terminal, &settings) != 0) return false;
  ::cfmakeraw(&settings);
  settings.c_cflag |= CLOCAL | CREAD;
  settings.c_cflag &= ~static_cast<tcflag_t>(CRTSCTS | CSTOPB);
  settings.c_iflag &= ~static_cast<tcflag_t>(IXOFF | IXANY);
  settings.c_cc[VMIN] = 1;  // with 0 a hang-up could not be told from silence
  settings.c_cc[VTIME] = 0;
  ::cfsetspeed(&settings, B115200);
  return ::tcsetattr(terminal, TCSANOW, &settings) == 0;
}

// Those who may do everything can open a terminal that another keeps to itself.
bool isKept(int terminal) {
  int kept = 0;
  return ::ioctl(terminal, TIOCGEXCL, &kept) == 0 && kept != 0;
}

}  // namespace

std::unique_ptr<DiagPort> DevicePort::open(const std::string& path, PortTrouble& trouble) {
  Descriptor device(::open(path.c_str(), O_RDWR | O_NOCTTY | O_NONBLOCK | O_CLOEXEC));
  if (!device) return trouble = systemTrouble(errno), nullptr;
  struct stat status {};
  if (::fstat(device.number(), &status) != 0 || !S_ISCHR(status.st_mode)) {
    return trouble = {PortTrouble::Kind::failed, "no device"}, nullptr;
  }
  if (::isatty(device.number()) != 0) {
    if (isKept(device.number())) {
      return trouble = {PortTrouble::Kind::held, "held by another program"}, nullptr;
    }
    if (!makeRaw(device.number())) return trouble = systemTrouble(errno), nullptr;
    ::ioctl(device.number(), TIOCEXCL);
    ::tcflush(device.number(), TCIOFLUSH);
  }
  return std::make_unique<DevicePort>(std::move(device));
}

// A terminal that another has open as well would stay shut behind us.
DevicePort::~DevicePort() { ::ioctl(descriptor(), TIOCNXCL); }

bool DevicePort::receive(const FrameReader::Take& take) {
  std::array<std::uint8_t, kMostBytesOfATurn> bytes;
  const ssize_t count = ::read(descriptor(), bytes.data(), bytes.size());
  if (count < 0) return errno == EAGAIN || errno == EINTR;
  if (count == 0) return false;
  _frames.add(ByteView(bytes).first(static_cast<std::size_t>(count)), take);
  return true;
}

bool DevicePort::send(const Request& request) {
  Bytes frame = frameOf(request.packet());
  if (_torn) frame.insert(frame.begin(), kFrameMark);  // ends what was begun
  const ssize_t count = ::write(descriptor(), frame.data(), frame.size());
  if (count > 0) _torn = static_cast<std::size_t>(count) < frame.size();
  return count > 0 && !_torn;
}

}  // namespace qel::diagnostics
