#include "radio/Bands.h"

#include "radio/BandNames.h"

namespace qel {
namespace {

std::string numbered(std::string_view number) {
  return number.empty() ? std::string() : "band " + std::string(number);
}

}  // namespace

std::string bandText(Technology technology, std::uint32_t channel,
                     std::optional<std::uint32_t> mcc) {
  switch (technology) {
    case Technology::lte: {
      const auto band = lteBandOf(channel);
      return band ? numbered(std::to_string(*band)) : std::string();
    }
    case Technology::umts:
      return numbered(umtsNumeralOf(channel));
    case Technology::gsm: {
      const auto band = gsmBandOf(channel, mcc);
      return band ? std::string(gsmBandName(*band)) : std::string();
    }
  }
  return {};
}

}  // namespace qel
