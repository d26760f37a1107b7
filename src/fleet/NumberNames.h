// What numbers are called for Prometheus: qelwatch_ and words of the tables, with the base unit
// last.
#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace qel::fleet {

// "LteTxPower" as lte_tx_power. A letter alone goes with the word behind it, for it might be taken
// for a unit: "S_intra_search_Q" as sintra_search_q.
std::string asWords(std::string_view name);

struct NumberName {
  std::string text;
  double factor = 1;   // from the unit of the tables to the base unit: times this,
  double divisor = 1;  // and by this

  double inBaseUnit(double shown) const { return shown * factor / divisor; }
};

// Of what is called by these words and has this unit in the tables:
// "lte_rrc_state_prev_state_dur_ms" in "ms" is qelwatch_lte_rrc_state_prev_state_dur_seconds.
// Nothing for a unit without a base unit.
std::optional<NumberName> numberName(std::string_view words, std::string_view unit);

// The base unit that a name ends with, as "dbm" or "seconds"; empty: none.
std::string_view baseUnitOf(std::string_view name);

// A number of the tables as a double of the same decimal digits.
double widened(float shown);

}  // namespace qel::fleet
