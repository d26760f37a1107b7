// What the reader of layouts found in a packet.
#pragma once

#include <array>
#include <bitset>
#include <cstddef>
#include <cstdint>
#include <optional>

namespace qel::diagnostics {

// Everything that a layout can say where to find. Those of the antennas stand in their order.
enum class Field : std::uint8_t {
  count,  // of the records
  earfcn,
  ulEarfcn,
  pci,
  dlBlocks,
  ulBlocks,
  cellId,
  area,
  band,
  mcc,
  mnc,
  mncDigits,
  cellIndex,
  isServing,
  rsrp0,
  rsrp1,
  rsrp2,
  rsrp3,
  rsrp,
  rsrq0,
  rsrq1,
  rsrq2,
  rsrq3,
  rsrq,
  rssi0,
  rssi1,
  rssi2,
  rssi3,
  rssi,
  snr0,
  snr1,
  snr2,
  snr3,
  subframe,
  txPower,
  end,
};

constexpr std::size_t indexOf(Field field) { return static_cast<std::size_t>(field); }

constexpr Field next(Field field, std::size_t steps) {
  return static_cast<Field>(indexOf(field) + steps);
}

class Values {
 public:
  void set(Field field, double value) {
    _values[indexOf(field)] = value;
    _known.set(indexOf(field));
  }
  bool has(Field field) const { return _known.test(indexOf(field)); }
  std::optional<double> find(Field field) const {
    return has(field) ? std::optional(_values[indexOf(field)]) : std::nullopt;
  }
  // The caller knows that the layout has it.
  double operator[](Field field) const { return _values[indexOf(field)]; }
  std::uint32_t number(Field field) const { return static_cast<std::uint32_t>((*this)[field]); }

 private:
  std::array<double, indexOf(Field::end)> _values{};
  std::bitset<indexOf(Field::end)> _known;
};

}  // namespace qel::diagnostics
