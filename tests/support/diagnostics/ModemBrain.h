// What a modem answers on its diagnostics port, and what it has been told to send.
#pragma once

#include <array>
#include <cstdint>
#include <map>
#include <vector>

#include "base/Bytes.h"

namespace qel::diagnostics::test {

// No threads. A request that this program must never make is kept, and refused.
class ModemBrain {
 public:
  enum class Manner : std::uint8_t {
    honest,
    silent,         // answers nothing
    refusing,       // answers every question about logs with a refusal
    lying,          // answers with wrong lengths, other operations and other equipments
    withoutEvents,  // knows no event mask
  };

  Manner manner = Manner::honest;
  std::array<std::uint32_t, 16> ranges = {0, 2270, 0,   0,   2320, 1056, 0, 1279,
                                          0, 0,    906, 513, 0,    511,  0, 0};

  // In the order in which they are to be sent.
  std::vector<Bytes> answersTo(ByteView request);

  bool sends(std::uint16_t code) const;
  bool sendsAnyLog() const { return !_masks.empty(); }
  bool sendsEvents() const { return _events; }
  void forget();  // as after a reset
  void setMask(unsigned equipment, Bytes bits) { _masks[equipment] = std::move(bits); }

  const std::vector<Bytes>& requests() const { return _requests; }
  const std::vector<Bytes>& forbidden() const { return _forbidden; }

 private:
  std::vector<Bytes> honestly(ByteView request);
  Bytes logConfiguration(ByteView request);

  std::map<unsigned, Bytes> _masks;
  bool _events = false;
  std::vector<Bytes> _requests;
  std::vector<Bytes> _forbidden;
};

}  // namespace qel::diagnostics::test
