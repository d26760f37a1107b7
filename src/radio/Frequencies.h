// The frequencies that channel numbers stand for.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "radio/Technology.h"

namespace qel {

// The centre of a carrier. Every raster has whole tenths of a MHz.
struct Frequency {
  std::int32_t tenthsOfMhz = 0;

  double mhz() const { return tenthsOfMhz / 10.0; }
  // "1842.5 MHz"
  std::string text() const;
  friend bool operator==(const Frequency&, const Frequency&) = default;
};

// What the phone receives on and what it then sends on, at the usual distance. Down is missing for
// a number that no band has, up for that and for a band that only receives.
struct Frequencies {
  std::optional<Frequency> down;
  std::optional<Frequency> up;

  // "1842.5 MHz down, 1747.5 MHz up"; empty without any.
  std::string text() const;
  friend bool operator==(const Frequencies&, const Frequencies&) = default;
};

// By the downlink EARFCN, and by that of an uplink (36.101, clause 5.7.3).
Frequencies lteFrequencies(std::uint32_t earfcn);
std::optional<Frequency> lteUplinkFrequency(std::uint32_t earfcn);

// What an operating band spans, "1805.0 to 1880.0 MHz down, 1710.0 to 1785.0 MHz up"; one span
// where both ways share it. Empty for a number that no band has.
std::string lteBandSpan(std::uint32_t band);

// By the downlink UARFCN (25.101, clauses 5.3.1 and 5.4).
Frequencies umtsFrequencies(std::uint32_t uarfcn);

// By the ARFCN (45.005, clause 2). Where a number stands for carriers of DCS 1800 and of PCS 1900,
// the band decides, a SystemBand, and else nothing does.
Frequencies gsmFrequencies(std::uint32_t arfcn, std::optional<std::int32_t> band = {});

// By the downlink channel of any of them. The country helps as it does in gsmBandOf.
Frequencies frequenciesOf(Technology technology, std::uint32_t channel,
                          std::optional<std::uint32_t> mcc = {});

}  // namespace qel
