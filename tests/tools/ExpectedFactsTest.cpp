// What is known to be in raw logs of real modems is in the recordings made of them, and no more.

#include <cstdlib>
#include <filesystem>
#include <iostream>
#include <vector>

#include "recording/TemporaryFile.h"
#include "tools/Qelctl.h"
#include "tools/facts/FactsJudge.h"

namespace qel::testing {
namespace {

// The raw logs of a folder that have their facts beside them.
std::vector<std::filesystem::path> logsIn(const std::string& folder) {
  std::vector<std::filesystem::path> logs;
  for (const auto& entry : std::filesystem::directory_iterator(folder)) {
    if (entry.path().extension() != ".qmdl") continue;
    auto facts = entry.path();
    facts.replace_extension(".facts.jsonl");
    if (std::filesystem::exists(facts)) logs.push_back(entry.path());
  }
  std::ranges::sort(logs);
  return logs;
}

void expectFacts(const std::filesystem::path& log) {
  const TemporaryFile recording;
  const Outcome outcome = qelctl({"import", log.string(), recording.path(), "--force"});
  ASSERT_EQ(outcome.exitCode, 0) << outcome.err;
  auto facts = log;
  facts.replace_extension(".facts.jsonl");
  const Verdict verdict = judge(facts.string(), log.string(), recording.path());
  std::cout << log.filename().string() << "\n" << verdict.table();
  for (const std::string& complaint : verdict.complaints) {
    ADD_FAILURE() << log.filename().string() << ": " << complaint;
  }
}

TEST(ExpectedFacts, areAllInTheRecordingsOfOurLogsAndNoOthers) {
  const auto logs = logsIn(QEL_RAW_LOGS);
  ASSERT_GE(logs.size(), 3U);
  for (const auto& log : logs) expectFacts(log);
}

// More logs of the same form: a folder of *.qmdl with *.facts.jsonl beside them.
TEST(ExpectedFacts, areAllInTheRecordingsOfFurtherLogsAndNoOthers) {
  const char* folder = std::getenv("QEL_DIAG_CAPTURES");
  if (!folder) GTEST_SKIP() << "QEL_DIAG_CAPTURES names no folder";
  const auto logs = logsIn(folder);
  ASSERT_FALSE(logs.empty());
  for (const auto& log : logs) expectFacts(log);
}

}  // namespace
}  // namespace qel::testing
