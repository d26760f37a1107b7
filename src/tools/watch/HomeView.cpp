#include "tools/watch/HomeView.h"

#include <algorithm>
#include <array>

#include "tools/watch/Blocks.h"
#include "tools/watch/HappeningsView.h"
#include "tools/watch/RecordingsView.h"
#include "tools/watch/Rows.h"
#include "tools/watch/SignalsView.h"
#include "ui/pages/Freshness.h"
#include "ui/pages/NowPage.h"
#include "ui/pages/Words.h"

namespace qel::watch {
namespace {

constexpr std::size_t kIdentityColumns = 44;

struct OtherPage {
  char letter;
  const char* name;
};
constexpr std::array kOtherPages = {OtherPage{'s', "Signals"}, OtherPage{'h', "Happenings"},
                                    OtherPage{'r', "Recordings"}};
constexpr const char* kMenu = "menu ";

}  // namespace

std::unique_ptr<View> viewOfLetter(char letter, Desk& desk) {
  switch (letter) {
    case 's':
      return std::make_unique<SignalsView>(desk);
    case 'h':
      return std::make_unique<HappeningsView>(desk);
    case 'r':
      return std::make_unique<RecordingsView>(desk);
    default:
      return nullptr;
  }
}

Sheet HomeView::sheet(Size size) {
  Sheet sheet;
  sheet.title = "qelwatch";
  sheet.keys = "up/down choose  Enter open  s/h/r pages";
  sheet.keys += _desk.recorder ? "  R record  q quit" : "  q quit";
  _changesAtMs.reset();
  addNow(size, sheet);
  addMenu(sheet);
  addFreshness(size, sheet);
  return sheet;
}

void HomeView::addNow(Size size, Sheet& sheet) {
  const NowPage page = nowPage(_desk.viewpoint(), _desk.feed);
  _changesAtMs = earlier(_changesAtMs, page.changesAtMs);
  const auto columns = static_cast<std::size_t>(size.columns);
  if (!page.reason.empty()) {
    for (const std::string& text : {page.reason, page.advice}) {
      for (std::string& line : wrapped(text, columns)) {
        sheet.rows.push_back(plainRow(std::move(line), Style::strong));
      }
    }
    sheet.rows.emplace_back();
    return;
  }
  std::vector<Reading> readings = {page.level};
  if (page.quality) readings.push_back(*page.quality);
  if (page.sinr) readings.push_back(*page.sinr);
  for (std::size_t i = 0; i < page.lines.size(); ++i) {
    const NowLine& line = page.lines.at(i);
    const Style look = !line.isKnown ? Style::muted : i == 0 ? Style::strong : Style::plain;
    Row row{{{padded(line.text, kIdentityColumns), look}}, ""};
    if (i < readings.size()) {
      for (Span& span : spansOf(readings[i])) row.spans.push_back(std::move(span));
    }
    sheet.rows.push_back(std::move(row));
  }
  const BlockFrame frame{page.runsFromMs, page.runsToMs, page.lowest, page.highest,
                         std::min<std::size_t>(columns, 120)};
  sheet.rows.push_back({{{sparkline(page.runs, frame), Style::accent}}, ""});
  sheet.rows.emplace_back();
}

void HomeView::addMenu(Sheet& sheet) {
  for (const std::string& name : _screens.technologies()) {
    sheet.rows.push_back({{{"  " + name, Style::plain}}, kMenu + name});
  }
  for (const OtherPage& page : kOtherPages) {
    sheet.rows.push_back({{{"  " + padded(page.name, 14), Style::plain},
                           {std::string(1, page.letter), Style::muted}},
                          std::string(1, page.letter)});
  }
}

void HomeView::addFreshness(Size size, Sheet& sheet) {
  const Freshness fresh = freshness(_desk.feed, _desk.viewpoint());
  _changesAtMs = earlier(_changesAtMs, fresh.changesAtMs);
  sheet.side = fresh.source;
  const auto add = [&](const std::string& text, Style style) {
    for (std::string& line : wrapped(text, static_cast<std::size_t>(size.columns))) {
      sheet.foot.push_back(plainRow(std::move(line), style));
    }
  };
  add(_desk.feed.condition, Style::muted);
  add(capitalized(fresh.state), fresh.isFlowing ? Style::muted : Style::notice);
  add(fresh.advice, Style::notice);
  add(fresh.loss, Style::notice);
}

std::unique_ptr<View> HomeView::open(const std::string& rowId) {
  constexpr std::size_t kMenuSize = 5;
  if (rowId.starts_with(kMenu)) return _screens.openTechnology(rowId.substr(kMenuSize), _desk);
  return rowId.size() == 1 ? viewOfLetter(rowId.front(), _desk) : nullptr;
}

}  // namespace qel::watch
