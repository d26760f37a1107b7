// How generated code is laid out: within 100 columns, as the formatter would have it.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace qel::generator {

// "class Name final : public Base {", its base on a line of its own when it does not fit.
std::string classHeadLines(const std::string& name, const std::string& base);

// A function on one line, "head { body }", or with the body on lines of its own when that does not
// fit behind the indent or the body is longer than a line.
std::string functionLines(std::string_view head, std::string_view body, std::size_t indent);

// An initialiser of a table, "head{a, b, c},", on as few lines as fit behind the indent.
std::string rowLines(std::string_view head, const std::vector<std::string>& values,
                     std::size_t indent);

}  // namespace qel::generator
