// Every row of every table after a whole drive, with the numbers of the tables.
#include <gtest/gtest.h>

#include "recording/RecordingReader.h"
#include "ui/pages/FieldSheet.h"
#include "ui/pages/Scene.h"
#include "ui/screens/CategoryTable.h"
#include "ui/screens/QelViewItems.h"

namespace qel {
namespace {

class FieldSheetsOfADrive : public ::testing::Test {
 protected:
  FieldSheetsOfADrive() {
    RecordingFault fault;
    const auto reader = RecordingReader::open(QEL_TEST_DATA_DIR "/simulated_drive.jsonl.gz",
                                              RecordingReader::BadLines::fail, fault);
    while (auto event = reader->next()) {
      scene.clock.timeMs = event->timeMs;
      if (event->kind == RecordedKind::metric) scene.validator->metricsDidUpdate(event->entries);
    }
  }

  // Those of a category, in the order of its sections and rows.
  std::vector<FieldSheet> sheetsOf(const std::string& technology, const std::string& category) {
    std::vector<FieldSheet> sheets;
    const Category* known = findCategory(technology + ' ' + category, Routine::cells);
    const int sections = known && known->list
                             ? static_cast<int>(known->list(*scene.validator.validator)->size())
                             : 1;
    for (int section = 0; section < sections; ++section) {
      for (int row = 0;; ++row) {
        auto sheet = fieldSheet(scene.viewpoint(), technology, category, section, row);
        if (!sheet) break;
        sheets.push_back(std::move(*sheet));
      }
    }
    return sheets;
  }

  testing::Scene scene;
};

TEST_F(FieldSheetsOfADrive, areThereForEveryRowAndWhole) {
  const QelViewItems items;
  std::size_t count = 0;
  for (const std::string& technology : items.launchViewItemNames) {
    for (const std::string& category : items.firstLevelViewItems.at(technology)) {
      for (const FieldSheet& sheet : sheetsOf(technology, category)) {
        ++count;
        const std::string what = sheet.place + ", " + sheet.key;
        for (const char* id : {"meaning", "raw", "age", "source"}) {
          EXPECT_TRUE(std::ranges::count(sheet.lines, id, &SheetLine::id)) << what << ": " << id;
        }
        for (const SheetLine& line : sheet.lines) {
          EXPECT_FALSE(line.label.empty() || line.value.empty()) << what << ": " << line.id;
        }
        EXPECT_NE(sheet.clipboard.find(sheet.value), std::string::npos) << what;
      }
    }
  }
  EXPECT_GT(count, 300U);
}

// What the table shows of a number is the end of its curve.
TEST_F(FieldSheetsOfADrive, haveCurvesThatEndAtTheValueShown) {
  const QelViewItems items;
  std::size_t count = 0;
  for (const std::string& technology : items.launchViewItemNames) {
    for (const std::string& category : items.firstLevelViewItems.at(technology)) {
      for (const FieldSheet& sheet : sheetsOf(technology, category)) {
        if (sheet.curve.empty()) continue;
        ++count;
        const Point& last = sheet.curve.back().back();
        EXPECT_EQ(last.value, std::strtof(sheet.value.c_str(), nullptr))
            << sheet.place << ", " << sheet.key;
        EXPECT_LE(sheet.lowest, last.value);
        EXPECT_GE(sheet.highest, last.value);
      }
    }
  }
  EXPECT_GT(count, 60U);
}

}  // namespace
}  // namespace qel
