#include "sources/diagnostics/port/AndroidPort.h"

#include <fcntl.h>
#include <sys/ioctl.h>

#include <array>
#include <cerrno>

#include "sources/diagnostics/packets/Bits.h"
#include "sources/diagnostics/port/SystemTrouble.h"

namespace qel::diagnostics {
namespace {

constexpr std::uint32_t kFrames = 0x20;  // what an envelope holds
constexpr std::uint32_t kRemote = ~0U;   // stands behind it where the modem is a chip of its own

constexpr unsigned long kSwitchLogging = 7;
constexpr unsigned long kAskRemote = 32;
constexpr std::uint32_t kToThisProgram = 2;

Bytes wordsOf(std::initializer_list<std::uint32_t> words) {
  Bytes bytes;
  for (const std::uint32_t word : words) {
    for (unsigned shift = 0; shift < 32; shift += 8) {
      bytes.push_back(static_cast<std::uint8_t>(word >> shift & 0xFF));
    }
  }
  return bytes;
}

// Kernels differ in what they take: a structure of 24 bytes, one of 9, or the number by itself.
bool takeLogs(int device) {
  constexpr std::uint32_t kAllParts = ~0U;
  constexpr std::uint32_t kNoPart = static_cast<std::uint32_t>(-22);
  Bytes ofLaterKernels = wordsOf({kToThisProgram, kAllParts, 0, 1, kNoPart, 1});
  Bytes ofEarlierKernels = wordsOf({kToThisProgram, kAllParts});
  ofEarlierKernels.push_back(1);
  return ::ioctl(device, kSwitchLogging, ofLaterKernels.data()) >= 0 ||
         ::ioctl(device, kSwitchLogging, ofEarlierKernels.data()) >= 0 ||
         ::ioctl(device, kSwitchLogging, static_cast<unsigned long>(kToThisProgram)) >= 0;
}

}  // namespace

std::unique_ptr<DiagPort> AndroidPort::open(const std::string& path, PortTrouble& trouble) {
  Descriptor device(::open(path.c_str(), O_RDWR | O_NONBLOCK | O_CLOEXEC));
  if (!device) return trouble = systemTrouble(errno), nullptr;
  if (!takeLogs(device.number())) return trouble = systemTrouble(errno), nullptr;
  std::uint16_t remote = 0;
  const bool isRemote = ::ioctl(device.number(), kAskRemote, &remote) >= 0 && remote != 0;
  return std::make_unique<AndroidPort>(std::move(device), isRemote);
}

bool AndroidPort::receive(const FrameReader::Take& take) {
  const ssize_t count = ::read(descriptor(), _buffer.data(), _buffer.size());
  if (count < 0) return errno == EAGAIN || errno == EINTR;
  if (count == 0) return false;
  open(ByteView(_buffer).first(static_cast<std::size_t>(count)), take);
  return true;
}

void AndroidPort::open(ByteView envelope, const FrameReader::Take& take) {
  const std::size_t headBytes = _remote ? 12 : 8;  // what it holds, remote, how many pieces
  if (envelope.size() < headBytes || u32At(envelope, 0) != kFrames) return;
  std::uint32_t pieces = u32At(envelope, headBytes - 4);
  envelope = envelope.subspan(headBytes);
  for (; pieces > 0 && envelope.size() >= 4; --pieces) {
    const std::size_t length = u32At(envelope, 0);
    envelope = envelope.subspan(4);
    if (length > envelope.size()) return;
    _frames.add(envelope.first(length), take);
    envelope = envelope.subspan(length);
  }
}

bool AndroidPort::send(const Request& request) {
  Bytes envelope = _remote ? wordsOf({kFrames, kRemote}) : wordsOf({kFrames});
  const Bytes frame = frameOf(request.packet());
  envelope.insert(envelope.end(), frame.begin(), frame.end());
  return ::write(descriptor(), envelope.data(), envelope.size()) ==
         static_cast<ssize_t>(envelope.size());
}

}  // namespace qel::diagnostics
