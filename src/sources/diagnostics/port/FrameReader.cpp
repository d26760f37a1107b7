#include "sources/diagnostics/port/FrameReader.h"

#include <algorithm>
#include <optional>

namespace qel::diagnostics {
namespace {

constexpr std::uint8_t kRepeatedByte = 0x10;  // the command of a log packet

// The packet in front of its check sum.
std::optional<ByteView> checked(ByteView frame) {
  if (frame.size() <= kCheckSumBytes) return std::nullopt;
  const ByteView packet = frame.first(frame.size() - kCheckSumBytes);
  const ByteView sum = frame.last(kCheckSumBytes);
  if (checkSum(packet) != (sum[0] | sum[1] << 8)) return std::nullopt;
  return packet;
}

// The frame with one of the bytes that its first byte is repeated in; the frame itself when it is
// not.
ByteView withoutSurplus(ByteView frame) {
  const auto other =
      std::ranges::find_if(frame, [](std::uint8_t byte) { return byte != kRepeatedByte; });
  const auto run = static_cast<std::size_t>(other - frame.begin());
  return run > 1 ? frame.subspan(run - 1) : frame;
}

}  // namespace

void FrameReader::add(ByteView bytes, const Take& take) {
  _counts.bytes += bytes.size();
  while (!bytes.empty()) {
    const auto mark = std::ranges::find(bytes, kFrameMark);
    const auto length = static_cast<std::size_t>(mark - bytes.begin());
    append(bytes.first(length));
    if (mark == bytes.end()) return;
    finishFrame(take);
    bytes = bytes.subspan(length + 1);
  }
}

void FrameReader::append(ByteView bytes) {
  while (!bytes.empty()) {
    if (_escaped) {
      const std::uint8_t meant = bytes[0] ^ kEscapedBit;
      appendPlain({&meant, 1});
      _escaped = false;
      bytes = bytes.subspan(1);
    }
    const auto escape = std::ranges::find(bytes, kFrameEscape);
    const auto length = static_cast<std::size_t>(escape - bytes.begin());
    appendPlain(bytes.first(length));
    if (escape == bytes.end()) return;
    _escaped = true;
    bytes = bytes.subspan(length + 1);
  }
}

void FrameReader::appendPlain(ByteView bytes) {
  _tooLong = _tooLong || bytes.size() > kLongestFrame - _frame.size();
  if (!_tooLong) _frame.insert(_frame.end(), bytes.begin(), bytes.end());
}

void FrameReader::finishFrame(const Take& take) {
  if (_frame.empty() && !_escaped && !_tooLong) return;  // a mark in front of a frame
  std::optional<ByteView> packet;
  if (!_escaped && !_tooLong) {
    packet = checked(_frame);
    if (const ByteView shorter = withoutSurplus(_frame);
        !packet && shorter.size() < _frame.size()) {
      packet = checked(shorter);
      if (packet) ++_counts.repaired;
    }
  }
  ++(packet ? _counts.frames : _counts.badFrames);
  if (packet) take(*packet);
  beginFrame();
}

void FrameReader::cut() {
  if (!_frame.empty() || _escaped || _tooLong) ++_counts.badFrames;
  beginFrame();
}

void FrameReader::beginFrame() {
  _frame.clear();
  _escaped = false;
  _tooLong = false;
}

}  // namespace qel::diagnostics
