// Writing that never waits inside the system.
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace qel {

// To a descriptor that stays the caller's, and whose flags stay as they are: other programs may
// share them. A pipe or terminal is opened once more, to be asked without waiting; where that is
// not allowed, it is asked for room and then given no more than always fits. Files are written as
// they are. One thread at a time.
class NonBlockingWriter {
 public:
  explicit NonBlockingWriter(int descriptor);
  ~NonBlockingWriter();
  NonBlockingWriter(const NonBlockingWriter&) = delete;
  NonBlockingWriter& operator=(const NonBlockingWriter&) = delete;

  // As much from the front of `text` as goes at once, which may be nothing: how many bytes.
  std::size_t write(std::string_view text);
  // Until there is room, an error or a signal, that long at most.
  void wait(std::chrono::milliseconds longest) const;
  // The error number of the first write that failed, else 0; nothing is written after it.
  int error() const { return _error; }

 private:
  std::size_t writeSome(std::string_view text);
  enum class Kind : std::uint8_t {
    file,  // or a device that makes nobody wait
    socket,
    stream,  // a pipe or a terminal
  };
  static Kind kindOf(int descriptor);

  const int _descriptor;
  const Kind _kind;
  const int _own;  // another description of the same stream, or -1
  int _error = 0;
};

// Writes what goes within the time; the error number of the write that failed, else 0.
int writeBriefly(int descriptor, std::string_view text, std::chrono::milliseconds longest);

}  // namespace qel
