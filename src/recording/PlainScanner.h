// Takes the parts of a plain line of JSON off its front, eight characters at a time where it can.
#pragma once

#include <array>
#include <bit>
#include <cstdint>
#include <cstring>
#include <optional>
#include <string_view>

namespace qel {

// A text that is looked for, such as a key with its quotes and its colon: of 8 to 16 characters, so
// that two words, which may overlap, are all of it.
class KnownText {
 public:
  consteval explicit KnownText(std::string_view text)
      : _size(text.size()), _front(word(text, 0)), _back(word(text, text.size() - kWord)) {
    if (text.size() < kWord || text.size() > 2 * kWord) throw "neither one nor two words";
  }

  std::size_t size() const { return _size; }
  // There are size() characters.
  bool isAt(const char* text) const {
    return loaded(text) == _front && loaded(text + _size - kWord) == _back;
  }

 private:
  static constexpr std::size_t kWord = sizeof(std::uint64_t);

  static consteval std::uint64_t word(std::string_view text, std::size_t from) {
    std::array<char, kWord> characters{};
    for (std::size_t i = 0; i < kWord; ++i) characters[i] = text[from + i];
    return std::bit_cast<std::uint64_t>(characters);
  }
  static std::uint64_t loaded(const char* text) {
    std::uint64_t word = 0;
    std::memcpy(&word, text, kWord);
    return word;
  }

  std::size_t _size;
  std::uint64_t _front;
  std::uint64_t _back;
};

// Each part is nothing, or false, where the line goes on with something else. Blanks may stand
// before a part.
class PlainScanner {
 public:
  explicit PlainScanner(std::string_view line)
      : _next(line.data()), _end(line.data() + line.size()) {}

  bool take(char wanted) {
    if (!startsWith(wanted)) return false;
    ++_next;
    return true;
  }

  bool take(const KnownText& wanted) {
    skipBlanks();
    if (left() < wanted.size() || !wanted.isAt(_next)) return false;
    _next += wanted.size();
    return true;
  }

  bool startsWith(char wanted) {
    skipBlanks();
    return _next != _end && *_next == wanted;
  }

  bool atEnd() {
    skipBlanks();
    return _next == _end;
  }

  // What stands between two quotes, whatever it is.
  std::optional<std::string_view> quoted() {
    if (!take('"')) return std::nullopt;
    const std::string_view rest(_next, left());
    const std::size_t size = rest.find('"');
    if (size == std::string_view::npos) return std::nullopt;
    _next += size + 1;
    return rest.substr(0, size);
  }

  // The same, printable ASCII without escapes.
  std::optional<std::string_view> text() {
    const auto text = quoted();
    bool isPlain = text.has_value();
    if (text) {
      for (const char c : *text) isPlain &= c >= ' ' && c <= '~' && c != '\\';
    }
    return isPlain ? text : std::nullopt;
  }

  // A whole number of at most 18 digits.
  std::optional<std::uint64_t> number();

 private:
  std::size_t left() const { return static_cast<std::size_t>(_end - _next); }
  void skipBlanks() {
    while (_next != _end && (*_next == ' ' || *_next == '\t' || *_next == '\r')) ++_next;
  }

  const char* _next;
  const char* _end;
};

}  // namespace qel
