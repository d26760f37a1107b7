#include "fuzz/support/Input.h"

#include <algorithm>
#include <array>
#include <bit>

#include "tesk/Constants.h"

namespace qel::fuzz {
namespace {

constexpr int kDeepest = 4;
constexpr std::size_t kMostElements = 16;

constexpr std::array<std::string_view, 11> kUsualKeys = {tesk::kKeyAppID,
                                                         tesk::kKeyPayload,
                                                         tesk::kKeyPayloadType,
                                                         tesk::kKeyTriggerRef,
                                                         tesk::kKeyTriggerType,
                                                         tesk::kKeyTriggerID,
                                                         tesk::kKeyProfileID,
                                                         tesk::kKeyMetricID,
                                                         "time_ms",
                                                         "event",
                                                         "timestamp"};

}  // namespace

std::span<const std::string_view> usualKeys() { return kUsualKeys; }

Bytes Input::piece() {
  const std::size_t wanted = number<std::uint16_t>();
  const std::size_t size = std::min(wanted, _left.size());
  Bytes piece(_left.begin(), _left.begin() + static_cast<std::ptrdiff_t>(size));
  _left = _left.subspan(size);
  return piece;
}

Bytes Input::rest() {
  Bytes rest(_left.begin(), _left.end());
  _left = {};
  return rest;
}

std::string Input::text() { return std::string(textOf(piece())); }

std::string Input::plainText() {
  std::string plain = text();
  for (char& c : plain) {
    if (c < ' ' || c > '~') c = static_cast<char>('0' + (static_cast<unsigned char>(c) % 10));
  }
  return plain;
}

std::string Input::key() {
  const std::size_t which = byte();
  return which < kUsualKeys.size() ? std::string(kUsualKeys[which]) : text();
}

Value Input::value() { return valueAt(0); }
Dictionary Input::entries() { return entriesAt(0); }

Value Input::valueAt(int depth) {
  using Kind = Value::Kind;
  constexpr std::size_t kKinds = static_cast<std::size_t>(Kind::dictionary) + 1;
  switch (static_cast<Kind>(below(kKinds))) {
    case Kind::null:
      return {};
    case Kind::boolean:
      return (byte() & 1) != 0;
    case Kind::signedInteger:
      return static_cast<std::int64_t>(number<std::uint64_t>());
    case Kind::unsignedInteger:
      return number<std::uint64_t>();
    case Kind::floating:
      return std::bit_cast<float>(number<std::uint32_t>());
    case Kind::text:
      return text();
    case Kind::bytes:
      return piece();
    case Kind::list: {
      List list;
      if (depth == kDeepest) return list;
      for (std::size_t left = below(kMostElements); left > 0; --left) {
        list.push_back(valueAt(depth + 1));
      }
      return list;
    }
    case Kind::dictionary:
      return entriesAt(depth + 1);
  }
  return {};
}

Dictionary Input::entriesAt(int depth) {
  Dictionary entries;
  if (depth > kDeepest) return entries;
  for (std::size_t left = below(kMostElements); left > 0; --left) {
    std::string key = this->key();
    entries.set(std::string_view(key), valueAt(depth));
  }
  return entries;
}

}  // namespace qel::fuzz
