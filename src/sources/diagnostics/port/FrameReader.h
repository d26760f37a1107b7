// Packets out of a stream of frames, wherever the stream was cut.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>

#include "base/Bytes.h"
#include "sources/diagnostics/port/Hdlc.h"

namespace qel::diagnostics {

// Takes frames with the right check sum and skips the others. Some modems send the first byte of a
// log packet several times: the surplus is taken off. Holds at most one frame of kLongestFrame
// bytes; a longer one is skipped up to its mark. One thread.
class FrameReader {
 public:
  // The longest log packet, whose length has 16 bits, behind a wrapper.
  static constexpr std::size_t kLongestFrame = 8 + 4 + 0xFFFF + kCheckSumBytes;

  // Valid during the call.
  using Take = std::function<void(ByteView packet)>;

  struct Counts {
    std::uint64_t bytes = 0;
    std::uint64_t frames = 0;     // good ones
    std::uint64_t repaired = 0;   // of them: those that had a surplus
    std::uint64_t badFrames = 0;  // wrong check sum, too short, too long or cut
  };

  void add(ByteView bytes, const Take& take);
  // The stream has ended, or goes on elsewhere: a frame that was begun is bad.
  void cut();

  const Counts& counts() const { return _counts; }

 private:
  void append(ByteView bytes);
  void appendPlain(ByteView bytes);
  void finishFrame(const Take& take);
  void beginFrame();

  Bytes _frame;  // without escapes
  bool _escaped = false;
  bool _tooLong = false;
  Counts _counts;
};

}  // namespace qel::diagnostics
