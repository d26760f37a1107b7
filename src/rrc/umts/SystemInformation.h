// What is read of UMTS's system information (25.331, clause 10.2.48.8): plain values.
//
// A number stands as it is signalled. What the block does not say is absent.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "base/Bytes.h"

namespace qel::rrc::umts {

struct Sib1 {
  std::vector<unsigned> drxCoefficients;  // of the core network's domains: 2^k frames
};

struct Sib3 {
  std::uint32_t cellId = 0;  // 28 bits
  bool barred = false;
  bool fdd = true;
  // Of a cell with two frequencies; in steps of 2 dB.
  std::optional<int> intraSearch;
  std::optional<int> interSearch;
  std::optional<int> gsmSearch;
};

// Nothing is known of a cell whose channels are described otherwise than the schema has them.
struct Sib5 {
  bool hsdpa = false;
  bool edch = false;
};

struct Sib11 {
  bool fachMeasurementOccasions = false;
};

struct PrioritisedFrequency {
  unsigned channel = 0;
  std::optional<unsigned> priority;
};

struct Sib19 {
  unsigned priority = 0;  // of the own frequency
  std::vector<PrioritisedFrequency> utraFdd;
  std::vector<PrioritisedFrequency> gsm;  // kMostGsmFrequencies at most
  std::vector<PrioritisedFrequency> eutra;

  static constexpr std::size_t kMostGsmFrequencies = 1024;
};

// Any thread. Nothing when the bits are no such block.
std::optional<Sib1> readSib1(ByteView block);
std::optional<Sib3> readSib3(ByteView block);
std::optional<Sib5> readSib5(ByteView block);
std::optional<Sib11> readSib11(ByteView block);
std::optional<Sib19> readSib19(ByteView block);

}  // namespace qel::rrc::umts
