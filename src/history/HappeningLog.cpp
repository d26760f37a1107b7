#include "history/HappeningLog.h"

#include <algorithm>
#include <string_view>
#include <utility>

#include "base/Rendering.h"
#include "base/Utf8.h"
#include "history/Words.h"

namespace qel {
namespace {

std::string connectionText(Technology technology, const ToldConnection& told) {
  std::string text(nameOf(technology));
  text += " RRC: " + wordsOf(&told.state, "state");
  const std::string why = told.cause.isNull() ? "" : wordsOf(&told.cause, "cause");
  if (!why.empty()) text += ", " + why;
  return text;
}

std::string technologyText(const ToldTechnology& told) {
  return "Changed from " + std::string(nameOf(told.from)) + " to " + std::string(nameOf(told.to));
}

std::string statusText(const ToldStatus& told) {
  return std::string(told.domain) + ": " + wordsOf(&told.status, "status");
}

std::string movedText(const Happening& happening) {
  if (!happening.from) return "On " + textOf(*happening.to);
  const std::string_view start = happening.move == CellMove::handover      ? "Handover from "
                                 : happening.move == CellMove::reselection ? "Reselected from "
                                                                           : "From ";
  return std::string(start) + textOf(*happening.from) + " to " + textOf(*happening.to);
}

void append(std::string& text, std::string_view word, const std::string& what) {
  if (what.empty()) return;
  text += text.empty() ? ": " : ", ";
  (text += word) += what;
}

std::string orNothing(const Value& value) { return value.isNull() ? "" : qel::cellText(value); }

// By numbers and name alone: an address is nobody's business.
std::string bearerText(const ToldEntry& entry) {
  std::string text;
  append(text, "", withReplacements(entry.name.view()));
  append(text, "", wordsOf(entry.type.isNull() ? nullptr : &entry.type, "type"));
  if (entry.name.view().empty()) append(text, "number ", orNothing(entry.numbers[0]));
  return (entry.hasCome ? "Connection up" : "Connection down") + text;
}

std::string carrierText(const ToldEntry& entry) {
  std::string text;
  append(text, "PCI ", orNothing(entry.numbers[1]));
  append(text, "EARFCN ", orNothing(entry.numbers[2]));
  append(text, "band ", orNothing(entry.type));
  if (text.empty()) append(text, "number ", orNothing(entry.numbers[0]));
  return (entry.hasCome ? "Carrier added" : "Carrier removed") + text;
}

}  // namespace

void HappeningLog::add(Happening happening, std::uint64_t atMs) {
  all();
  _worded.push_back(std::move(happening));
  _wordedAt.push_back(atMs);
  if (++_count > _most) dropOldest();
}

void HappeningLog::dropOldest() {
  --_count;
  ++_gone;
  if (_worded.empty()) {
    _unworded.pop_front();
  } else {
    _worded.pop_front();
    _wordedAt.pop_front();
  }
}

Happening HappeningLog::worded(const Unworded& unworded) {
  Happening happening;
  happening.timeMs = unworded.timeMs;
  happening.kind = unworded.kind;
  happening.technology = unworded.technology;
  happening.metric = unworded.metric;
  if (const auto* text = std::get_if<std::string>(&unworded.told)) {
    happening.text = *text;
  } else if (const auto* connection = std::get_if<ToldConnection>(&unworded.told)) {
    happening.text = connectionText(*unworded.technology, *connection);
  } else if (const auto* change = std::get_if<ToldTechnology>(&unworded.told)) {
    happening.text = technologyText(*change);
  } else if (const auto* registration = std::get_if<ToldStatus>(&unworded.told)) {
    happening.text = statusText(*registration);
  } else if (const auto* entry = std::get_if<ToldEntry>(&unworded.told)) {
    const bool isBearer = unworded.kind == HappeningKind::bearer;
    happening.text = isBearer ? bearerText(*entry) : carrierText(*entry);
  } else if (const auto* cell = std::get_if<ToldCell>(&unworded.told)) {
    if (cell->from) happening.from = cell->from->asCell();
    happening.to = cell->to.asCell();
    happening.move = cell->move;
    happening.text = movedText(happening);
  }
  return happening;
}

const std::deque<Happening>& HappeningLog::all() const {
  for (; !_unworded.empty(); _unworded.pop_front()) {
    _wordedAt.push_back(_unworded.front().atMs);
    _worded.push_back(worded(_unworded.front()));
  }
  return _worded;
}

std::size_t HappeningLog::until(std::uint64_t atMs) const {
  all();
  return static_cast<std::size_t>(std::ranges::upper_bound(_wordedAt, atMs) - _wordedAt.begin());
}

}  // namespace qel
