// UMTS's logs cut off anywhere and damaged anyhow.

#include <gtest/gtest.h>

#include <random>

#include "messages/catalogue/MetricMessages.h"
#include "support/diagnostics/UmtsMessages.h"
#include "support/diagnostics/UmtsPackets.h"

namespace qel::diagnostics {
namespace {

using test::UmtsModem;
using namespace test;  // NOLINT(google-build-using-namespace): of bodies

struct Whole {
  std::uint16_t code;
  Bytes body;
};

std::vector<Whole> wholePackets() {
  const std::vector<WrittenUmtsRank> cells = {{10638, 407, -78, -8}, {10638, 92, -82, -12}};
  return {{0x4127, umtsCell()},
          {0x4125, Bytes{3}},
          {0x4005, umtsRanks(0, cells, {{62, 21, -85}})},
          {0x4005, umtsRanks(1, cells, {{62, 21, -85}})},
          {0x4005, umtsRanks(2, cells, {{62, 21, -85}})},
          {0x412F, umtsRrc(0, umtsConnectionRequest(12))},
          {0x412F, umtsRrc(4, umtsWholeBlock(1, 3, umtsBlock3({.intraSearch = 8})))},
          {0x4176, umtsGainControl({{-100, -60, 174}, {-110, -70, 184}})}};
}

void expectReadable(const UmtsModem& modem, const std::vector<std::uint32_t>& told) {
  for (const std::uint32_t metric : told) {
    const auto payload = modem.reader().report(metric, 1);
    if (!payload) continue;
    EXPECT_TRUE(findMetricMessage(metric)->isReadable(*payload)) << metric;
  }
}

TEST(UmtsPackets, cutOffAnywhereTellNothing) {
  for (const Whole& whole : wholePackets()) {
    EXPECT_FALSE(UmtsModem().send(whole.code, whole.body).empty()) << whole.code;
    for (std::size_t length = 0; length < whole.body.size(); ++length) {
      // A buffer of just that size: a byte past the end is seen.
      const Bytes cut(whole.body.begin(), whole.body.begin() + static_cast<long>(length));
      UmtsModem modem;
      EXPECT_TRUE(modem.send(whole.code, cut).empty()) << whole.code << ' ' << length;
      EXPECT_EQ(modem.damaged(), 1U) << whole.code << ' ' << length;
    }
  }
}

TEST(UmtsPackets, withMoreBehindThemTellNothing) {
  for (const Whole& whole : wholePackets()) {
    if (whole.code == 0x4125) continue;  // one number, whatever stands behind
    Bytes longer = whole.body;
    longer.push_back(0);
    EXPECT_TRUE(UmtsModem().send(whole.code, longer).empty()) << whole.code;
  }
}

TEST(UmtsPackets, damagedAnyhowMakeOnlyReportsThatCanBeRead) {
  std::mt19937 random(25331);
  UmtsModem modem;
  for (int round = 0; round < 3000; ++round) {
    for (const Whole& whole : wholePackets()) {
      Bytes body = whole.body;
      for (unsigned i = 0; i <= random() % 4; ++i)
        body[random() % body.size()] ^= static_cast<std::uint8_t>(1U << random() % 8);
      expectReadable(modem, modem.send(whole.code, body));
    }
    modem.wait(random() % 5000);
  }
  EXPECT_GT(modem.understood(), 0U);
  EXPECT_GT(modem.damaged(), 0U);
}

}  // namespace
}  // namespace qel::diagnostics
