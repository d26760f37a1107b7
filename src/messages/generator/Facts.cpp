#include "messages/generator/Facts.h"

#include <options.pb.h>

#include <cstdlib>
#include <iostream>

#include "messages/generator/Comments.h"
#include "messages/generator/Names.h"

namespace qel::generator {
namespace {

using google::protobuf::FieldDescriptor;

constexpr std::string_view kFormPrefix = "FORM_";
constexpr std::string_view kQualityPrefix = "QUALITY_";

std::string without(std::string_view prefix, std::string_view name) {
  return std::string(name.substr(prefix.size()));
}

// "FORM_UTRAN_CELL" → "utranCell".
std::string formName(std::string_view name) {
  std::string words;
  for (const char c : without(kFormPrefix, name)) {
    words += static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  }
  return camelCase(words);
}

// Where the field names no clause, the type or else the message that it stands in may.
std::string clauseAround(const FieldDescriptor& field) {
  if (field.enum_type()) return meaningOf(textOf(*field.enum_type())).clause;
  if (field.message_type()) return meaningOf(textOf(*field.message_type())).clause;
  return meaningOf(textOf(*field.containing_type())).clause;
}

std::string numberText(double number) {
  std::string text = std::to_string(number);
  text.erase(text.find_last_not_of('0') + 1);
  if (text.back() == '.') text.pop_back();
  return text;
}

}  // namespace

Meaning meaningOf(std::string_view comment) {
  Meaning meaning;
  while (!comment.empty()) {
    const auto open = comment.find('(');
    const auto close = comment.find(')', open);
    if (close == std::string_view::npos) break;
    const std::string_view inside = comment.substr(open + 1, close - open - 1);
    if (inside.find("clause") == std::string_view::npos) {
      meaning.text += comment.substr(0, close + 1);
    } else {
      meaning.text += comment.substr(0, open);
      while (meaning.text.ends_with(' ')) meaning.text.pop_back();
      if (!meaning.clause.empty()) meaning.clause += "; ";
      meaning.clause += inside;
    }
    comment.remove_prefix(close + 1);
  }
  meaning.text += comment;
  return meaning;
}

Facts factsOf(const FieldDescriptor& field) {
  const auto& options = field.options();
  if (!options.HasExtension(qelwatch::schema::label)) {
    std::cerr << field.file()->name() << ": " << field.full_name() << ": has no label\n";
    std::exit(EXIT_FAILURE);
  }
  Facts facts;
  facts.meaning = meaningOf(textOf(field));
  if (facts.meaning.clause.empty()) facts.meaning.clause = clauseAround(field);
  facts.label = options.GetExtension(qelwatch::schema::label);
  facts.unit = options.GetExtension(qelwatch::schema::unit);
  facts.raw = options.GetExtension(qelwatch::schema::raw);
  if (options.HasExtension(qelwatch::schema::least)) {
    facts.least = options.GetExtension(qelwatch::schema::least);
  }
  if (options.HasExtension(qelwatch::schema::most)) {
    facts.most = options.GetExtension(qelwatch::schema::most);
  }
  facts.form = formName(Form_Name(options.GetExtension(qelwatch::schema::form)));
  if (const auto quality = options.GetExtension(qelwatch::schema::quality)) {
    facts.quality = without(kQualityPrefix, Quality_Name(quality));
  }
  facts.identifies = options.GetExtension(qelwatch::schema::identifies);
  return facts;
}

std::string rangeText(const Facts& facts) {
  const std::string unit = facts.unit.empty() ? "" : ' ' + facts.unit;
  if (facts.least && facts.most) {
    return numberText(*facts.least) + " to " + numberText(*facts.most) + unit;
  }
  if (facts.least) return "from " + numberText(*facts.least) + unit;
  if (facts.most) return "up to " + numberText(*facts.most) + unit;
  return {};
}

unsigned metricOf(const google::protobuf::Descriptor& message) {
  return message.options().GetExtension(qelwatch::schema::metric);
}

std::vector<Scale> scales() {
  std::vector<Scale> all;
  const auto& type = *qelwatch::schema::Quality_descriptor();
  for (int i = 0; i < type.value_count(); ++i) {
    const auto& value = *type.value(i);
    if (value.number() == qelwatch::schema::QUALITY_NONE) continue;
    const auto& options = value.options();
    all.push_back({.name = without(kQualityPrefix, value.name()),
                   .unit = options.GetExtension(qelwatch::schema::scale_unit),
                   .lowest = options.GetExtension(qelwatch::schema::lowest),
                   .highest = options.GetExtension(qelwatch::schema::highest),
                   .good = options.GetExtension(qelwatch::schema::good),
                   .fair = options.GetExtension(qelwatch::schema::fair)});
  }
  return all;
}

}  // namespace qel::generator
