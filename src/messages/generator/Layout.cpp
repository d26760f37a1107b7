#include "messages/generator/Layout.h"

namespace qel::generator {
namespace {

constexpr std::size_t kColumns = 100;

}  // namespace

std::string classHeadLines(const std::string& name, const std::string& base) {
  const std::string line = "class " + name + " final : public " + base + " {\n";
  if (line.size() - 1 <= kColumns) return line;
  return "class " + name + " final\n    : public " + base + " {\n";
}

std::string functionLines(std::string_view head, std::string_view body, std::size_t indent) {
  std::string line;
  line.append(head).append(" { ").append(body).append(" }\n");
  const bool oneStatement = body.find('\n') == std::string_view::npos;
  if (oneStatement && indent + line.size() - 1 <= kColumns) return line;
  std::string lines;
  lines.append(head).append(" {\n  ").append(body).append("\n}\n");
  return lines;
}

std::string rowLines(std::string_view head, const std::vector<std::string>& values,
                     std::size_t indent) {
  std::string line;
  for (const std::string& value : values) {
    if (!line.empty()) line += ", ";
    line += value;
  }
  line += "},\n";
  const std::string opening = std::string(head) + "{";
  if (indent + opening.size() + line.size() - 1 <= kColumns) return opening + line;

  constexpr std::string_view kContinuation = "    ";
  std::string lines = opening + '\n';
  std::string current(kContinuation);
  for (std::size_t i = 0; i < values.size(); ++i) {
    const std::string piece = values[i] + (i + 1 < values.size() ? "," : "},");
    const bool first = current.size() == kContinuation.size();
    if (!first && indent + current.size() + 1 + piece.size() > kColumns) {
      lines += current + '\n';
      current = kContinuation;
    } else if (!first) {
      current += ' ';
    }
    current += piece;
  }
  return lines + current + '\n';
}

}  // namespace qel::generator
