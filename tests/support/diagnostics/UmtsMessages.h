// Messages of UMTS's air interface, written bit by bit (25.331, clause 11).
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "base/Bytes.h"
#include "rrc/BitWriter.h"

namespace qel::diagnostics::test {

using testing::BitWriter;

// For uplink and downlink; the places of the causes in the standard.
Bytes umtsConnectionRequest(unsigned cause);
Bytes umtsConnectionReject(unsigned cause);
Bytes umtsConnectionRelease(unsigned cause);            // on a dedicated channel
Bytes umtsConnectionReleaseOfRelease4(unsigned cause);  // likewise, the newer form

// Blocks of system information.
BitWriter umtsBlock1(const std::vector<unsigned>& drxCoefficients);
struct WrittenUmtsBlock3 {
  unsigned cellId = 0x3600803;
  bool barred = false;
  std::optional<int> intraSearch = {};  // in steps of 2 dB
  std::optional<int> interSearch = {};
  std::optional<int> gsmSearch = {};
};
BitWriter umtsBlock3(const WrittenUmtsBlock3& block = {});
// With high-speed access in these directions; described as a cell with one frequency if not `fdd`.
BitWriter umtsBlock5(bool downlink, bool uplink, bool fdd = true);
BitWriter umtsBlock11(bool fachMeasurementOccasions);

struct WrittenFrequency {
  unsigned channel = 0;
  unsigned priority = 0;
};
// Of the GSM carriers each is a group of its own.
BitWriter umtsBlock19(unsigned priority, const std::vector<WrittenFrequency>& umts,
                      const std::vector<WrittenFrequency>& gsm,
                      const std::vector<WrittenFrequency>& lte);

// Blocks of 20 ms of the broadcast channel.
Bytes umtsFirstSegment(unsigned sfnPrime, unsigned type, unsigned count, const BitWriter& block);
Bytes umtsNextSegment(unsigned sfnPrime, unsigned type, unsigned index, const BitWriter& block);
Bytes umtsLastSegment(unsigned sfnPrime, unsigned type, unsigned index, const BitWriter& block);
Bytes umtsWholeBlock(unsigned sfnPrime, unsigned type, const BitWriter& block);

}  // namespace qel::diagnostics::test
