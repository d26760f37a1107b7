#include "rrc/generator/Code.h"

namespace qel::rrc::generator {
namespace {

constexpr const char* kKinds[] = {"null",       "boolean", "integer",  "bits",   "octets",
                                  "enumerated", "list",    "sequence", "choice", "stop"};

std::string number(std::int64_t value) {
  return value == kNoNumber ? "kNoNumber" : std::to_string(value);
}

std::string index(TypeIndex index) {
  if (index == TypeIndex::none) return "TypeIndex::none";
  return "TypeIndex{" + std::to_string(static_cast<unsigned>(index)) + "}";
}

std::string truth(bool value) { return value ? "true" : "false"; }

std::string typeRow(const Type& type) {
  return "{Kind::" + std::string(kKinds[static_cast<std::size_t>(type.kind)]) + ", " +
         truth(type.extensible) + ", " + truth(type.unbounded) + ", " + number(type.low) + ", " +
         number(type.high) + ", " + index(type.content) + ", " + std::to_string(type.first) + ", " +
         std::to_string(type.count) + ", " + std::to_string(type.additions) + "}";
}

std::string fieldRow(const Field& field) {
  return "{" + index(field.type) + ", Mark{" + std::to_string(static_cast<unsigned>(field.mark)) +
         "}, " + truth(field.optional) + "}";
}

// A table is never empty: an array of nothing is no C++.
template <class Rows, class Text>
std::string table(const std::string& type, const std::string& name, const Rows& rows, Text&& text) {
  std::string code = "constexpr " + type + " " + name + "[] = {\n";
  for (const auto& row : rows) code += "    " + text(row) + ",\n";
  if (rows.empty()) code += "    {},\n";
  return code + "};\n";
}

}  // namespace

std::string headerCode(const Tables& tables, const std::string& name) {
  std::string code = "// Made from the schemas in src/rrc/schemas/" + name +
                     "; changes are made there.\n#pragma once\n\n#include \"rrc/reader/Schema.h\"\n"
                     "\nnamespace qel::rrc::" +
                     name + " {\n\nconst Schema& schema();\n\nnamespace type {\n";
  for (const auto& [message, type] : tables.messages) {
    code += "inline constexpr TypeIndex " + identifier(message) + "{" +
            std::to_string(static_cast<unsigned>(type)) + "};\n";
  }
  code += "}  // namespace type\n\nnamespace mark {\n";
  auto mark = static_cast<unsigned>(Mark::first);
  for (const std::string& field : tables.markNames) {
    code += "inline constexpr Mark " + identifier(field) + "{" + std::to_string(mark++) + "};\n";
  }
  return code + "}  // namespace mark\n\n}  // namespace qel::rrc::" + name + "\n";
}

std::string sourceCode(const Tables& tables, const std::string& name) {
  return "#include \"rrc/" + name + "_schema.h\"\n\nnamespace qel::rrc::" + name +
         " {\nnamespace {\n\n" + table("Type", "kTypes", tables.types, typeRow) + "\n" +
         table("Field", "kFields", tables.fields, fieldRow) + "\n" +
         table("std::int64_t", "kNumbers", tables.numbers, number) +
         "\nconstexpr Schema kSchema{kTypes, kFields, kNumbers};\n\n}  // namespace\n\n"
         "const Schema& schema() { return kSchema; }\n\n}  // namespace qel::rrc::" +
         name + "\n";
}

}  // namespace qel::rrc::generator
