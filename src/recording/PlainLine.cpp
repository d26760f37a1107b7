#include "recording/PlainLine.h"

#include <array>
#include <utility>

#include "base/Bytes.h"
#include "recording/LineLimits.h"
#include "recording/PlainScanner.h"

namespace qel {
namespace {

// The keys of nearly every line, in the order in which they come there. A dictionary need not copy
// their names.
struct UsualKey {
  Name name;
  KnownText text;  // as a line has it
};
#define QEL_USUAL_KEY(name) \
  UsualKey { name, KnownText("\"" name "\":") }
constexpr std::array kUsualKeys = {
    QEL_USUAL_KEY("time_ms"),       QEL_USUAL_KEY("event"),       QEL_USUAL_KEY("kKeyMetricID"),
    QEL_USUAL_KEY("kKeyProfileID"), QEL_USUAL_KEY("kKeyPayload"), QEL_USUAL_KEY("kKeyTriggerID"),
};
#undef QEL_USUAL_KEY
constexpr std::size_t kTime = 0;
constexpr std::size_t kKind = 1;
constexpr std::size_t kPayload = 4;
constexpr std::size_t kOther = kUsualKeys.size();
static_assert(kUsualKeys[kTime].name == kRecordedTimeKey &&
              kUsualKeys[kKind].name == kRecordedEventKey &&
              kUsualKeys[kPayload].name == kRecordedPayloadKey);

struct UsualKind {
  RecordedKind kind;
  KnownText text;
};
constexpr std::array kUsualKinds = {UsualKind{RecordedKind::metric, KnownText("\"metric\"")},
                                    UsualKind{RecordedKind::trigger, KnownText("\"trigger\"")}};
static_assert(kUsualKinds.size() == kRecordedKindNames.size());

std::optional<Value> readValue(PlainScanner& scanner) {
  if (scanner.startsWith('"')) {
    const auto text = scanner.text();
    return text ? std::optional(Value(*text)) : std::nullopt;
  }
  const auto number = scanner.number();
  return number ? std::optional(Value(*number)) : std::nullopt;
}

// A text that is base64 is plain.
std::optional<Value> readPayload(PlainScanner& scanner) {
  const auto text = scanner.quoted();
  auto bytes = text ? bytesFromBase64(*text) : std::nullopt;
  return bytes ? std::optional(Value(std::move(*bytes))) : std::nullopt;
}

// One line while it is read. Each of these is false when the line is not plain.
class PlainLine {
 public:
  bool readEntry(PlainScanner& scanner) {
    std::size_t key = takeUsualKey(scanner);
    std::optional<std::string_view> text;
    if (key == kOther) {
      text = scanner.text();
      if (!text || !scanner.take(':')) return false;
      key = placeOf(*text);
    }
    if (key == kOther) return !event.entries.contains(*text) && append(*text, readValue(scanner));
    if (std::exchange(_has[key], true)) return false;
    if (key == kTime) return readTime(scanner);
    if (key == kKind) return readKind(scanner);
    return append(kUsualKeys[key].name,
                  key == kPayload ? readPayload(scanner) : readValue(scanner));
  }

  bool isWhole() const { return _has[kTime] && _has[kKind]; }

  RecordedEvent event;

 private:
  // Looks first for the one that usually comes next.
  std::size_t takeUsualKey(PlainScanner& scanner) {
    for (std::size_t tried = 0; tried < kUsualKeys.size(); ++tried) {
      const std::size_t key = _next;
      _next = key + 1 == kUsualKeys.size() ? 0 : key + 1;
      if (scanner.take(kUsualKeys[key].text)) return key;
    }
    return kOther;
  }

  static std::size_t placeOf(std::string_view key) {
    std::size_t place = 0;
    while (place < kUsualKeys.size() && kUsualKeys[place].name.view() != key) ++place;
    return place;
  }

  bool append(Text key, std::optional<Value> value) {
    if (!value || event.entries.size() + kKeysOfTheLine == kMostKeysOfAnObject) return false;
    event.entries.append(std::move(key), std::move(*value));
    return true;
  }

  bool readTime(PlainScanner& scanner) {
    const auto time = scanner.number();
    if (!time || *time > kLastRecordedMs) return false;
    event.timeMs = *time;
    return true;
  }

  bool readKind(PlainScanner& scanner) {
    for (const UsualKind& usual : kUsualKinds) {
      event.kind = usual.kind;
      if (scanner.take(usual.text)) return true;
    }
    return false;
  }

  std::array<bool, kUsualKeys.size()> _has{};
  std::size_t _next = 0;
};

}  // namespace

std::optional<RecordedEvent> readPlainLine(std::string_view line) {
  constexpr std::size_t kUsualEntries = 4;
  PlainScanner scanner(line);
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
