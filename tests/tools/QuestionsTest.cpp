// docs/questions.md: its answers are what its questions give.

#include <algorithm>

#include "tools/Exported.h"
#include "tools/Qelctl.h"

namespace qel::testing {
namespace {

struct Question {
  std::string sql;
  std::string answer;
};

// Each block of SQL, and the block behind it.
std::vector<Question> questions() {
  std::ifstream document(QEL_QUESTIONS);
  std::vector<Question> questions;
  std::string* block = nullptr;
  for (std::string line; std::getline(document, line);) {
    if (line == "```sql") {
      block = &questions.emplace_back().sql;
    } else if (line == "```" && block) {
      block = nullptr;
    } else if (line == "```") {
      block = &questions.back().answer;
    } else if (block) {
      *block += line + "\n";
    }
  }
  return questions;
}

TEST(Questions, haveTheAnswersThatTheDocumentGives) {
  const Folder folder;
  ASSERT_EQ(qelctl({"export", QEL_SIMULATED_DRIVE, "--format", "sqlite", "--out", folder / "db"})
                .exitCode,
            0);
  ASSERT_EQ(questions().size(), 3U);
  for (const Question& question : questions()) {
    const Outcome outcome = run("/usr/bin/env", {"sqlite3", "-box", folder / "db", question.sql});
    EXPECT_EQ(outcome.err, "");
    EXPECT_EQ(outcome.out, question.answer) << question.sql;
  }
}

TEST(Questions, haveTheAnswersOfTheSpreadsheet) {
  const Folder folder;
  ASSERT_EQ(
      qelctl({"export", QEL_SIMULATED_DRIVE, "--format", "csv", "--out", folder / "out"}).exitCode,
      0);
  const auto tables = readCsv(folder / "out");
  const ExportedTable& table = tables.at("KCellularLteNbrEutraCellMeas");
  EXPECT_EQ(table.header.at('F' - 'A'), "nbr_phys_cell_id");
  EXPECT_EQ(table.header.at('H' - 'A'), "nbr_rsrp");
  double sum = 0;
  int count = 0;
  int most = -1000;
  for (const ExportedRow& row : table.rows) {
    if (!row.contains("nbr_phys_cell_id") || row.at("nbr_phys_cell_id") != "124") continue;
    const int level = std::stoi(row.at("nbr_rsrp"));
    sum += level;
    most = std::max(most, level);
    ++count;
  }
  std::ifstream stream(QEL_QUESTIONS);
  const std::string document{std::istreambuf_iterator<char>(stream), {}};
  char mean[32];
  std::snprintf(mean, sizeof mean, "| %.1f dBm |", sum / count);
  EXPECT_NE(document.find("| " + std::to_string(count) + " reports |"), std::string::npos) << count;
  EXPECT_NE(document.find(mean), std::string::npos) << mean;
  EXPECT_NE(document.find("| " + std::to_string(most) + " dBm |"), std::string::npos) << most;
}

}  // namespace
}  // namespace qel::testing
