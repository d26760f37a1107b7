#include "harness/Report.h"

#include <cstdio>

namespace qel::trials {
namespace {

std::string seconds(const std::optional<milliseconds>& time) {
  if (!time) return "";
  char text[32];
  std::snprintf(text, sizeof text, "%.1f s", static_cast<double>(time->count()) / 1000);
  return text;
}

std::string millisecondsOf(const std::optional<milliseconds>& time) {
  return time ? std::to_string(time->count()) + " ms" : "";
}

std::string waitOf(const Figures& seen) {
  std::string text = millisecondsOf(seen.wait);
  if (seen.busWait) text += " (the bus alone " + millisecondsOf(seen.busWait) + ")";
  return text;
}

std::string mebibytes(std::uint64_t kb) {
  if (kb == 0) return "";
  char text[32];
  std::snprintf(text, sizeof text, "%.1f MiB", static_cast<double>(kb) / 1024);
  return text;
}

std::string outcomeOf(const Result& result) {
  if (!result.notTried.empty()) return "not tried: " + result.notTried;
  return result.broken.empty() ? "kept" : "BROKEN: " + result.broken;
}

std::string remarksOf(const Result& result) {
  std::string text;
  for (const std::string& remark : result.figures.remarks) text += ", " + remark;
  return text;
}

}  // namespace

std::string lineOf(const Result& result) {
  const Figures& seen = result.figures;
  std::string text = std::string(result.scenario->name) + ": " + std::to_string(seen.tried);
  if (seen.back) text += ", values back in " + seconds(seen.back) + " at most";
  if (seen.wait) text += ", others waited " + waitOf(seen) + " at most";
  if (seen.memoryKb > 0) text += ", service had " + mebibytes(seen.memoryKb) + " at most";
  return text + remarksOf(result) + ": " + outcomeOf(result);
}

std::string tableOf(const std::vector<Result>& results) {
  std::string text =
      "| fault | times | values back, at most | others' longest wait | service's memory, at most "
      "| promises |\n|---|---|---|---|---|---|\n";
  for (const Result& result : results) {
    const Figures& seen = result.figures;
    text += std::string("| ") + result.scenario->what + " | " + std::to_string(seen.tried) + " | " +
            seconds(seen.back) + " | " + waitOf(seen) + " | " + mebibytes(seen.memoryKb) + " | " +
            outcomeOf(result) + remarksOf(result) + " |\n";
  }
  return text;
}

}  // namespace qel::trials
