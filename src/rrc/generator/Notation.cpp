#include "rrc/generator/Notation.h"

#include <algorithm>
#include <charconv>
#include <optional>
#include <sstream>

namespace qel::rrc::generator {
namespace {

constexpr std::size_t kIndent = 2;
constexpr std::int64_t kLongest = 65'535;  // elements, bits, octets
constexpr std::int64_t kMostSkipped = 64;

struct Line {
  Place place;
  std::size_t indent = 0;
  std::vector<std::string> words;
};

std::vector<Line> linesOf(std::string_view text, const std::string& file) {
  std::vector<Line> lines;
  std::istringstream stream{std::string(text)};
  std::string line;
  for (std::size_t number = 1; std::getline(stream, line); ++number) {
    line.resize(std::min(line.find('#'), line.size()));
    std::istringstream words(line);
    Line found{{file, number}, std::min(line.find_first_not_of(' '), line.size()), {}};
    for (std::string word; words >> word;) found.words.push_back(word);
    if (!found.words.empty()) lines.push_back(std::move(found));
  }
  return lines;
}

// The words of one line, taken from the front.
class Words {
 public:
  Words(const Line& line, std::size_t next) : _line(&line), _next(next) {}

  const Place& place() const { return _line->place; }
  bool done() const { return _next == _line->words.size(); }
  std::string_view front() const { return done() ? std::string_view() : _line->words[_next]; }
  std::string take() {
    if (done()) place().refuse("the line ends too early");
    return _line->words[_next++];
  }
  bool skip(std::string_view word) {
    const bool there = front() == word;
    if (there) ++_next;
    return there;
  }
  std::int64_t number() {
    const std::string word = take();
    const auto number = numberIn(word);
    if (!number) place().refuse("not a number: " + word);
    return *number;
  }
  // "a..b", or "a" for both.
  void range(std::int64_t& low, std::int64_t& high) {
    const std::string word = take();
    const auto dots = word.find("..");
    const auto from = numberIn(word.substr(0, dots));
    const auto to = dots == std::string::npos ? from : numberIn(word.substr(dots + 2));
    if (!from || !to) place().refuse("not a range: " + word);
    if (*from > *to) place().refuse("a range that ends before it begins: " + word);
    low = *from;
    high = *to;
  }

  static std::optional<std::int64_t> numberIn(std::string_view word) {
    std::int64_t number = 0;
    const auto [end, error] = std::from_chars(word.data(), word.data() + word.size(), number);
    if (error != std::errc() || end != word.data() + word.size()) return std::nullopt;
    return number;
  }

 private:
  const Line* _line;
  std::size_t _next;
};

bool isName(std::string_view word) {
  const auto letter = [](char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); };
  return !word.empty() && letter(word.front()) &&
         std::all_of(word.begin(), word.end(),
                     [&](char c) { return letter(c) || (c >= '0' && c <= '9') || c == '-'; });
}

Shape shapeOf(Kind kind) {
  Shape shape;
  shape.kind = kind;
  return shape;
}

class Parser {
 public:
  explicit Parser(std::vector<Line> lines) : _lines(std::move(lines)) {}

  void definitions(std::vector<Definition>& into) {
    while (_next < _lines.size()) {
      const Line& line = _lines[_next++];
      if (line.indent != 0) line.place.refuse("indented, but nothing is open");
      Words words(line, 0);
      Definition definition{line.place, {}, words.skip("message"), {}};
      definition.name = words.take();
      if (!isName(definition.name)) line.place.refuse("not a name: " + definition.name);
      if (!words.skip("=")) line.place.refuse("'=' is missing");
      definition.shape = whole(words, 0);
      into.push_back(std::move(definition));
    }
  }

 private:
  // A shape that ends with its line or with the deeper lines that belong to it.
  Shape whole(Words& words, std::size_t indent) {
    Shape result = shape(words, indent);
    if (!words.done()) words.place().refuse("too much: " + std::string(words.front()));
    return result;
  }

  Shape shape(Words& words, std::size_t indent) {
    const std::string word = words.take();
    if (word == "NULL") return shapeOf(Kind::null);
    if (word == "BOOL") return shapeOf(Kind::boolean);
    if (word == "STOP") return shapeOf(Kind::stop);
    if (word == "INT") {
      Shape result = shapeOf(Kind::integer);
      words.range(result.low, result.high);
      return result;
    }
    if (word == "BITS") return string(words, Kind::bits, indent);
    if (word == "OCTETS") return string(words, Kind::octets, indent);
    if (word == "ENUM") return enumerated(words);
    if (word == "LIST") return list(words, indent);
    if (word == "SEQUENCE") return group(words.place(), Kind::sequence, indent);
    if (word == "CHOICE") return group(words.place(), Kind::choice, indent);
    if (!isName(word)) words.place().refuse("not a type: " + word);
    Shape result;
    result.reference = word;
    return result;
  }

  static void checkSize(const Words& words, const Shape& shape) {
    if (shape.low < 0 || shape.high > kLongest) words.place().refuse("no such size");
  }

  Shape string(Words& words, Kind kind, std::size_t indent) {
    Shape result = shapeOf(kind);
    result.unbounded = words.done() || words.front() == "OF";
    if (!result.unbounded) words.range(result.low, result.high);
    checkSize(words, result);
    if (kind == Kind::octets && words.skip("OF")) result.content.push_back(shape(words, indent));
    return result;
  }

  Shape list(Words& words, std::size_t indent) {
    Shape result = shapeOf(Kind::list);
    words.range(result.low, result.high);
    checkSize(words, result);
    if (!words.skip("OF")) words.place().refuse("'OF' is missing");
    result.content.push_back(shape(words, indent));
    return result;
  }

  static Shape enumerated(Words& words) {
    Shape result = shapeOf(Kind::enumerated);
    std::string count = words.take();
    const bool numbered = count.ends_with(':');
    if (numbered) count.pop_back();
    result.high = Words::numberIn(count).value_or(0) - 1;
    if (result.high < 0 || result.high > kLongest) words.place().refuse("no such count: " + count);
    while (numbered && !words.done() && words.front() != "...") {
      result.numbers.push_back(words.skip("-") ? kNoNumber : words.number());
    }
    result.extensible = words.skip("...");
    if (numbered == result.numbers.empty()) words.place().refuse("numbers are missing");
    if (static_cast<std::int64_t>(result.numbers.size()) > result.high + 1) {
      words.place().refuse("more numbers than values");
    }
    return result;
  }

  // The lines below, one step deeper.
  Shape group(const Place& place, Kind kind, std::size_t indent) {
    Shape result = shapeOf(kind);
    while (_next < _lines.size() && _lines[_next].indent > indent) {
      const Line& line = _lines[_next++];
      if (line.indent != indent + kIndent) line.place.refuse("indented by no step of two");
      if (line.words.front() == "..." && line.words.size() == 1 && !result.extensible) {
        result.extensible = true;
      } else if (result.extensible) {
        addition(line, result);
      } else {
        result.root.push_back(member(line, kind == Kind::sequence));
      }
    }
    if (kind == Kind::choice && result.root.empty()) place.refuse("a choice of nothing");
    return result;
  }

  void addition(const Line& line, Shape& shape) {
    Words words(line, 0);
    if (words.skip("skip")) {
      const std::int64_t count = words.done() ? 1 : words.number();
      if (count < 1 || count > kMostSkipped || !words.done()) line.place.refuse("no such count");
      shape.additions.resize(shape.additions.size() + static_cast<std::size_t>(count),
                             {line.place, {}, false, false, {}});
    } else if (shape.kind == Kind::sequence && words.skip("group")) {
      if (!words.done()) line.place.refuse("too much behind 'group'");
      const Shape inside = group(line.place, Kind::sequence, line.indent);
      shape.additions.push_back({line.place, "group", false, false, inside});
    } else {
      shape.additions.push_back(member(line, false));
    }
  }

  Member member(const Line& line, bool mayBeOptional) {
    Words words(line, 0);
    Member result{line.place, words.take(), false, false, {}};
    if (result.name.starts_with('!')) {
      result.wanted = true;
      result.name.erase(0, 1);
    }
    if (result.name.ends_with('?')) {
      if (!mayBeOptional) line.place.refuse("only a sequence's own fields can be optional");
      result.optional = true;
      result.name.pop_back();
    }
    if (!isName(result.name)) line.place.refuse("not a name: " + result.name);
    result.shape = whole(words, line.indent);
    return result;
  }

  std::vector<Line> _lines;
  std::size_t _next = 0;
};

}  // namespace

void readNotation(std::string_view text, const std::string& file,
                  std::vector<Definition>& definitions) {
  Parser(linesOf(text, file)).definitions(definitions);
}

}  // namespace qel::rrc::generator
