#include "fleet/collect/FleetSchema.h"

#include <gtest/gtest.h>

#include <set>

namespace qel::fleet {
namespace {

TEST(FleetSchema, hasATableOfEachMessageClass) {
  EXPECT_EQ(fleetTables().size(), metricMessages().size());
  EXPECT_EQ(findFleetTable(19972)->name(), "lte_rrc_state");
  EXPECT_EQ(findFleetTable(20330)->name(), "lte_rsrp_rsrq_sinr");
  EXPECT_EQ(findFleetTable("KCellularRsrpRsrqSinr"), findFleetTable(20330));
  EXPECT_EQ(findFleetTable("kCellularSimCardFiles")->name(), "sim_card_files");
  EXPECT_EQ(findFleetTable(20005), nullptr);
  EXPECT_EQ(findFleetTable("status"), nullptr);
}

TEST(FleetSchema, hasNamesThatStayApart) {
  constexpr std::size_t kLongestName = 63 - std::string_view("_20261122").size();
  std::set<std::string> tables;
  for (const SchemaTable& table : schemaTables()) {
    EXPECT_TRUE(tables.insert(table.name).second) << table.name;
    EXPECT_LE(table.name.size(), kLongestName) << table.name;
    std::set<std::string> columns;
    for (const SchemaColumn& column : table.columns) {
      EXPECT_TRUE(columns.insert(column.name).second) << table.name << "." << column.name;
      EXPECT_EQ(column.name.find_first_not_of("abcdefghijklmnopqrstuvwxyz0123456789_"),
                std::string::npos)
          << table.name << "." << column.name;
    }
  }
}

TEST(FleetSchema, hasTheTypesAndUnitsOfTheTables) {
  const auto columnOf = [](std::uint32_t metric, std::string_view name) {
    for (const FleetColumn& column : findFleetTable(metric)->columns()) {
      if (column.name == name) return std::string(column.sqlType) + ", " + column.unit;
    }
    return std::string("none");
  };
  EXPECT_EQ(columnOf(54031, "nbr_rsrp"), "bigint, dBm");
  EXPECT_EQ(columnOf(54031, "nbr_rsrq"), "double precision, dB");
  EXPECT_EQ(columnOf(54031, "timestamp"), "timestamp with time zone, ");
  EXPECT_EQ(columnOf(54030, "qrxlevmin"), "bigint, ");
  EXPECT_EQ(columnOf(19, "content"), "bytea, ");
  EXPECT_EQ(columnOf(19972, "state"), "text, ");
}

TEST(FleetSchema, quotesWhatItSays) { EXPECT_EQ(quotedText("the cell's"), "'the cell''s'"); }

}  // namespace
}  // namespace qel::fleet
