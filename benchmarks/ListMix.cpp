#include "ListMix.h"

#include <memory>

#include "messages/lte_neighbours.h"

namespace qel::bench {
namespace {

constexpr std::uint32_t kMetric = 54031;
constexpr std::uint32_t kReports = 10;
constexpr std::uint32_t kIdentities = 504;

}  // namespace

std::vector<Payload> listPayloads(std::uint32_t elements) {
  std::vector<Payload> payloads;
  for (std::uint32_t i = 0; i < kReports; ++i) {
    KCellularLteNbrEutraCellMeas report;
    report.setTimestamp(kMixStartMs + i * kMixStepMs);
    for (std::uint32_t k = 0; k < elements; ++k) {
      auto cell = std::make_shared<EgwErrcNbrEutraMeas>();
      cell->setNbrEarfcn(1300);
      cell->setNbrPhysCellId((i + k) % kIdentities);
      cell->setFreqBandInd(3);
      cell->setNbrRsrp(static_cast<std::int32_t>(10 + (i + k) % 60));
      cell->setNbrRsrq(static_cast<std::int32_t>((i + k) % 30));
      report.addMeasNbrEutra(std::move(cell));
    }
    payloads.push_back({kMetric, report.data()});
  }
  return payloads;
}

}  // namespace qel::bench
