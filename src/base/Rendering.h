// The one rendering of values as text, for log lines, screens and JSON alike.
#pragma once

#include <string>
#include <string_view>

#include "base/Value.h"

namespace qel {

class LineBuffer;

// As JSON, one line, ", " and ": " as separators, keys in dictionary order. Floats are the shortest
// decimal text that reads back to the same float, always with a point; bytes are "<0a1b2c>";
// text that is not UTF-8 carries U+FFFD instead. A float that is no number is null.
void appendJson(std::string& out, const Value& value);
void appendJson(std::string& out, const Dictionary& dictionary);
void appendJson(LineBuffer& out, const Dictionary& dictionary);
std::string jsonText(const Value& value);
std::string jsonText(const Dictionary& dictionary);
void appendJsonString(std::string& out, std::string_view text);

// As a screen's cell shows it: text as it stands, bytes without quotes, a boolean as 1 or 0,
// everything else as in JSON.
std::string cellText(const Value& value);

}  // namespace qel
