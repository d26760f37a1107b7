#include "fleet/OpenMetrics.h"

#include <gtest/gtest.h>

#include "fleet/Families.h"

namespace qel::fleet {
namespace {

using prometheus::MetricFamily;
using prometheus::MetricType;

TEST(OpenMetrics, namesTypeUnitAndHelpOfAFamily) {
  MetricFamily family{"qelwatch_lte_rsrp_dbm", "RSRP", MetricType::Gauge, {}};
  family.metric.push_back(oneNumber(MetricType::Gauge, -90));
  family.metric.back().label = {{"pci", "217"}, {"earfcn", "1300"}};
  family.metric.push_back(oneNumber(MetricType::Gauge, -9.5));
  EXPECT_EQ(numberText({family}, NumberText::openMetrics),
            "# TYPE qelwatch_lte_rsrp_dbm gauge\n"
            "# UNIT qelwatch_lte_rsrp_dbm dbm\n"
            "# HELP qelwatch_lte_rsrp_dbm RSRP\n"
            "qelwatch_lte_rsrp_dbm{pci=\"217\",earfcn=\"1300\"} -90\n"
            "qelwatch_lte_rsrp_dbm -9.5\n"
            "# EOF\n");
}

TEST(OpenMetrics, callsACounterByItsNameAndItsSamplesTotal) {
  EXPECT_EQ(numberText({oneFamily("qelwatch_reports_total", "Reports", MetricType::Counter, 1e6)},
                       NumberText::openMetrics),
            "# TYPE qelwatch_reports counter\n"
            "# HELP qelwatch_reports Reports\n"
            "qelwatch_reports_total 1e+06\n"
            "# EOF\n");
}

TEST(OpenMetrics, callsAnInfoByItsName) {
  EXPECT_EQ(numberText({oneFamily("qelwatch_cell_info", "Cell", MetricType::Gauge, 1)},
                       NumberText::openMetrics),
            "# TYPE qelwatch_cell info\n"
            "# HELP qelwatch_cell Cell\n"
            "qelwatch_cell_info 1\n"
            "# EOF\n");
}

TEST(OpenMetrics, escapesTexts) {
  MetricFamily family = oneFamily("a", "one \"two\"\nthree \\", MetricType::Gauge, 1);
  family.metric[0].label = {{"b", "\"\n\\"}};
  EXPECT_EQ(numberText({family}, NumberText::openMetrics),
            "# TYPE a gauge\n"
            "# HELP a one \\\"two\\\"\\nthree \\\\\n"
            "a{b=\"\\\"\\n\\\\\"} 1\n"
            "# EOF\n");
}

TEST(OpenMetrics, endsAlsoWithoutFamilies) {
  EXPECT_EQ(numberText({}, NumberText::openMetrics), "# EOF\n");
  EXPECT_EQ(numberText({}, NumberText::plain), "");
}

TEST(OpenMetrics, hasAnOlderForm) {
  EXPECT_EQ(numberText({oneFamily("qelwatch_reports_total", "Reports", MetricType::Counter, 2)},
                       NumberText::plain),
            "# HELP qelwatch_reports_total Reports\n"
            "# TYPE qelwatch_reports_total counter\n"
            "qelwatch_reports_total 2\n");
}

TEST(OpenMetrics, isWhatWhoAsksForNothingElseGets) {
  for (const char* accept :
       {"", "*/*", "application/openmetrics-text", "application/openmetrics-text; version=1.0.0",
        "application/openmetrics-text;version=1.0.0,application/openmetrics-text;version=0.0.1;"
        "q=0.75,text/plain;version=0.0.4;q=0.5,*/*;q=0.1",
        "text/plain;q=0.2, application/*", ";;,,=;q=x"}) {
    EXPECT_EQ(acceptedText(accept), NumberText::openMetrics) << accept;
  }
  for (const char* accept : {"text/plain", "text/plain;version=0.0.4", "text/plain, */*;q=0.1",
                             "application/openmetrics-text;version=2.0.0, text/plain;q=0.1",
                             "application/openmetrics-text;q=0, text/plain;q=0.5"}) {
    EXPECT_EQ(acceptedText(accept), NumberText::plain) << accept;
  }
}

}  // namespace
}  // namespace qel::fleet
