#include "sources/modem_manager/SimReadings.h"

#include <algorithm>
#include <vector>

#include "sources/modem_manager/Names.h"

namespace qel::sources {
namespace {

constexpr std::size_t kMostNumbers = 16;

std::string digitsOnly(std::string text) {
  // A filler at the end is how some cards' digits come.
  while (!text.empty() && (text.back() == 'F' || text.back() == 'f')) text.pop_back();
  const bool digits = std::ranges::all_of(text, [](char c) { return c >= '0' && c <= '9'; });
  return digits ? text : std::string();
}

std::string digitsOf(const BusProperties& properties, const char* key, std::size_t fewest,
                     std::size_t most) {
  std::string digits = digitsOnly(busValue<std::string>(properties, key).value_or(""));
  return digits.size() >= fewest && digits.size() <= most ? digits : std::string();
}

}  // namespace

std::string simPathOf(const BusProperties& modem) {
  const std::string active = busValue<sdbus::ObjectPath>(modem, "Sim").value_or(mm::kNoObject);
  if (active != mm::kNoObject) return active;
  const auto slots = busValue<std::vector<sdbus::ObjectPath>>(modem, "SimSlots");
  const std::uint32_t primary = busUnsigned(modem, "PrimarySimSlot").value_or(0);  // from 1
  if (!slots || primary == 0 || primary > slots->size()) return mm::kNoObject;
  return (*slots)[primary - 1];
}

SimReading simReading(const BusProperties& sim) {
  SimReading reading;
  reading.imsi = digitsOf(sim, "Imsi", 6, 15);             // 23.003, clause 2.2
  reading.iccid = digitsOf(sim, "SimIdentifier", 18, 20);  // ITU-T E.118
  reading.network = digitsOf(sim, "OperatorIdentifier", 5, 6);
  reading.providerName = busValue<std::string>(sim, "OperatorName").value_or("");
  for (const std::string& number : busValue<std::vector<std::string>>(sim, "EmergencyNumbers")
                                       .value_or(std::vector<std::string>())) {
    constexpr std::size_t kMostDigits = 6;  // 51.011, clause 10.3.27
    if (reading.emergencyNumbers.size() == kMostNumbers) break;
    const std::string digits = digitsOnly(number);
    if (!digits.empty() && digits.size() <= kMostDigits) reading.emergencyNumbers.push_back(digits);
  }
  return reading;
}

}  // namespace qel::sources
