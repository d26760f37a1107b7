// The device of Android's kernels: frames in envelopes.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "sources/diagnostics/port/Descriptor.h"
#include "sources/diagnostics/port/DiagPort.h"

namespace qel::diagnostics {

// Of the device's envelopes, those with a modem's frames; others are skipped, and one that is
// against itself up to its end.
class AndroidPort final : public DiagPort {
 public:
  static std::unique_ptr<DiagPort> open(const std::string& path, PortTrouble& trouble);

  // `remote`: the modem is a chip of its own, and envelopes say so.
  AndroidPort(Descriptor device, bool remote)
      : _device(std::move(device)), _remote(remote), _buffer(kBufferBytes) {}

  int descriptor() const override { return _device.number(); }
  bool receive(const FrameReader::Take& take) override;
  bool send(const Request& request) override;
  const FrameReader::Counts& counts() const override { return _frames.counts(); }

 private:
  static constexpr std::size_t kBufferBytes = 65536;  // of one envelope

  void open(ByteView envelope, const FrameReader::Take& take);

  Descriptor _device;
  const bool _remote;
  std::vector<std::uint8_t> _buffer;
  FrameReader _frames;
};

}  // namespace qel::diagnostics
