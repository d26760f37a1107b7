// What qelctl export writes is what qelctl replay prints, value by value.

#include <algorithm>
#include <functional>
#include <nlohmann/json.hpp>
#include <set>

#include "base/Rendering.h"
#include "messages/MessageClasses.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "metrics/DispatchTable.h"
#include "support/FilledMessage.h"
#include "tools/Exported.h"
#include "tools/Qelctl.h"

namespace qel::testing {
namespace {

using Json = nlohmann::ordered_json;

// What the tables show instead of what travels, written down a second time: by list (none: the
// report itself) and field.
using Rewriting = std::function<std::optional<Json>(std::int64_t value)>;
using Place = std::pair<std::string, std::string>;

Rewriting plus(std::int64_t offset) {
  return [offset](std::int64_t value) { return Json(value + offset); };
}
Rewriting halves(float offset) {
  return [offset](std::int64_t value) { return Json(static_cast<float>(value) / 2 + offset); };
}
std::optional<Json> megahertz(std::int64_t code) {
  constexpr float kWidths[] = {1.4F, 3, 5, 10, 15, 20};
  if (code < 0 || code > 5) return std::nullopt;
  return Json(kWidths[code]);
}
std::optional<Json> wholeHundreds(std::int64_t value) { return Json(value / 100); }
std::optional<Json> hundredths(std::int64_t value) { return Json(static_cast<float>(value) / 100); }

const std::map<Place, Rewriting> kRewritings = {
    {{"", "dl_bw"}, megahertz},
    {{"nbr_eutra", "dl_bw"}, megahertz},
    {{"inst_values", "sinr0"}, halves(0)},
    {{"inst_values", "sinr1"}, halves(0)},
    {{"meas_nbr_eutra", "nbr_rsrp"}, plus(-140)},
    {{"meas_nbr_eutra", "nbr_rsrq"}, halves(-19.5F)},
    {{"meas_nbr_utra", "rscp"}, plus(-116)},
    {{"meas_nbr_utra", "ecno"}, halves(-24.5F)},
    {{"meas_nbr_geran", "rxlev"}, plus(-110)},
    {{"scc_list", "rsrp"}, wholeHundreds},
    {{"scc_list", "rssi"}, wholeHundreds},
    {{"scc_list", "rsrq"}, hundredths},
    {{"scc_list", "dl_bandwidth"}, megahertz},
    {{"meas_utra_result", "rscp"}, plus(-116)},
    {{"meas_utra_result", "ecno"}, halves(-24.5F)},
    {{"meas_gsm_result", "rxlev"}, plus(-110)},
    {{"meas_lte_result", "rsrp"}, plus(-140)},
    {{"meas_lte_result", "rsrq"}, halves(-19.5F)},
    {{"gsm_ncell_meas", "rxlev"}, plus(-110)},
    {{"umts_ncell_meas", "cpich_rscp"}, plus(-116)},
    {{"lte_ncell_meas", "rsrp"}, plus(-140)},
    {{"lte_ncell_meas", "rsrq"}, halves(-19.5F)},
};

std::string cell(const Json& value) {
  if (value.is_boolean()) return value.get<bool>() ? "1" : "0";
  if (value.is_string()) return value.get<std::string>();
  if (value.is_number_float()) return jsonText(Value(value.get<float>()));
  if (!value.is_array()) return value.dump();
  std::string text = "[";
  for (const Json& element : value) text += (text.size() > 1 ? ", " : "") + element.dump();
  return text + "]";
}

// One record of a line of the dispatcher as rows of the table.
class ExpectedRows {
 public:
  ExpectedRows(const Json& record, const std::vector<std::string>& header)
      : _header(header.begin(), header.end()) {
    add(_own, "", "", record);
    for (const auto& [key, value] : record.items()) {
      if (isEntries(value)) addEntries(key, value);
    }
    if (rows.empty()) rows.push_back(_own);
  }
  std::vector<ExportedRow> rows;

 private:
  static bool isEntries(const Json& value) {
    return value.is_array() && !value.empty() && value[0].is_object();
  }
  void addEntries(const std::string& list, const Json& entries) {
    for (std::size_t i = 0; i < entries.size(); ++i) {
      ExportedRow row = _own;
      row["list"] = list;
      row["entry"] = std::to_string(i);
      add(row, list, "", entries[i]);
      rows.push_back(row);
    }
  }
  void add(ExportedRow& row, const std::string& list, const std::string& prefix,
           const Json& record) {
    for (const auto& [key, value] : record.items()) {
      if (isEntries(value) && prefix.empty()) continue;
      if (value.is_object()) {
        add(row, list, key + "_", value);
        continue;
      }
      std::optional<Json> shown = value;
      const auto rewriting = kRewritings.find({list, key});
      if (rewriting != kRewritings.end() && prefix.empty() && value.is_number()) {
        shown = rewriting->second(value.get<std::int64_t>());
      }
      const bool isApart = _header.contains(list + "_" + prefix + key);
      if (shown) row[isApart ? list + "_" + prefix + key : prefix + key] = cell(*shown);
    }
  }

  const std::set<std::string> _header;
  ExportedRow _own;
};

// Times apart: local ones there, UTC and milliseconds here. The test's zone is UTC.
bool isSame(const std::string& exported, const std::string& expected) {
  if (exported == expected) return true;
  return exported.size() == 24 && expected.size() == 23 &&
         exported.substr(0, 10) == expected.substr(0, 10) &&
         exported.substr(11, 8) == expected.substr(11, 8);
}

void expectSame(const ExportedRow& exported, const ExportedRow& expected, const std::string& what) {
  ExportedRow rest = exported;
  rest.erase("time_utc");
  for (const auto& [column, value] : expected) {
    const auto found = rest.find(column);
    ASSERT_NE(found, rest.end()) << what << "." << column << " is missing";
    EXPECT_TRUE(isSame(found->second, value))
        << what << "." << column << ": " << found->second << " for " << value;
    rest.erase(found);
  }
  EXPECT_TRUE(rest.empty()) << what << " has " << (rest.empty() ? "" : rest.begin()->first)
                            << ", of which the dispatcher says nothing";
}

// As CSV has it, where a text that looks like a formula begins with a "'".
std::vector<ExportedRow> withoutFormulas(const std::vector<ExportedRow>& rows,
                                         const std::set<std::string>& texts) {
  std::vector<ExportedRow> result = rows;
  for (ExportedRow& row : result) {
    for (auto& [column, text] : row) {
      if (!texts.contains(column) || text.empty()) continue;
      if (std::string_view("=+-@\t\r").find(text[0]) != std::string_view::npos) text.insert(0, "'");
    }
  }
  return result;
}

// Every record that `qelctl replay` prints, in its order.
std::vector<std::pair<std::string, Json>> replayed(const std::string& recording) {
  std::vector<std::pair<std::string, Json>> records;
  const std::string kHead = "Metric ID in Hex = ";
  const DispatchRow* row = nullptr;
  for (const std::string& line : linesOf(qelctl({"replay", recording}).out)) {
    if (line.starts_with(kHead)) {
      row = findDispatchRow(std::stoll(line.substr(kHead.size()), nullptr, 16));
    } else if (row && line.starts_with(row->logText)) {
      const auto identifier = static_cast<std::uint32_t>(row->identifier - kMetricEventBase);
      records.emplace_back(findMetricMessage(identifier)->className,
                           Json::parse(line.substr(row->logText.size())));
    }
  }
  return records;
}

// Whether both formats hold what the dispatcher says, value by value. How many values.
std::size_t expectAgreement(const std::string& recording, const Folder& folder) {
  const auto csv = qelctl(
      {"export", recording, "--format", "csv", "--out", folder / "csv", "--keep-identities"});
  EXPECT_EQ(csv.exitCode, 0) << csv.err;
  const auto sqlite = qelctl(
      {"export", recording, "--format", "sqlite", "--out", folder / "db", "--keep-identities"});
  EXPECT_EQ(sqlite.exitCode, 0) << sqlite.err;
  const ExportedTables files = readCsv(folder / "csv");
  const ExportedTables tables = readSqlite(folder / "db");
  EXPECT_EQ(files.size(), tables.size());
  for (const auto& [name, table] : tables) {
    EXPECT_EQ(files.at(name).header, table.header) << name;
    EXPECT_EQ(files.at(name).units, table.units) << name;
    EXPECT_EQ(files.at(name).rows, withoutFormulas(table.rows, table.texts)) << name;
  }
  std::map<std::string, std::size_t> positions;
  std::size_t values = 0;
  for (const auto& [name, record] : replayed(recording)) {
    const ExportedTable& table = tables.at(name);
    for (const ExportedRow& expected : ExpectedRows(record, table.header).rows) {
      std::size_t& position = positions[name];
      if (position >= table.rows.size()) {
        ADD_FAILURE() << name << " has too few rows";
        return values;
      }
      expectSame(table.rows[position], expected, name + " " + std::to_string(position));
      ++position;
      values += expected.size();
    }
  }
  for (const auto& [name, position] : positions) {
    EXPECT_EQ(position, tables.at(name).rows.size()) << name;
  }
  return values;
}

TEST(QelctlExport, agreesWithReplayOnADriveValueByValue) {
  const Folder folder;
  EXPECT_GT(expectAgreement(QEL_SIMULATED_DRIVE, folder), 50000U);
}

TEST(QelctlExport, agreesWithReplayOnEveryHandledClass) {
  std::string lines;
  std::size_t handled = 0;
  AllMessages::forEach([&]<class Message>() {
    const auto all = metricMessages();
    const auto metric = std::ranges::find(all, Message::kClassName, &MetricMessage::className);
    if (metric == all.end()) return;
    const auto identifier = std::int64_t{metric->identifier} + kMetricEventBase;
    if (findDispatchRow(identifier)) ++handled;
    lines += metricLine(identifier, Bytes{});
    for (unsigned seed = 0; seed < 9; ++seed) {
      lines += metricLine(identifier, *filledMessage<Message>(seed));
    }
  });
  EXPECT_EQ(handled, 29U);
  const TemporaryRecording recording(lines);
  const Folder folder;
  EXPECT_GT(expectAgreement(recording.path(), folder), 2000U);
}

}  // namespace
}  // namespace qel::testing
