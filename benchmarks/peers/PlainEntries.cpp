#include "peers/PlainEntries.h"

#include <fmt/compile.h>
#include <fmt/format.h>

#include <algorithm>
#include <iterator>

namespace qel::bench {
namespace {

std::size_t visit(const PlainValue& value) {
  std::size_t kinds = value.is.index();
  if (const auto* nested = std::get_if<PlainEntries>(&value.is))
    return kinds + bench::visit(*nested);
  if (const auto* list = std::get_if<PlainList>(&value.is)) {
    for (const PlainValue& element : *list) kinds += visit(element);
  }
  return kinds;
}

class FmtWriter {
 public:
  explicit FmtWriter(std::string& out) : _out(out) {}

  void operator()(bool value) { _out += value ? "true" : "false"; }
  void operator()(std::int64_t value) { number(value); }
  void operator()(std::uint64_t value) { number(value); }
  void operator()(std::string_view name) {
    fmt::format_to(std::back_inserter(_out), FMT_COMPILE("\"{}\""), name);
  }
  void operator()(const std::string& text) {
    _out += '"';
    for (const char c : text) {
      if (c == '"' || c == '\\') {
        _out += '\\';
        _out += c;
      } else if (static_cast<unsigned char>(c) < 0x20) {
        fmt::format_to(std::back_inserter(_out), FMT_COMPILE("\\u{:04x}"), static_cast<int>(c));
      } else {
        _out += c;
      }
    }
    _out += '"';
  }
  void operator()(const Bytes& bytes) {
    _out += "\"<";
    for (const std::uint8_t byte : bytes) {
      fmt::format_to(std::back_inserter(_out), FMT_COMPILE("{:02x}"), byte);
    }
    _out += ">\"";
  }
  void operator()(const PlainList& list) {
    _out += '[';
    bool first = true;
    for (const PlainValue& value : list) {
      if (!first) _out += ", ";
      first = false;
      std::visit(*this, value.is);
    }
    _out += ']';
  }
  void operator()(const PlainEntries& entries) {
    _out += '{';
    bool first = true;
    for (const auto& [key, value] : entries) {
      if (!first) _out += ", ";
      first = false;
      fmt::format_to(std::back_inserter(_out), FMT_COMPILE("\"{}\": "), key);
      std::visit(*this, value.is);
    }
    _out += '}';
  }

 private:
  template <class Number>
  void number(Number value) {
    const fmt::format_int digits(value);
    _out.append(digits.data(), digits.size());
  }

  std::string& _out;
};

}  // namespace

std::size_t visit(const PlainEntries& entries) {
  std::size_t seen = 0;
  for (const auto& [key, value] : entries) seen += key.size() + visit(value);
  return seen;
}

PlainList& listOf(PlainEntries& entries, std::string_view key) {
  const auto found = std::find_if(entries.rbegin(), entries.rend(),
                                  [&](const PlainEntry& entry) { return entry.key == key; });
  if (found != entries.rend()) return std::get<PlainList>(found->value.is);
  auto& list = std::get<PlainList>(entries.emplace_back(PlainEntry{key, {PlainList()}}).value.is);
  list.reserve(4);
  return list;
}

void appendFmt(std::string& out, const PlainEntries& entries) { FmtWriter{out}(entries); }

}  // namespace qel::bench
