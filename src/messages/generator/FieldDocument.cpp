#include "messages/generator/FieldDocument.h"

#include "messages/generator/Comments.h"
#include "messages/generator/Facts.h"
#include "messages/generator/Names.h"

namespace qel::generator {
namespace {

using google::protobuf::Descriptor;
using google::protobuf::EnumDescriptor;
using google::protobuf::FieldDescriptor;
using google::protobuf::FileDescriptor;

constexpr std::string_view kHead =
    "# Messages and their fields\n"
    "\n"
    "Made from `src/messages/schemas` by the message generator; change the schemas and run\n"
    "`cmake --build BUILD --target update-fields-document`. What the columns mean:\n"
    "\n"
    "- **No.**: the field number on the wire.\n"
    "- **Key**: the field's key in the dictionary form.\n"
    "- **Label**: what the field sheet calls it.\n"
    "- **Accessor**: the name of the getter, from which the other accessors are made.\n"
    "- **Type**: how the value is encoded. All integers are varints, those of `sint32` "
    "ZigZag-coded;\n"
    "  an enumeration travels as an `int32`.\n"
    "- **Repeated**: `packed` for a packed run of values, `list` for one field an element.\n"
    "- **Shown in**: the unit in which the tables show it.\n"
    "- **Travels as**: how it stands in the payload, where the tables show something else.\n"
    "- **Range**: of the values as they are shown.\n"
    "\n"
    "Numbers such as \"36.331, clause 5.3\" name the 3GPP TS of that number.\n";

std::string nameOf(const EnumDescriptor& enumeration) {
  const Descriptor* holder = enumeration.containing_type();
  return holder ? holder->name() + '.' + enumeration.name() : enumeration.name();
}

std::string typeOf(const FieldDescriptor& field) {
  if (field.enum_type()) return "enum " + nameOf(*field.enum_type());
  if (field.message_type()) return "message " + field.message_type()->name();
  return field.type_name();
}

std::string_view repetitionOf(const FieldDescriptor& field) {
  if (!field.is_repeated()) return "";
  return field.is_packed() ? "packed" : "list";
}

// Text for a cell of a table.
std::string cell(std::string_view text) {
  std::string out;
  for (const char c : text) {
    if (c == '|') out += '\\';
    out += c == '\n' ? ' ' : c;
  }
  return out;
}

// Text with each paragraph set apart.
std::string paragraphs(std::string_view text) {
  std::string out;
  for (const char c : text) {
    out += c;
    if (c == '\n') out += '\n';
  }
  return out;
}

std::string row(std::initializer_list<std::string_view> cells) {
  std::string out = "|";
  for (const std::string_view text : cells) {
    out += ' ';
    out += cell(text);
    out += text.empty() ? "|" : " |";
  }
  return out + '\n';
}

std::string code(std::string_view text) {
  std::string out = "`";
  out += text;
  return out + '`';
}

// "Metric 19972."
std::string metricText(const Descriptor& message) {
  const unsigned metric = metricOf(message);
  return metric == 0 ? "Only inside other messages. " : "Metric " + std::to_string(metric) + ". ";
}

std::string messageSection(const Descriptor& message) {
  std::string out = "\n### " + message.name() + "\n\n";
  out += metricText(message) + paragraphs(textOf(message)) + "\n\n";
  out +=
      "| No. | Key | Label | Accessor | Type | Repeated | Shown in | Travels as | Range | Meaning "
      "|\n"
      "|---|---|---|---|---|---|---|---|---|---|\n";
  for (int i = 0; i < message.field_count(); ++i) {
    const FieldDescriptor& field = *message.field(i);
    const Facts facts = factsOf(field);
    out += row({std::to_string(field.number()), code(field.name()), facts.label,
                code(propertyName(field)), typeOf(field), repetitionOf(field), facts.unit,
                facts.raw, rangeText(facts), textOf(field)});
  }
  return out;
}

std::string enumSection(const EnumDescriptor& enumeration) {
  std::string out = "\n### enum " + nameOf(enumeration) + "\n\n";
  out += paragraphs(textOf(enumeration)) + "\n\n| Value | Name | Meaning |\n|---|---|---|\n";
  for (int i = 0; i < enumeration.value_count(); ++i) {
    const auto& value = *enumeration.value(i);
    out += row({std::to_string(value.number()), code(value.name()), textOf(value)});
  }
  return out;
}

std::string schemaSection(const FileDescriptor& schema) {
  std::string out =
      "\n## " + schema.name() + "\n\n" + paragraphs(commentText(headOf(schema))) + '\n';
  for (int i = 0; i < schema.message_type_count(); ++i) {
    const Descriptor& message = *schema.message_type(i);
    out += messageSection(message);
    for (int k = 0; k < message.enum_type_count(); ++k) out += enumSection(*message.enum_type(k));
  }
  for (int i = 0; i < schema.enum_type_count(); ++i) out += enumSection(*schema.enum_type(i));
  return out;
}

}  // namespace

std::string fieldDocument(const std::vector<const FileDescriptor*>& schemas) {
  std::string out(kHead);
  for (const FileDescriptor* schema : schemas) out += schemaSection(*schema);
  return out;
}

}  // namespace qel::generator
