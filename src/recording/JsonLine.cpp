#include "recording/JsonLine.h"

#include <cfloat>
#include <cmath>
#include <cstdint>
#include <nlohmann/json.hpp>
#include <utility>
#include <vector>

#include "base/Rendering.h"
#include "base/TerminalText.h"
#include "recording/LineLimits.h"

namespace qel {
namespace {

using Json = nlohmann::json;

// Numbers up to here round to a single-precision number that is finite.
constexpr double kLargestNumber = FLT_MAX * (1.0 + FLT_EPSILON / 4);

// Takes the parts of the line from the parser as they come. False ends the parsing.
class ObjectBuilder {
 public:
  bool null() { return add(Value()); }
  bool boolean(bool value) { return add(value); }
  bool number_integer(std::int64_t value) { return add(value); }
  bool number_unsigned(std::uint64_t value) { return add(value); }
  bool number_float(double value, const std::string& /*digits*/) {
    if (std::abs(value) > kLargestNumber) return refuseValue();
    return add(static_cast<float>(value));
  }
  bool string(const std::string& text) { return add(text); }
  bool binary(const Json::binary_t& /*bytes*/) { return refuseValue(); }

  bool start_object(std::size_t /*size*/) { return open(false); }
  bool start_array(std::size_t /*size*/) { return open(true); }
  bool key(const std::string& key) {
    Open& object = _open.back();
    if (object.dictionary.size() == kMostKeysOfAnObject) {
      return refuse("more than " + std::to_string(kMostKeysOfAnObject) + " keys in one object");
    }
    object.key = key;
    return true;
  }
  bool end_object() { return close(); }
  bool end_array() { return close(); }

  bool parse_error(std::size_t column, const std::string& /*token*/, const Json::exception& error) {
    constexpr int kNumberOutOfRange = 406;
    if (error.id == kNumberOutOfRange) return refuseValue();
    _fault = {false, "not JSON, column " + std::to_string(column)};
    return false;
  }

  std::variant<Dictionary, LineFault> result() {
    if (!_fault.reason.empty()) return std::move(_fault);
    if (!_isObject) return LineFault{true, "not a JSON object"};
    return std::move(_whole);
  }

 private:
  // An object or array whose end has not come yet.
  struct Open {
    bool isArray;
    List list;
    Dictionary dictionary;
    Text key;  // of the value that comes next
  };

  bool refuse(std::string reason) {
    _fault = {true, std::move(reason)};
    return false;
  }
  bool refuseValue() {
    if (_open.empty() || _open.front().isArray) return refuse("not a JSON object");
    return refuse(quoted(_open.front().key) + " is nested too deep or out of range");
  }

  bool open(bool isArray) {
    if (_open.size() == kDeepestNesting) return refuseValue();
    _open.push_back({isArray, {}, {}, {}});
    return true;
  }
  bool close() {
    Open closed = std::move(_open.back());
    _open.pop_back();
    if (!_open.empty()) {
      return closed.isArray ? add(std::move(closed.list)) : add(std::move(closed.dictionary));
    }
    _isObject = !closed.isArray;
    _whole = std::move(closed.dictionary);
    return true;
  }
  bool add(Value value) {
    if (++_values > kMostValuesOfALine) {
      return refuse("more than " + std::to_string(kMostValuesOfALine) + " values");
    }
    if (_open.empty()) return true;
    Open& parent = _open.back();
    if (parent.isArray) {
      parent.list.push_back(std::move(value));
    } else {
      parent.dictionary.set(std::move(parent.key), std::move(value));
    }
    return true;
  }

  std::vector<Open> _open;
  std::size_t _values = 0;
  Dictionary _whole;
  bool _isObject = false;
  LineFault _fault;
};

}  // namespace

std::string quoted(std::string_view text) {
  constexpr std::size_t kMostShown = 64;
  return forTerminal(jsonText(Value(text.substr(0, kMostShown)))) +
         (text.size() > kMostShown ? "..." : "");
}

std::variant<Dictionary, LineFault> parseJsonLine(std::string_view line) {
  if (line.find_first_not_of(" \t\r") == std::string_view::npos) {
    return LineFault{true, "empty line"};
  }
  ObjectBuilder builder;
  try {
    Json::sax_parse(line, &builder);
  } catch (const Json::exception& error) {
    return LineFault{true, forTerminal(error.what())};
  }
  return builder.result();
}

}  // namespace qel
