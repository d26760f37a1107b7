// What is known to be in raw logs of real modems comes out for GSM, and nothing else does. Skipped
// without the logs, which lie in the folder that QEL_DIAG_CAPTURES names.
#include <gtest/gtest.h>

#include <algorithm>

#include "messages/gsm.h"
#include "sources/Metrics.h"
#include "support/diagnostics/CaptureRun.h"

namespace qel::diagnostics {
namespace {

using nlohmann::json;
using test::ToldMetric;

bool isCell(const ToldMetric& told) { return told.metric == metric::kGsmScellInfo; }

// The members that facts about a cell have.
json cellOf(const ToldMetric& told) {
  const auto cell = KCellularGsmScellInfo::initWithData(told.payload);
  json known = {{"mcc", cell->mcc()},
                {"mnc", cell->mnc()},
                {"num_mnc_digits", cell->numMncDigits()},
                {"lac", cell->lac()},
                {"cell_id", cell->cellId()}};
  if (cell->hasArfcn()) known["arfcn"] = cell->arfcn();
  if (cell->hasBsic()) known["bsic"] = cell->bsic();
  if (cell->hasGsmBand()) known["gsm_band"] = cell->gsmBand();
  return known;
}

bool holds(const json& found, const json& wanted) {
  return std::ranges::all_of(wanted.items(), [&](const auto& member) {
    return found.contains(member.key()) && found[member.key()] == member.value();
  });
}

TEST(GsmCaptures, TellTheirCellsAndNoOthers) {
  const auto names = test::captureNames();
  if (names.empty()) GTEST_SKIP() << "QEL_DIAG_CAPTURES names no captures";
  std::size_t facts = 0;
  for (const std::string& name : names) {
    std::vector<ToldMetric> told = test::readCapture(name);
    std::erase_if(told, [](const ToldMetric& one) { return !isCell(one); });
    auto one = told.begin();
    for (const json& fact : test::factsOf(name)) {
      if (fact["metric"] != metric::kGsmScellInfo) continue;
      ++facts;
      ASSERT_NE(one, told.end()) << name << " " << fact;
      EXPECT_EQ(one->number, fact["n"].get<std::size_t>()) << name;
      EXPECT_TRUE(holds(cellOf(*one), fact["key"])) << cellOf(*one) << " " << fact;
      ++one;
    }
    EXPECT_EQ(one, told.end()) << name << " tells more";
  }
  EXPECT_GT(facts, 0U);
}

// Numbers as another decoder has them of the same two cells.
TEST(GsmCaptures, AgreeWithAnotherDecoderOnWhatCellsBroadcast) {
  const std::string name = "umts_gsm_2015";
  if (std::ranges::count(test::captureNames(), name) == 0) {
    GTEST_SKIP() << "QEL_DIAG_CAPTURES has no " << name;
  }
  const auto told = test::readCapture(name);
  const auto payloadOf = [&](std::size_t number, std::uint32_t metric) {
    const auto one = std::ranges::find_if(told, [&](const ToldMetric& candidate) {
      return candidate.number == number && candidate.metric == metric;
    });
    return one == told.end() ? Bytes() : one->payload;
  };
  const auto first = KCellularGsmIdleConfig::initWithData(payloadOf(176, metric::kGsmIdleConfig));
  EXPECT_EQ(first->bsPaMfrms(), 4U);
  EXPECT_EQ(first->t3212(), 10U);
  EXPECT_EQ(first->attachAllowed(), 1U);
  EXPECT_EQ(first->dtxFromBs(), 1U);
  EXPECT_EQ(first->radioLinkTimeout(), 32U);
  EXPECT_EQ(first->msTxpwr(), 0U);
  EXPECT_EQ(first->rxAccMin(), 4U);
  EXPECT_EQ(first->halfRateSupported(), 1U);
  EXPECT_EQ(first->maxRetransCs(), 4U);
  EXPECT_EQ(first->cba(), 0U);
  EXPECT_EQ(first->reestAllowed(), 0U);
  EXPECT_EQ(first->acc(), 0U);
  EXPECT_EQ(first->c2Valid(), 1U);
  EXPECT_EQ(first->cbq(), 0U);
  EXPECT_EQ(first->tmpOffset(), 0U);
  EXPECT_EQ(first->penaltyT(), 20U);
  EXPECT_EQ(first->ecsc(), 1U);
  EXPECT_EQ(first->si2TerNeeded(), 0U);
  const auto later = KCellularGsmIdleConfig::initWithData(payloadOf(412, metric::kGsmIdleConfig));
  EXPECT_EQ(later->radioLinkTimeout(), 44U);
  EXPECT_EQ(later->t3212(), 9U);
  EXPECT_EQ(later->msTxpwr(), 5U);
  EXPECT_EQ(later->rxAccMin(), 1U);
  EXPECT_EQ(later->maxRetransCs(), 7U);
  EXPECT_EQ(later->cbchSupported(), 1U);
  EXPECT_EQ(later->si78Broadcast(), 0U);
  const auto packets = KCellularGsmGprsConfig::initWithData(payloadOf(181, metric::kGsmGprsConfig));
  EXPECT_TRUE(packets->gprsSup());
  EXPECT_EQ(packets->rac(), 1U);
  EXPECT_FALSE(packets->spPgCy());
  EXPECT_EQ(packets->accThr(), 6U);
  EXPECT_EQ(packets->nco(), 0U);
  EXPECT_EQ(packets->nom(), 2U);
  EXPECT_EQ(packets->crHyst(), 4U);
  EXPECT_TRUE(packets->extUplTbfSupported());
}

}  // namespace
}  // namespace qel::diagnostics
