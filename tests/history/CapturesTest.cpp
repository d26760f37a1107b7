// Happenings of whole recordings: of the simulated drive, and of real phones from the folder that
// QEL_CAPTURES names.
#include <gtest/gtest.h>

#include <cstdlib>
#include <map>
#include <set>
#include <tuple>

#include "history/Followed.h"
#include "recording/RecordingReader.h"

namespace qel {
namespace {

using testing::Followed;
using V = MetricValidator;
using Kind = HappeningKind;

// What a serving-cell report names, taken from the codec's dictionary alone.
using Named = std::tuple<std::int64_t, Value, Value, Value>;

struct Keys {
  std::string_view channel;
  std::string_view code;
};
const std::map<std::int64_t, Keys> kCellMetrics = {
    {V::K_LTE_SCELL_INFO, {"dl_freq", "phy_cell_id"}},
    {V::K_UMTS_SCELL_INFO, {"dl_uarfcn", "psc"}},
    {V::K_GSM_SCELL_INFO, {"arfcn", "bsic"}},
};

Value orNull(const Value* value) { return value ? *value : Value(); }

// The times of the reports that name another cell than the one before.
class ChangeCounter {
 public:
  void look(const RecordedEvent& event) {
    const Value* metric = event.entries.find("kKeyMetricID");
    const auto keys = kCellMetrics.find(metric ? metric->asInt64().value_or(0) : 0);
    if (keys == kCellMetrics.end()) return;
    const Bytes* payload = event.entries.find("kKeyPayload")->asBytes();
    const auto record = findDispatchRow(keys->first)->describe(*payload);
    const Named named(keys->first, orNull(record->find(keys->second.channel)),
                      orNull(record->find(keys->second.code)), orNull(record->find("cell_id")));
    if (!(_last == named)) times.push_back(event.timeMs);
    _last = named;
  }

  std::vector<std::uint64_t> times;

 private:
  std::optional<Named> _last;
};

void expectCells(const std::string& path, std::size_t expected) {
  RecordingFault fault;
  const auto reader = RecordingReader::open(path, RecordingReader::BadLines::fail, fault);
  ASSERT_TRUE(reader) << fault.message;
  Followed followed;
  ChangeCounter counter;
  while (const auto event = reader->next()) {
    counter.look(*event);
    if (event->kind != RecordedKind::metric) continue;
    followed.clock.timeMs = event->timeMs;
    followed.validator->metricsDidUpdate(event->entries);
  }
  const auto cells = followed.happenings(Kind::cell);
  std::vector<std::uint64_t> times;
  for (const Happening& cell : cells) times.push_back(cell.timeMs);
  EXPECT_EQ(times, counter.times);
  EXPECT_EQ(cells.size(), expected);
  ASSERT_FALSE(cells.empty());
  EXPECT_FALSE(cells[0].from);
  for (std::size_t i = 1; i < cells.size(); ++i) {
    EXPECT_TRUE(cells[i].from->isSameAs(*cells[i - 1].to));
  }
}

TEST(SimulatedDrive, hasOneHappeningForEachChangeOfTheCell) {
  expectCells(QEL_SIMULATED_DRIVE, 28);
}

class Captures : public ::testing::Test {
 protected:
  void SetUp() override {
    const char* folder = std::getenv("QEL_CAPTURES");
    if (!folder) GTEST_SKIP() << "QEL_CAPTURES names no folder";
    _folder = folder;
  }
  std::string _folder;
};

TEST_F(Captures, ofLteAndGsmHave39Cells) { expectCells(_folder + "/lte_gsm_cmcc_2015.jsonl", 39); }
TEST_F(Captures, ofThreeTechnologiesHave16Cells) {
  expectCells(_folder + "/umts_gsm_lte_2018.jsonl", 16);
}
TEST_F(Captures, ofLteHaveOneCell) { expectCells(_folder + "/lte_att_2016.jsonl", 1); }

}  // namespace
}  // namespace qel
