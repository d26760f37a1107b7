#include "tools/watch/Sheet.h"

#include <wchar.h>

#include <algorithm>
#include <cstdlib>

#include "base/TerminalText.h"

namespace qel::watch {
namespace {

// The next character of a valid text: its bytes, and the columns it takes.
struct Character {
  std::size_t bytes = 1;
  std::size_t columns = 1;
};

Character characterAt(const std::string& text, std::size_t place) {
  wchar_t wide = 0;
  std::mbstate_t state{};
  const std::size_t bytes = std::mbrtowc(&wide, text.data() + place, text.size() - place, &state);
  if (bytes == 0 || bytes > text.size() - place) return {};
  const int columns = ::wcwidth(wide);
  return {bytes, columns < 0 ? 1 : static_cast<std::size_t>(columns)};
}

}  // namespace

std::size_t columnsOf(const std::string& text) {
  const std::string shown = forTerminal(text, Instead::blank);
  std::size_t columns = 0;
  for (std::size_t place = 0; place < shown.size();) {
    const Character character = characterAt(shown, place);
    columns += character.columns;
    place += character.bytes;
  }
  return columns;
}

std::string padded(const std::string& text, std::size_t columns) {
  std::string result = forTerminal(text, Instead::blank);
  std::size_t taken = 0;
  std::size_t place = 0;
  while (place < result.size()) {
    const Character character = characterAt(result, place);
    if (taken + character.columns > columns) break;
    taken += character.columns;
    place += character.bytes;
  }
  result.resize(place);
  return result + std::string(columns - taken, ' ');
}

}  // namespace qel::watch
