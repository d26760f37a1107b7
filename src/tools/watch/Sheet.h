// What a terminal shows at one moment, before anything is drawn.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace qel::watch {

enum class Style : std::uint8_t { plain, strong, muted, accent, notice, good, fair, poor };

// Text of one look. Whatever it is, nothing in it can be obeyed: the terminal draws it as text.
struct Span {
  std::string text;
  Style style = Style::plain;

  friend bool operator==(const Span&, const Span&) = default;
};

// One line. What does not fit is cut off at the right.
struct Row {
  std::vector<Span> spans;
  std::string id;  // the same as long as the row is there; empty: it cannot be chosen

  friend bool operator==(const Row&, const Row&) = default;
};

struct Sheet {
  std::string title;
  std::string side;       // at the right of the title
  std::vector<Row> rows;  // scrolled when they do not fit
  std::vector<Row> foot;  // always seen
  std::string keys;       // what can be pressed

  friend bool operator==(const Sheet&, const Sheet&) = default;
};

struct Size {
  int columns = 80;
  int lines = 24;

  friend bool operator==(const Size&, const Size&) = default;
};

// Below it a terminal only says so.
inline constexpr Size kSmallest{80, 24};

// Columns that a text takes; what is no UTF-8 and what cannot be seen takes as many as what stands
// for it.
std::size_t columnsOf(const std::string& text);
// The text followed by blanks until it takes so many columns, or cut off there.
std::string padded(const std::string& text, std::size_t columns);

}  // namespace qel::watch
