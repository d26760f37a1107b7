#include "history/Quantity.h"

#include "radio/Quality.h"

namespace qel {
namespace {

QuantityFacts facts(Technology technology, std::string_view name, Scale scale) {
  const QualityScale& of = scaleOf(scale);
  return {technology, name, of.unit, of.good, of.fair, of.lowest, of.highest};
}

}  // namespace

const QuantityFacts& factsOf(Quantity quantity) {
  static const std::array kFacts = {
      facts(Technology::lte, "RSRP", Scale::rsrp),   facts(Technology::lte, "RSRQ", Scale::rsrq),
      facts(Technology::lte, "SINR", Scale::sinr),   facts(Technology::umts, "RSCP", Scale::rscp),
      facts(Technology::umts, "Ec/No", Scale::ecno), facts(Technology::gsm, "RxLev", Scale::rxlev),
  };
  return kFacts.at(static_cast<std::size_t>(quantity));
}

}  // namespace qel
