#include "fleet/NumberNames.h"

#include <algorithm>
#include <array>
#include <charconv>

namespace qel::fleet {
namespace {

struct BaseUnit {
  std::string_view shown;
  std::string_view base;
  double factor = 1;
  double divisor = 1;
};

constexpr std::array kBaseUnits = {
    BaseUnit{"dBm", "dbm"},        BaseUnit{"dB", "db"},
    BaseUnit{"MHz", "hertz", 1e6}, BaseUnit{"ms", "seconds", 1, 1000},
    BaseUnit{"s", "seconds"},      BaseUnit{"tenths of an hour", "seconds", 360},
    BaseUnit{"blocks", "blocks"},
};

bool isUpper(char c) { return c >= 'A' && c <= 'Z'; }
bool isLower(char c) { return c >= 'a' && c <= 'z'; }
bool isDigit(char c) { return c >= '0' && c <= '9'; }

// Whether a new word begins there: "QQual" is q_qual, "lowQ" low_q.
bool beginsWord(std::string_view name, std::size_t at) {
  if (at == 0 || !isUpper(name[at]) || name[at - 1] == '_') return false;
  return !isUpper(name[at - 1]) || (at + 1 < name.size() && isLower(name[at + 1]));
}

std::string_view withoutEnd(std::string_view words, std::string_view unit) {
  const bool hasIt = words.size() > unit.size() + 1 && words.ends_with(unit) &&
                     words[words.size() - unit.size() - 1] == '_';
  return hasIt ? words.substr(0, words.size() - unit.size() - 1) : words;
}

}  // namespace

std::string asWords(std::string_view name) {
  std::string words;
  std::size_t wordBegin = 0;
  const auto endWord = [&] {
    const std::size_t length = words.size() - wordBegin;
    if (length > 1) words += '_';
    if (length != 1) wordBegin = words.size();
  };
  for (std::size_t i = 0; i < name.size(); ++i) {
    const char c = name[i];
    if (c == '_' || beginsWord(name, i)) endWord();
    if (isUpper(c)) {
      words += static_cast<char>(c - 'A' + 'a');
    } else if (isLower(c) || isDigit(c)) {
      words += c;
    }
  }
  return words;
}

std::optional<NumberName> numberName(std::string_view words, std::string_view unit) {
  const auto* row = std::ranges::find(kBaseUnits, unit, &BaseUnit::shown);
  if (row == kBaseUnits.end()) return std::nullopt;
  words = withoutEnd(withoutEnd(words, row->shown), row->base);
  return NumberName{"qelwatch_" + asWords(words) + "_" + std::string(row->base), row->factor,
                    row->divisor};
}

std::string_view baseUnitOf(std::string_view name) {
  for (const BaseUnit& row : kBaseUnits) {
    if (withoutEnd(name, row.base).size() < name.size()) return row.base;
  }
  return {};
}

double widened(float shown) {
  std::array<char, 32> text{};
  const char* end = std::to_chars(text.begin(), text.end(), shown).ptr;
  double value = 0;
  std::from_chars(text.begin(), end, value);
  return value;
}

}  // namespace qel::fleet
