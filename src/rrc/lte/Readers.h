// From what the walker found in a message its plain values, one function a block.
#pragma once

#include <optional>
#include <vector>

#include "rrc/lte/Messages.h"
#include "rrc/reader/Reading.h"

namespace qel::rrc::lte {

MasterInformationBlock mibFrom(const Node& mib);
Sib1 sib1From(const Node& sib);
Sib2 sib2From(const Node& sib);
Sib3 sib3From(const Node& sib);
Sib5 sib5From(const Node& sib);
Sib6 sib6From(const Node& sib);
Sib7 sib7From(const Node& sib);

std::optional<ConnectionRequest> requestFrom(const Node& message);
std::optional<ReestablishmentRequest> reestablishmentRequestFrom(const Node& message);
std::optional<ConnectionRelease> releaseFrom(const Node& message);
MobilityFromEutra mobilityFrom(const Node& message);
std::vector<Bytes> nasFrom(const Node& message);

std::optional<RadioConfiguration> radioFrom(const Node& message);
Reconfiguration reconfigurationFrom(const Node& message);
MeasurementConfiguration measurementsFrom(const Node& configuration);
std::optional<MeasurementReport> reportFrom(const Node& message);

// The elements of a list of numbers; those that stand for none are left out.
std::vector<unsigned> numbersOf(const Node& list);

}  // namespace qel::rrc::lte
