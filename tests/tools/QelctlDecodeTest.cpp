#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "tools/Qelctl.h"

namespace qel::testing {
namespace {

const char* const kPayload = "08E807100320FA01";
const std::string kDecoded =
    "{\"timestamp\": 1000, \"state\": \"KLTE_RRC_STATE_CONNECTED\", \"prev_state_dur_ms\": 250}\n";

TEST(QelctlDecode, takesAMetricByAnyOfItsNames) {
  for (const char* metric :
       {"19972", "0x4E04", "0x4e04", "3952132", "0x3C4E04", "KCellularLteRrcState"}) {
    const Outcome outcome = qelctl({"decode", metric, kPayload});
    EXPECT_EQ(outcome.exitCode, 0) << metric;
    EXPECT_EQ(outcome.out, kDecoded) << metric;
    EXPECT_EQ(outcome.err, "");
  }
}

TEST(QelctlDecode, readsRawBytesFromStandardInput) {
  const Outcome outcome =
      qelctl({"decode", "19972"}, std::string("\x08\xE8\x07\x10\x03\x20\xFA\x01"));
  EXPECT_EQ(outcome.out, kDecoded);
}

TEST(QelctlDecode, takesNoBytesForAnEmptyMessage) {
  EXPECT_EQ(qelctl({"decode", "19972", ""}).out, "{}\n");
  EXPECT_EQ(qelctl({"decode", "19972"}).out, "{}\n");
  EXPECT_EQ(qelctl({"decode", "54030", ""}).out, "{\"multi_band_info\": []}\n");
}

TEST(QelctlDecode, reencodesInCanonicalForm) {
  // The state twice, over-long; the last one counts.
  const Outcome outcome = qelctl({"decode", "19972", "1081001083808000", "--reencode"});
  EXPECT_EQ(outcome.exitCode, 0);
  EXPECT_EQ(outcome.out, "1003\n");
}

TEST(QelctlDecode, showsValuesBeforeAnyDerivation) {
  KCellularLteScellInfo cell;
  cell.setTimestamp(5);
  cell.setDlBw(5);
  EXPECT_EQ(qelctl({"decode", "KCellularLteScellInfo", hexText(cell.data())}).out,
            "{\"timestamp\": 5, \"dl_bw\": 5}\n");
}

TEST(QelctlDecode, writesValidUtf8Only) {
  BearerContext bearer;
  bearer.setApn("a\xFFz");
  KCellularActivatedBearerContexts contexts;
  contexts.addBearerContexts(std::make_shared<BearerContext>(bearer));
  EXPECT_EQ(qelctl({"decode", "54541", hexText(contexts.data())}).out,
            "{\"bearer_contexts\": [{\"apn\": \"a\xEF\xBF\xBDz\"}]}\n");
}

TEST(QelctlDecode, answersABatchLineByLine) {
  const Outcome outcome = qelctl({"decode", "--batch"},
                                 "{\"metric\": 19972, \"payload\": \"08e8071003\"}\n"
                                 "{\"metric\": 19972, \"payload\": \"08\"}\n"
                                 "{\"metric\": 20005, \"payload\": \"\"}\n"
                                 "{\"metric\": -1, \"payload\": \"\"}\n"
                                 "{\"metric\": 3952132, \"payload\": \"\"}");
  EXPECT_EQ(outcome.exitCode, 0);
  EXPECT_EQ(
      linesOf(outcome.out),
      (std::vector<std::string>{"{\"timestamp\": 1000, \"state\": \"KLTE_RRC_STATE_CONNECTED\"}",
                                "null", "null", "null", "{}"}));
}

TEST(QelctlDecode, reencodesABatch) {
  EXPECT_EQ(qelctl({"decode", "--batch", "--reencode"},
                   "{\"metric\": 19972, \"payload\": \"1083808000\"}\n"
                   "{\"metric\": 19972, \"payload\": \"08\"}\n")
                .out,
            "\"1003\"\nnull\n");
}

TEST(QelctlDecode, namesTheBadLineOfABatchAndKeepsTheGoodOnes) {
  for (const char* bad :
       {"nonsense", "[]", "{\"metric\": 19972}", "{\"payload\": \"\"}",
        "{\"metric\": \"19972\", \"payload\": \"\"}", "{\"metric\": 1.5, \"payload\": \"\"}",
        "{\"metric\": 19972, \"payload\": \"0\"}"}) {
    const Outcome outcome = qelctl({"decode", "--batch"},
                                   "{\"metric\": 19972, \"payload\": \"\"}\n" + std::string(bad));
    EXPECT_EQ(outcome.exitCode, 65) << bad;
    EXPECT_EQ(outcome.out, "{}\n") << bad;
    EXPECT_TRUE(outcome.err.starts_with("qelctl: standard input, line 2: ")) << outcome.err;
    EXPECT_EQ(linesOf(outcome.err).size(), 1U);
  }
}

}  // namespace
}  // namespace qel::testing
