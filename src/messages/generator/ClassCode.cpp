#include "messages/generator/ClassCode.h"

#include <algorithm>
#include <cstdlib>
#include <iostream>
#include <set>
#include <vector>

#include "messages/generator/Comments.h"
#include "messages/generator/FieldCode.h"
#include "messages/generator/Layout.h"
#include "messages/generator/Names.h"

namespace qel::generator {
namespace {

using google::protobuf::Descriptor;
using google::protobuf::EnumDescriptor;
using google::protobuf::FieldDescriptor;
using google::protobuf::FileDescriptor;
using google::protobuf::io::Printer;

// Messages of the file, those that others hold before those others.
class HoldersLast {
 public:
  explicit HoldersLast(const FileDescriptor& file) : _file(file) {
    for (int i = 0; i < file.message_type_count(); ++i) visit(*file.message_type(i));
  }
  const std::vector<const Descriptor*>& messages() const { return _messages; }

 private:
  void visit(const Descriptor& message) {
    if (message.file() != &_file || !_seen.insert(&message).second) return;
    for (int i = 0; i < message.field_count(); ++i) {
      const FieldDescriptor& field = *message.field(i);
      if (field.message_type()) visit(*field.message_type());
    }
    _messages.push_back(&message);
  }

  const FileDescriptor& _file;
  std::set<const Descriptor*> _seen;
  std::vector<const Descriptor*> _messages;
};

// Text that is already whole lines, each with the printer's indent in front.
void printLines(Printer& printer, std::string_view text) {
  while (!text.empty()) {
    const auto end = text.find('\n');
    printer.Print("$line$\n", "line", std::string(text.substr(0, end)));
    text.remove_prefix(end + 1);
  }
}

void printEnum(Printer& printer, const EnumDescriptor& enumeration) {
  std::vector<const google::protobuf::EnumValueDescriptor*> values;
  for (int i = 0; i < enumeration.value_count(); ++i) values.push_back(enumeration.value(i));
  std::ranges::sort(values, {}, [](const auto* value) { return value->number(); });
  printLines(printer, commentOf(enumeration));
  printer.Print("inline constexpr EnumName $table$[] = {\n", "table", namesTable(enumeration));
  for (const auto* value : values) {
    printer.Print("    {$number$, \"$name$\"},\n", "number", std::to_string(value->number()),
                  "name", value->name());
  }
  printer.Print("};\n\n");
}

void printMessage(Printer& printer, const Descriptor& message) {
  const PresenceBits bits = presenceBits(message);
  std::vector<FieldCode> fields;
  for (int i = 0; i < message.field_count(); ++i) {
    if (i > 0 && message.field(i)->number() < message.field(i - 1)->number()) {
      std::cerr << message.full_name() << ": fields must stand in ascending number\n";
      std::exit(EXIT_FAILURE);
    }
    fields.push_back(fieldCode(*message.field(i), bits));
  }
  const std::map<std::string, std::string> variables = {{"Message", message.name()},
                                                        {"scalars", std::to_string(bits.size())}};

  printLines(printer, commentOf(message));
  printLines(printer, classHeadLines(message.name(), "PBMessage<" + message.name() + ">"));
  printer.Print(variables,
                " public:\n"
                "  static constexpr std::string_view kClassName = \"$Message$\";\n\n");
  printer.Indent();
  for (const FieldCode& field : fields) {
    printLines(printer, field.accessors);
    printer.Print("\n");
  }
  printer.Outdent();
  printer.Print(
      " private:\n"
      "  friend struct Presence;\n\n");
  printer.Indent();
  for (const FieldCode& field : fields) printLines(printer, field.member);
  if (!bits.empty()) printer.Print(variables, "PresenceWord<$scalars$> _has = 0;\n");
  printer.Outdent();
  printer.Print(
      "\n public:\n  template <class Self>\n  static constexpr auto kFields = std::tuple{\n");
  printer.Indent();
  printer.Indent();
  printer.Indent();
  for (const FieldCode& field : fields) printLines(printer, field.tableRow);
  printer.Outdent();
  printer.Outdent();
  printer.Outdent();
  printer.Print(variables, "  };\n};\n\nextern template class PBMessage<$Message$>;\n\n");
}

}  // namespace

void printHeader(Printer& printer, const FileDescriptor& file) {
  printer.Print(
      "// Made from $file$ by the message generator; changes belong there.\n"
      "#pragma once\n\n",
      "file", file.name());
  for (int i = 0; i < file.dependency_count(); ++i) {
    const FileDescriptor& used = *file.dependency(i);
    const bool ofOptions = used.extension_count() > 0;
    if (!ofOptions && used.message_type_count() + used.enum_type_count() > 0) {
      printer.Print("#include \"messages/$stem$.h\"\n", "stem", stem(used));
    }
  }
  printer.Print("#include \"messages/runtime/PBMessage.h\"\n\nnamespace qel {\n\n");
  for (int i = 0; i < file.enum_type_count(); ++i) printEnum(printer, *file.enum_type(i));
  const HoldersLast ordered(file);
  for (const Descriptor* message : ordered.messages()) {
    for (int i = 0; i < message->enum_type_count(); ++i) printEnum(printer, *message->enum_type(i));
    printMessage(printer, *message);
  }
  printer.Print("}  // namespace qel\n");
}

void printSource(Printer& printer, const FileDescriptor& file) {
  printer.Print(
      "// Made from $file$ by the message generator; changes belong there.\n"
      "#include \"messages/$stem$.h\"\n\n"
      "#include \"messages/runtime/PBMessage.inl\"\n\n"
      "namespace qel {\n\n",
      "file", file.name(), "stem", stem(file));
  for (int i = 0; i < file.message_type_count(); ++i) {
    printer.Print("template class PBMessage<$Message$>;\n", "Message",
                  file.message_type(i)->name());
  }
  printer.Print("\n}  // namespace qel\n");
}

}  // namespace qel::generator
