// The socket of a program that has the modem's port and shares it out.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "sources/diagnostics/port/Descriptor.h"
#include "sources/diagnostics/port/DiagPort.h"

namespace qel::diagnostics {

// A packet is a message: no frames. What one client sets holds for all, and the modem's answers go
// to all. A message longer than a frame may be is skipped, as is an empty one.
class RouterPort final : public DiagPort {
 public:
  // An abstract socket; "@NAME" stands for NAME with zeros up to the end of the address.
  static std::unique_ptr<DiagPort> open(const std::string& address, PortTrouble& trouble);

  explicit RouterPort(Descriptor socket) : _socket(std::move(socket)), _buffer(kBufferBytes) {}

  int descriptor() const override { return _socket.number(); }
  bool receive(const FrameReader::Take& take) override;
  bool send(const Request& request) override;
  const FrameReader::Counts& counts() const override { return _counts; }
  bool isShared() const override { return true; }

 private:
  static constexpr std::size_t kBufferBytes = FrameReader::kLongestFrame;

  bool hasEnded() const;

  Descriptor _socket;
  std::vector<std::uint8_t> _buffer;
  FrameReader::Counts _counts;
};

}  // namespace qel::diagnostics
