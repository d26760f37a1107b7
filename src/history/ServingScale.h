// What the numbers stand for in which serving cells are reported.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

#include "history/Quantity.h"

namespace qel {

// Beyond what any phone may report (36.133, 9.1.4, 9.1.7 and 9.1.17; 25.133, 9.1; 45.008, 8.1.4).
struct PossibleValues {
  float lowest;
  float highest;
};
constexpr PossibleValues possibleValues(Quantity quantity) {
  constexpr std::array<PossibleValues, kQuantities.size()> kPossible = {
      {{-157, -30}, {-44, 3}, {-30, 50}, {-122, -24}, {-25, 1}, {-121, -20}}};
  return kPossible[static_cast<std::size_t>(quantity)];
}

// The value is number * step + zero, in the quantity's unit.
class ServingScale {
 public:
  constexpr explicit ServingScale(Quantity quantity, float step = 1, float zero = 0)
      : _quantity(quantity),
        _step(step),
        _zero(zero),
        _lowest(roundedUp((possibleValues(quantity).lowest - zero) / step)),
        _span(-roundedUp((zero - possibleValues(quantity).highest) / step) - _lowest) {}

  constexpr Quantity quantity() const { return _quantity; }
  constexpr float valueOf(std::int64_t number) const {
    return static_cast<float>(number) * _step + _zero;
  }
  // Whether the quantity can have the value that it stands for.
  constexpr bool has(std::int64_t number) const {
    const auto above = static_cast<std::uint64_t>(number) - static_cast<std::uint64_t>(_lowest);
    return above <= static_cast<std::uint64_t>(_span);
  }

 private:
  static constexpr std::int64_t roundedUp(float number) {
    const auto whole = static_cast<std::int64_t>(number);
    return static_cast<float>(whole) < number ? whole + 1 : whole;
  }

  Quantity _quantity;
  float _step;
  float _zero;
  std::int64_t _lowest;  // number, and how much higher it may be
  std::int64_t _span;
};

}  // namespace qel
