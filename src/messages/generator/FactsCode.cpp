#include "messages/generator/FactsCode.h"

#include <algorithm>

#include "messages/generator/Comments.h"
#include "messages/generator/Facts.h"
#include "messages/generator/Names.h"

namespace qel::generator {
namespace {

using google::protobuf::Descriptor;
using google::protobuf::EnumDescriptor;
using google::protobuf::FieldDescriptor;
using google::protobuf::FileDescriptor;

std::string quoted(std::string_view text) {
  std::string out = "\"";
  for (const char c : text) {
    if (c == '"' || c == '\\') out += '\\';
    out += c == '\n' ? ' ' : c;
  }
  return out + '"';
}

// As a float is written in code: whole numbers with a point.
std::string floatText(double number) {
  std::string text = std::to_string(number);
  text.erase(text.find_last_not_of('0') + 1);
  return text + (text.back() == '.' ? "0F" : "F");
}

std::string orNothing(const std::optional<double>& number) {
  return number ? floatText(*number) : "std::nullopt";
}

std::string valuesName(const EnumDescriptor& type) { return namesTable(type) + "Meanings"; }

std::string valuesCode(const EnumDescriptor& type) {
  std::string out = "constexpr ValueMeaning " + valuesName(type) + "[] = {\n";
  for (int i = 0; i < type.value_count(); ++i) {
    const auto& value = *type.value(i);
    out += "    {" + std::to_string(value.number()) + ", " + quoted(value.name()) + ", " +
           quoted(meaningOf(textOf(value)).text) + "},\n";
  }
  return out + "};\n\n";
}

std::string scaleName(const std::string& quality) { return "kScale" + quality; }

std::string scaleCode(const Scale& scale) {
  std::string out = "constexpr QualityScale " + scaleName(scale.name) + " = {" +
                    quoted(scale.name) + ", " + quoted(scale.unit);
  for (const float number : {scale.lowest, scale.highest, scale.good, scale.fair}) {
    out += ", " + floatText(number);
  }
  return out + "};\n";
}

std::string fieldCode(const FieldDescriptor& field) {
  const Facts facts = factsOf(field);
  std::string out = "    {.number = " + std::to_string(field.number()) + ",\n";
  const auto member = [&out](std::string_view name, const std::string& value) {
    out.append("     .").append(name).append(" = ").append(value).append(",\n");
  };
  member("key", quoted(field.name()));
  member("label", quoted(facts.label));
  member("unit", quoted(facts.unit));
  member("raw", quoted(facts.raw));
  member("range", quoted(rangeText(facts)));
  member("meaning", quoted(facts.meaning.text));
  member("clause", quoted(facts.meaning.clause));
  member("least", orNothing(facts.least));
  member("most", orNothing(facts.most));
  member("form", "FieldForm::" + facts.form);
  member("quality", facts.quality.empty() ? "nullptr" : '&' + scaleName(facts.quality));
  member("repeated", field.is_repeated() ? "true" : "false");
  member("identifies", facts.identifies ? "true" : "false");
  member("holds", quoted(field.message_type() ? field.message_type()->name() : ""));
  member("values",
         field.enum_type() ? valuesName(*field.enum_type()) : "std::span<const ValueMeaning>{}");
  return out + "    },\n";
}

std::string messageFields(const Descriptor& message) {
  std::string out = "constexpr FieldFacts k" + message.name() + "[] = {\n";
  for (int i = 0; i < message.field_count(); ++i) out += fieldCode(*message.field(i));
  return out + "};\n\n";
}

std::string messageRow(const Descriptor& message) {
  return "    MessageFacts{" + quoted(message.name()) + ",\n                 " +
         quoted(meaningOf(textOf(message)).text) + ",\n                 " +
         std::to_string(metricOf(message)) + ", k" + message.name() + "},\n";
}

std::vector<const Descriptor*> messagesByName(const std::vector<const FileDescriptor*>& schemas) {
  std::vector<const Descriptor*> messages;
  for (const FileDescriptor* schema : schemas) {
    for (int i = 0; i < schema->message_type_count(); ++i) {
      messages.push_back(schema->message_type(i));
    }
  }
  std::ranges::sort(messages, {}, [](const Descriptor* message) { return message->name(); });
  return messages;
}

std::string enumerations(const std::vector<const FileDescriptor*>& schemas) {
  std::string out;
  for (const FileDescriptor* schema : schemas) {
    for (int i = 0; i < schema->enum_type_count(); ++i) out += valuesCode(*schema->enum_type(i));
    for (int i = 0; i < schema->message_type_count(); ++i) {
      const Descriptor& message = *schema->message_type(i);
      for (int k = 0; k < message.enum_type_count(); ++k) out += valuesCode(*message.enum_type(k));
    }
  }
  return out;
}

}  // namespace

std::string factsCode(const std::vector<const FileDescriptor*>& schemas) {
  std::string out =
      "// Made from the schemas by the message generator; changes belong there.\n"
      "#include \"messages/catalogue/FieldFacts.h\"\n\n"
      "#include <array>\n\n"
      "namespace qel {\nnamespace {\n\n";
  std::string scaleList;
  for (const Scale& scale : scales()) {
    out += scaleCode(scale);
    scaleList += (scaleList.empty() ? "&" : ", &") + scaleName(scale.name);
  }
  out += "constexpr std::array<const QualityScale*, " + std::to_string(scales().size()) +
         "> kScales = {" + scaleList + "};\n\n" + enumerations(schemas);
  std::string rows;
  for (const Descriptor* message : messagesByName(schemas)) {
    out += messageFields(*message);
    rows += messageRow(*message);
  }
  return out + "constexpr std::array kMessages = {\n" + rows +
         "};\n\n}  // namespace\n\n"
         "std::span<const MessageFacts> messageFacts() { return kMessages; }\n"
         "std::span<const QualityScale* const> qualityScales() { return kScales; }\n\n"
         "}  // namespace qel\n";
}

}  // namespace qel::generator
