#include "rrc/lte/Connection.h"

#include <array>

#include "rrc/lte/Readers.h"
#include "rrc/lte_schema.h"

namespace qel::rrc::lte {
namespace {

// In the order of the alternatives, with those that were added.
constexpr std::array kRedirections = {
    Target::eutra,         Target::geran,   Target::utraFdd, Target::utraTdd, Target::cdma2000Hrpd,
    Target::cdma20001xRtt, Target::utraTdd, Target::nr,      Target::nr,
};
constexpr std::array kHandoverTargets = {
    Target::utra,         Target::geran, Target::cdma20001xRtt,
    Target::cdma2000Hrpd, Target::nr,    Target::eutra,
};

std::optional<std::size_t> placeOf(const Node& node, std::size_t size) {
  const auto index = node.index();
  if (!index || *index < 0 || static_cast<std::size_t>(*index) >= size) return std::nullopt;
  return static_cast<std::size_t>(*index);
}

std::optional<Redirection> redirectionFrom(const Node& message) {
  const Node node = message[mark::redirectedCarrierInfo];
  const auto place = placeOf(node, kRedirections.size());
  if (!place) return std::nullopt;
  Redirection redirection;
  redirection.target = kRedirections[*place];
  const Node chosen = node.first();
  take(chosen, redirection.carrier);
  take(chosen[mark::startingARFCN], redirection.carrier);
  take(chosen[mark::carrierFreqR15], redirection.carrier);
  take(chosen[Mark::element], redirection.carrier);
  if (redirection.target == Target::eutra) take(message[mark::eutraV9e0], redirection.carrier);
  return redirection;
}

}  // namespace

std::optional<ConnectionRequest> requestFrom(const Node& message) {
  const auto cause = message[mark::establishmentCause].index();
  if (!cause) return std::nullopt;
  return ConnectionRequest{static_cast<EstablishmentCause>(*cause)};
}

std::optional<ReestablishmentRequest> reestablishmentRequestFrom(const Node& message) {
  const auto cause = message[mark::reestablishmentCause].index();
  if (!cause) return std::nullopt;
  ReestablishmentRequest request{.cause = static_cast<ReestablishmentCause>(*cause)};
  take(message[mark::physCellId], request.pci);
  return request;
}

std::optional<ConnectionRelease> releaseFrom(const Node& message) {
  const auto cause = message[mark::releaseCause].index();
  if (!cause) return std::nullopt;
  return ConnectionRelease{static_cast<ReleaseCause>(*cause), redirectionFrom(message)};
}

MobilityFromEutra mobilityFrom(const Node& message) {
  if (message[mark::cellChangeOrder]) return {Target::geran};
  if (message[mark::eCSFBR9]) return {Target::cdma20001xRtt};
  const auto place = placeOf(message[mark::targetRATType], kHandoverTargets.size());
  if (!place) return {};
  return {kHandoverTargets[*place]};
}

std::vector<Bytes> nasFrom(const Node& message) {
  std::vector<Bytes> nas;
  message.each([&](const Node& node) {
    const bool one =
        node.mark() == mark::dedicatedInfoNAS || node.mark() == mark::dedicatedInfoNASR15;
    if (one) nas.push_back(node.octets());
    if (node.mark() == mark::dedicatedInfoNASList) {
      node.each([&](const Node& element) { nas.push_back(element.octets()); });
    }
  });
  return nas;
}

}  // namespace qel::rrc::lte
