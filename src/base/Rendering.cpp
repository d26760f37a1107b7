#include "base/Rendering.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <cstdint>
#include <cstring>

#include "base/LineBuffer.h"
#include "base/Utf8.h"

namespace qel {
namespace {

// The end of a line that is being written: room is looked for once a piece, not once a character.
// Where writing stands is passed along as a plain pointer.
class Line {
 public:
  char* start() const { return _start; }
  // Where to write when `count` more characters are to come.
  char* room(char* at, std::size_t count) {
    if (static_cast<std::size_t>(_end - at) >= count) [[likely]]
      return at;
    widen(at, count);
    return _start;
  }

 protected:
  static constexpr std::size_t kUsual = 512;

  Line() = default;
  ~Line() = default;

  // Moves start to what is then the place of `at`, with more room behind it.
  virtual void widen(char* at, std::size_t count) = 0;

  char* _start = nullptr;
  char* _end = nullptr;
};

// The end of a string. What is not yet written is zeros.
class StringLine final : public Line {
 public:
  explicit StringLine(std::string& out) : _out(out) { resize(out.size(), kUsual); }
  void finish(const char* at) { _out.resize(static_cast<std::size_t>(at - _out.data())); }

 private:
  void widen(char* at, std::size_t count) override {
    const auto used = static_cast<std::size_t>(at - _out.data());
    resize(used, std::max(count, used));
  }
  // Not inline: how much is filled with zeros is then left to the library, which is fast at it.
  [[gnu::noinline]] void resize(std::size_t used, std::size_t count) {
    _out.resize(used + count);
    _start = _out.data() + used;
    _end = _start + count;
  }

  std::string& _out;
};

class BufferLine final : public Line {
 public:
  explicit BufferLine(LineBuffer& out) : _out(out) { widen(out.room(kUsual), kUsual); }
  void finish(const char* at) { _out.writtenTo(at); }

 private:
  void widen(char* at, std::size_t count) override {
    _out.writtenTo(at);
    _start = _out.room(count);
    _end = _out.endOfRoom();
  }

  LineBuffer& _out;
};

// The first and the last `Word` of the text, which are all of it when it is not too long for that.
template <class Word>
[[gnu::always_inline]] inline void putEnds(char* at, std::string_view text) {
  const std::size_t last = text.size() - sizeof(Word);
  std::memcpy(at, text.data(), sizeof(Word));
  std::memcpy(at + last, text.data() + last, sizeof(Word));
}

struct SixteenBytes {
  std::array<char, 16> bytes;
};

// Keys and names are short.
[[gnu::always_inline]] inline char* put(char* at, std::string_view text) {
  if (text.size() <= 16) {
    if (text.size() >= 8) {
      putEnds<std::uint64_t>(at, text);
    } else if (text.size() >= 4) {
      putEnds<std::uint32_t>(at, text);
    } else {
      std::memcpy(at, text.data(), text.size());
    }
  } else if (text.size() <= 32) {
    putEnds<SixteenBytes>(at, text);
  } else {
    std::memcpy(at, text.data(), text.size());
  }
  return at + text.size();
}

// The room that is always there for a piece: any number (the longest is the smallest subnormal
// float, of 48 characters) and the marks around it.
constexpr std::size_t kRoom = 64;

std::string bytesText(const Bytes& bytes) { return '<' + hexText(bytes) + '>'; }

void appendEscaped(std::string& out, char c) {
  switch (c) {
    case '"':
      out += "\\\"";
      break;
    case '\\':
      out += "\\\\";
      break;
    case '\b':
      out += "\\b";
      break;
    case '\f':
      out += "\\f";
      break;
    case '\n':
      out += "\\n";
      break;
    case '\r':
      out += "\\r";
      break;
    case '\t':
      out += "\\t";
      break;
    default:
      out += "\\u00";
      appendHex(out, std::array{static_cast<std::uint8_t>(c)});
  }
}

// Printable ASCII without quote and backslash stands for itself. Eight characters at a time: a bit
// is set in the top of each byte that is one of the others (bytes above one of these may be set
// too).
constexpr std::uint64_t kOnes = 0x0101010101010101;
constexpr std::uint64_t kTops = 0x8080808080808080;

constexpr std::uint64_t below(std::uint64_t word, std::uint8_t least) {
  return (word - least * kOnes) & ~word & kTops;
}
constexpr std::uint64_t equal(std::uint64_t word, char c) {
  return below(word ^ static_cast<std::uint8_t>(c) * kOnes, 1);
}

bool isPlain(std::uint64_t word) {
  return ((word & kTops) | below(word, 0x20) | equal(word, '"') | equal(word, '\\')) == 0;
}

bool isPlain(char c) { return static_cast<signed char>(c) >= 0x20 && c != '"' && c != '\\'; }

bool isPlain(std::string_view text) {
  constexpr std::size_t kWord = sizeof(std::uint64_t);
  const auto isPlainAt = [&text](std::size_t at) {
    std::uint64_t word = 0;
    std::memcpy(&word, text.data() + at, kWord);
    return isPlain(word);
  };
  if (text.size() < kWord) return std::ranges::all_of(text, [](char c) { return isPlain(c); });
  for (std::size_t at = 0; at < text.size() - kWord; at += kWord) {
    if (!isPlainAt(at)) return false;
  }
  return isPlainAt(text.size() - kWord);
}

std::string escaped(std::string_view text) {
  std::string out;
  for (const char c : text) {
    if (isPlain(c) || static_cast<signed char>(c) < 0) {
      out += c;
    } else {
      appendEscaped(out, c);
    }
  }
  return out;
}

// Within the room that there is.
[[gnu::always_inline]] inline char* putQuoted(char* at, std::string_view plain) {
  *at++ = '"';
  at = put(at, plain);
  *at++ = '"';
  return at;
}

[[gnu::noinline]] char* putEscaped(Line& line, char* at, std::string_view text) {
  const std::string escapes = escaped(isValidUtf8(text) ? text : withReplacements(text));
  return putQuoted(line.room(at, escapes.size() + kRoom), escapes);
}

char* putString(Line& line, char* at, std::string_view text) {
  if (!isPlain(text)) return putEscaped(line, at, text);
  return putQuoted(line.room(at, text.size() + kRoom), text);
}

char* putText(Line& line, char* at, const Value& value) {
  const std::string_view text = *value.asText();
  if (!value.isName()) return putString(line, at, text);
  return putQuoted(line.room(at, text.size() + kRoom), text);
}

[[gnu::noinline]] char* putBytes(Line& line, char* at, const Bytes& bytes) {
  constexpr std::string_view kDigits = "0123456789abcdef";
  at = line.room(at, 2 * bytes.size() + kRoom);
  at = put(at, "\"<");
  for (const std::uint8_t byte : bytes) {
    *at++ = kDigits[byte >> 4];
    *at++ = kDigits[byte & 0xF];
  }
  return put(at, ">\"");
}

[[gnu::noinline]] char* putFloat(char* at, float value) {
  if (!std::isfinite(value)) return put(at, "null");
  char* end = std::to_chars(at, at + kRoom, value, std::chars_format::fixed).ptr;
  return std::find(at, end, '.') == end ? put(end, ".0") : end;
}

// The digits of every number below 1,000, and behind them how many they are.
constexpr auto kShortNumbers = [] {
  std::array<std::array<char, 4>, 1000> numbers{};
  for (std::size_t value = 0; value < numbers.size(); ++value) {
    char count = 0;
    for (std::size_t unit = value < 10 ? 1 : value < 100 ? 10 : 100; unit > 0; unit /= 10) {
      numbers[value][static_cast<std::size_t>(count++)] =
          static_cast<char>('0' + value / unit % 10);
    }
    numbers[value].back() = count;
  }
  return numbers;
}();

[[gnu::always_inline]] inline char* putShort(char* at, std::uint32_t value) {
  const auto& number = kShortNumbers.data()[value];
  std::memcpy(at, number.data(), number.size());
  return at + number.back();
}

// "00" to "99".
[[gnu::always_inline]] inline char* putPair(char* at, std::uint32_t value) {
  std::memcpy(at, kShortNumbers.data()[100 + value].data() + 1, 2);
  return at + 2;
}

char* putLargeInteger(char* at, std::uint64_t value);

// Most numbers of a metric have at most three digits, nearly all have five.
[[gnu::always_inline]] inline char* putInteger(char* at, std::uint64_t value) {
  if (value >= 100000) return putLargeInteger(at, value);
  const auto small = static_cast<std::uint32_t>(value);
  if (small < 1000) return putShort(at, small);
  return putPair(putShort(at, small / 100), small % 100);
}

[[gnu::noinline]] char* putLargeInteger(char* at, std::uint64_t value) {
  const auto last = static_cast<std::uint32_t>(value % 10000);
  at = putInteger(at, value / 10000);
  return putPair(putPair(at, last / 100), last % 100);
}

[[gnu::always_inline]] inline char* putInteger(char* at, std::int64_t value) {
  const auto bits = static_cast<std::uint64_t>(value);
  if (value >= 0) return putInteger(at, bits);
  *at++ = '-';
  return putInteger(at, 0 - bits);
}

char* putList(Line& line, char* at, const List& list);
char* putDictionary(Line& line, char* at, const Dictionary& dictionary);

// There must be kRoom.
[[gnu::always_inline]] inline char* putValue(Line& line, char* at, const Value& value) {
  switch (value.kind()) {
    case Value::Kind::null:
      return put(at, "null");
    case Value::Kind::boolean:
      return put(at, *value.asBoolean() ? "true" : "false");
    case Value::Kind::signedInteger:
      return putInteger(at, *value.asInt64());
    case Value::Kind::unsignedInteger:
      return putInteger(at, *value.asUInt64());
    case Value::Kind::floating:
      return putFloat(at, *value.asFloat());
    case Value::Kind::text:
      return putText(line, at, value);
    case Value::Kind::bytes:
      return putBytes(line, at, *value.asBytes());
    case Value::Kind::list:
      return putList(line, at, *value.asList());
    case Value::Kind::dictionary:
      return putDictionary(line, at, *value.asDictionary());
  }
  return at;
}

// Elements are written with a separator behind each, and the last one is taken back.
constexpr std::string_view kSeparator = ", ";

char* putList(Line& line, char* at, const List& list) {
  at = line.room(at, kRoom);
  *at++ = '[';
  for (const Value& value : list) {
    at = put(putValue(line, line.room(at, kRoom), value), kSeparator);
  }
  if (!list.empty()) at -= kSeparator.size();
  at = line.room(at, kRoom);
  *at++ = ']';
  return at;
}

char* putDictionary(Line& line, char* at, const Dictionary& dictionary) {
  at = line.room(at, kRoom);
  *at++ = '{';
  for (const auto& [key, value] : dictionary) {
    const std::string_view name = key;
    at = line.room(at, name.size() + 2 * kRoom);
    at = key.isName() ? putQuoted(at, name) : line.room(putString(line, at, name), kRoom);
    at = put(putValue(line, put(at, ": "), value), kSeparator);
  }
  if (!dictionary.empty()) at -= kSeparator.size();
  at = line.room(at, kRoom);
  *at++ = '}';
  return at;
}

}  // namespace

void appendJsonString(std::string& out, std::string_view text) {
  StringLine line(out);
  line.finish(putString(line, line.start(), text));
}

void appendJson(std::string& out, const Dictionary& dictionary) {
  StringLine line(out);
  line.finish(putDictionary(line, line.start(), dictionary));
}

void appendJson(LineBuffer& out, const Dictionary& dictionary) {
  BufferLine line(out);
  line.finish(putDictionary(line, line.start(), dictionary));
}

void appendJson(std::string& out, const Value& value) {
  StringLine line(out);
  line.finish(putValue(line, line.room(line.start(), kRoom), value));
}

std::string jsonText(const Value& value) {
  std::string out;
  appendJson(out, value);
  return out;
}

std::string jsonText(const Dictionary& dictionary) {
  std::string out;
  appendJson(out, dictionary);
  return out;
}

std::string cellText(const Value& value) {
  std::string out;
  switch (value.kind()) {
    case Value::Kind::boolean:
      out = *value.asBoolean() ? "1" : "0";
      break;
    case Value::Kind::text:
      out = *value.asText();
      break;
    case Value::Kind::bytes:
      out = bytesText(*value.asBytes());
      break;
    default:
      appendJson(out, value);
  }
  return out;
}

}  // namespace qel
