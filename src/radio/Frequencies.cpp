#include "radio/Frequencies.h"

#include "radio/Bands.h"

namespace qel {

std::string Frequency::text() const {
  return std::to_string(tenthsOfMhz / 10) + '.' + std::to_string(tenthsOfMhz % 10) + " MHz";
}

std::string Frequencies::text() const {
  std::string text;
  if (down) text = down->text() + " down";
  if (up) text += (text.empty() ? "" : ", ") + up->text() + " up";
  return text;
}

Frequencies frequenciesOf(Technology technology, std::uint32_t channel,
                          std::optional<std::uint32_t> mcc) {
  switch (technology) {
    case Technology::lte:
      return lteFrequencies(channel);
    case Technology::umts:
      return umtsFrequencies(channel);
    case Technology::gsm:
      return gsmFrequencies(channel, gsmBandOf(channel, mcc));
  }
  return {};
}

}  // namespace qel
