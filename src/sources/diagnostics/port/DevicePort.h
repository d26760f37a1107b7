// A port that is a device: a terminal of a USB modem, or a node of the kernel's wwan class.
#pragma once

#include <memory>
#include <string>

#include "sources/diagnostics/port/Descriptor.h"
#include "sources/diagnostics/port/DiagPort.h"

namespace qel::diagnostics {

// Carries frames. A terminal is made raw and, while it is open, ours alone; a wwan node is no
// terminal and cannot be kept from others.
class DevicePort final : public DiagPort {
 public:
  static std::unique_ptr<DiagPort> open(const std::string& path, PortTrouble& trouble);

  explicit DevicePort(Descriptor device) : _device(std::move(device)) {}
  ~DevicePort() override;

  int descriptor() const override { return _device.number(); }
  bool receive(const FrameReader::Take& take) override;
  bool send(const Request& request) override;
  const FrameReader::Counts& counts() const override { return _frames.counts(); }

 private:
  Descriptor _device;
  FrameReader _frames;
  bool _torn = false;  // the last request went out in part
};

}  // namespace qel::diagnostics
