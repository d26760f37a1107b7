// An array, as the database reads it.
#pragma once

#include <string>
#include <string_view>

namespace qel::fleet {

class ArrayText {
 public:
  void add(std::string_view text) {
    begin();
    _text += '"';
    for (const char c : text) {
      if (c == '"' || c == '\\') _text += '\\';
      _text += c;
    }
    _text += '"';
  }
  void addNull() {
    begin();
    _text += "NULL";
  }
  std::string text() const { return _text.empty() ? "{}" : _text + '}'; }

 private:
  void begin() { _text += _text.empty() ? '{' : ','; }

  std::string _text;
};

}  // namespace qel::fleet
