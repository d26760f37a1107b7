#include "recording/PlainLine.h"

#include <algorithm>
#include <array>
#include <utility>

#include "base/Bytes.h"
#include "recording/LineLimits.h"

namespace qel {
namespace {

// Keys that a dictionary need not copy.
constexpr std::array<Name, 4> kUsualKeys = {"kKeyMetricID", "kKeyPayload", "kKeyProfileID",
                                            "kKeyTriggerID"};

Text keyText(std::string_view key) {
  const auto* const usual = std::ranges::find(kUsualKeys, key, &Name::view);
  return usual == kUsualKeys.end() ? Text(key) : Text(*usual);
}

// Takes the parts of a plain line off its front.
class Scanner {
 public:
  explicit Scanner(std::string_view line) : _left(line) {}

  bool take(char wanted) {
    skipBlanks();
    if (_left.empty() || _left.front() != wanted) return false;
    _left.remove_prefix(1);
    return true;
  }

  std::optional<std::string_view> text() {
    if (!take('"')) return std::nullopt;
    const std::size_t size = _left.find('"');
    if (size == std::string_view::npos) return std::nullopt;
    const std::string_view text = _left.substr(0, size);
    bool isPlain = true;
    for (const char c : text) isPlain &= c >= ' ' && c <= '~' && c != '\\';
    if (!isPlain) return std::nullopt;
    _left.remove_prefix(size + 1);
    return text;
  }

  std::optional<std::uint64_t> number() {
    constexpr std::size_t kMostDigits = 18;
    skipBlanks();
    const auto size = lengthWhile([](char c) { return c >= '0' && c <= '9'; });
    if (size == 0 || size > kMostDigits || (size > 1 && _left.front() == '0')) return std::nullopt;
    std::uint64_t number = 0;
    for (const char digit : _left.substr(0, size)) {
      number = number * 10 + static_cast<std::uint64_t>(digit - '0');
    }
    _left.remove_prefix(size);
    return number;
  }

  bool startsText() {
    skipBlanks();
    return _left.starts_with('"');
  }

  bool atEnd() {
    skipBlanks();
    return _left.empty();
  }

 private:
  template <class Condition>
  std::size_t lengthWhile(const Condition& condition) const {
    const auto* const end = std::ranges::find_if_not(_left, condition);
    return static_cast<std::size_t>(end - _left.begin());
  }

  void skipBlanks() {
    _left.remove_prefix(lengthWhile([](char c) { return c == ' ' || c == '\t' || c == '\r'; }));
  }

  std::string_view _left;
};

std::optional<Value> readValue(std::string_view key, Scanner& scanner) {
  const bool isPayload = key == kRecordedPayloadKey;
  if (!isPayload && !scanner.startsText()) {
    const auto number = scanner.number();
    return number ? std::optional(Value(*number)) : std::nullopt;
  }
  const auto text = scanner.text();
  if (!text) return std::nullopt;
  if (!isPayload) return Value(*text);
  auto bytes = bytesFromBase64(*text);
  return bytes ? std::optional(Value(std::move(*bytes))) : std::nullopt;
}

// One line while it is read. Each of these is false when the line is not plain.
class PlainLine {
 public:
  bool readEntry(Scanner& scanner) {
    const auto key = scanner.text();
    if (!key || !scanner.take(':')) return false;
    if (*key == kRecordedTimeKey) return readTime(scanner);
    if (*key == kRecordedEventKey) return readKind(scanner);
    auto value = readValue(*key, scanner);
    if (!value || event.entries.size() + kKeysOfTheLine == kMostKeysOfAnObject) return false;
    if (event.entries.contains(*key)) return false;
    event.entries.append(keyText(*key), std::move(*value));
    return true;
  }

  bool isWhole() const { return _hasTime && _hasKind; }

  RecordedEvent event;

 private:
  bool readTime(Scanner& scanner) {
    const auto time = scanner.number();
    if (!time || *time > kLastRecordedMs || std::exchange(_hasTime, true)) return false;
    event.timeMs = *time;
    return true;
  }

  bool readKind(Scanner& scanner) {
    const auto name = scanner.text();
    const auto kind = name ? recordedKind(*name) : std::nullopt;
    if (!kind || std::exchange(_hasKind, true)) return false;
    event.kind = *kind;
    return true;
  }

  bool _hasTime = false;
  bool _hasKind = false;
};

}  // namespace

std::optional<RecordedEvent> readPlainLine(std::string_view line) {
  constexpr std::size_t kUsualEntries = 4;
  Scanner scanner(line);
  PlainLine plain;
  plain.event.entries.reserve(kUsualEntries);
  if (!scanner.take('{')) return std::nullopt;
  do {
    if (!plain.readEntry(scanner)) return std::nullopt;
  } while (scanner.take(','));
  if (!scanner.take('}') || !scanner.atEnd() || !plain.isWhole()) return std::nullopt;
  return std::move(plain.event);
}

}  // namespace qel
