#include "tools/watch/Palette.h"

#include <algorithm>
#include <cwchar>
#include <string>

#include "base/TerminalText.h"

namespace qel::watch {
namespace {

// Colours of the 256 that read on a dark ground and on a light one; 0: the terminal's own.
struct Looks {
  Style style;
  attr_t look;
  short colour;
};

constexpr std::array kLooks = {
    Looks{Style::plain, A_NORMAL, 0},  Looks{Style::strong, A_BOLD, 0},
    Looks{Style::muted, A_DIM, 0},     Looks{Style::accent, A_BOLD, 37},
    Looks{Style::notice, A_BOLD, 136}, Looks{Style::good, A_NORMAL, 34},
    Looks{Style::fair, A_NORMAL, 172}, Looks{Style::poor, A_BOLD, 160},
};

std::wstring wide(const std::string& text) {
  std::wstring result;
  std::mbstate_t state{};
  const char* next = text.data();
  const char* const end = next + text.size();
  while (next < end) {
    wchar_t character = 0;
    const auto size = static_cast<std::size_t>(end - next);
    const std::size_t bytes = std::mbrtowc(&character, next, size, &state);
    if (bytes == 0 || bytes > size) break;
    result += character;
    next += bytes;
  }
  return result;
}

}  // namespace

void Palette::begin() {
  constexpr int kWanted = 256;
  const bool isColoured =
      ::has_colors() && ::start_color() == OK && COLORS >= kWanted && ::use_default_colors() == OK;
  for (const Looks& looks : kLooks) {
    const auto place = static_cast<std::size_t>(looks.style);
    _looks.at(place) = looks.look;
    if (!isColoured || looks.colour == 0) continue;
    const auto pair = static_cast<short>(place + 1);
    if (::init_pair(pair, looks.colour, -1) == OK) _pairs.at(place) = pair;
  }
}

void Palette::put(int line, int column, const std::vector<Span>& spans, int columns,
                  bool isChosen) const {
  const attr_t chosen = isChosen ? A_REVERSE : A_NORMAL;
  auto left = static_cast<std::size_t>(std::max(columns, 0));
  ::move(line, column);
  for (const Span& span : spans) {
    const std::size_t taken = std::min(left, columnsOf(span.text));
    const auto place = static_cast<std::size_t>(span.style);
    ::attr_set(_looks.at(place) | chosen, _pairs.at(place), nullptr);
    const std::wstring text = wide(padded(span.text, taken));
    ::addnwstr(text.data(), static_cast<int>(text.size()));
    left -= taken;
  }
  ::attr_set(chosen, 0, nullptr);
  if (isChosen) ::addstr(std::string(left, ' ').c_str());
  ::attr_set(A_NORMAL, 0, nullptr);
}

}  // namespace qel::watch
