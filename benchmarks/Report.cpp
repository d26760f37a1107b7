#include "Report.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>
#include <ostream>

namespace qel::bench {
namespace {

std::string numbers(double nanoseconds, double ratio, double allocations) {
  std::array<char, 64> text;
  std::snprintf(text.data(), text.size(), " %.0f | %.2f | %.2f |", nanoseconds, ratio, allocations);
  return text.data();
}

}  // namespace

Report::Report(const std::vector<std::string>& names) {
  for (const std::string& name : names) {
    const auto who = name.find('|');
    const auto mix = name.rfind('|');
    _cells.push_back({.name = name,
                      .work = name.substr(0, who),
                      .who = name.substr(who + 1, mix - who - 1),
                      .mix = name.substr(mix + 1)});
  }
}

void Report::ReportRuns(const std::vector<Run>& runs) {
  for (const Run& run : runs) {
    if (run.run_type != Run::RT_Iteration || run.error_occurred) continue;
    const double payloads = run.counters.at("payloads") * static_cast<double>(run.iterations);
    const double nanoseconds = run.cpu_accumulated_time * 1e9 / payloads;
    const auto cell = std::ranges::find(_cells, run.run_name.function_name, &Cell::name);
    if (cell == _cells.end()) continue;
    cell->nanoseconds = std::min(cell->nanoseconds, nanoseconds);
    cell->allocations = run.counters.at("allocations");
  }
}

void Report::Finalize() {
  std::vector<std::string> columns;
  for (auto next = _cells.begin(); next != _cells.end();) {
    const auto end =
        std::find_if(next, _cells.end(), [&](const Cell& cell) { return cell.work != next->work; });
    Cells cells;
    for (; next != end; ++next) {
      if (std::isfinite(next->nanoseconds)) cells.push_back(&*next);
    }
    if (!cells.empty()) printWork(cells, columns);
  }
}

void Report::printWork(const Cells& cells, std::vector<std::string>& columns) {
  std::ostream& out = GetOutputStream();
  std::vector<std::string> mixes;
  for (const Cell* cell : cells) {
    if (cell->who == cells.front()->who) mixes.push_back(cell->mix);
  }
  const auto isColumn = [&columns](const std::string& mix) {
    return std::ranges::find(columns, mix) != columns.end();
  };
  if (!std::ranges::all_of(mixes, isColumn)) {
    columns = mixes;
    out << "\n| work | who |";
    for (const std::string& mix : columns) out << ' ' << mix << ": ns | ratio | allocations |";
    out << "\n|---|---|";
    for (std::size_t i = 0; i < columns.size(); ++i) out << "--:|--:|--:|";
    out << '\n';
  }
  for (auto row = cells.begin(); row != cells.end();) {
    const std::string& who = (*row)->who;
    out << "| " << (*row)->work << " | " << who << " |";
    for (const std::string& mix : columns) {
      const auto find = [&](auto from) {
        return std::find_if(from, cells.end(), [&](const Cell* cell) { return cell->mix == mix; });
      };
      const auto first = find(cells.begin());
      const auto here = find(row);
      out << (here == cells.end() || (*here)->who != who
                  ? " | | |"
                  : numbers((*here)->nanoseconds, (*here)->nanoseconds / (*first)->nanoseconds,
                            (*here)->allocations));
    }
    out << '\n';
    row = std::find_if(row, cells.end(), [&](const Cell* cell) { return cell->who != who; });
  }
}

}  // namespace qel::bench
