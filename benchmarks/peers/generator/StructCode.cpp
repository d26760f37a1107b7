#include "StructCode.h"

#include <cstdlib>
#include <iostream>
#include <map>
#include <string>

namespace qel::bench::generator {
namespace {

using google::protobuf::Descriptor;
using google::protobuf::EnumDescriptor;
using google::protobuf::FieldDescriptor;
using google::protobuf::io::Printer;

[[noreturn]] void refuse(const FieldDescriptor& field) {
  std::cerr << field.full_name() << ": no metric message has such a field\n";
  std::exit(EXIT_FAILURE);
}

// What a number is called in C++ and in protozero; texts and bytes are std::string.
struct Kind {
  const char* cpp;
  const char* wire;
  const char* text;  // what appends it to the line, but for the value
};

Kind kindOf(const FieldDescriptor& field) {
  switch (field.type()) {
    case FieldDescriptor::TYPE_UINT32:
      return {"std::uint32_t", "uint32", "out.number("};
    case FieldDescriptor::TYPE_UINT64:
      return {"std::uint64_t", "uint64", "out.number("};
    case FieldDescriptor::TYPE_SINT32:
      return {"std::int32_t", "sint32", "out.number("};
    case FieldDescriptor::TYPE_BOOL:
      return {"bool", "bool", "truth(out, "};
    case FieldDescriptor::TYPE_ENUM:
      return {"std::int32_t", "enum", ""};
    case FieldDescriptor::TYPE_STRING:
      return {"std::string", "string", "quoted(out, "};
    case FieldDescriptor::TYPE_BYTES:
      return {"std::string", "bytes", "hexadecimal(out, "};
    default:
      refuse(field);
  }
}

std::string typeOf(const FieldDescriptor& field) {
  return field.message_type() ? field.message_type()->name() : kindOf(field).cpp;
}

using Variables = std::map<std::string, std::string>;

Variables variablesOf(const FieldDescriptor& field) {
  Variables variables = {
      {"field", field.name()}, {"tag", std::to_string(field.number())}, {"type", typeOf(field)}};
  if (!field.message_type()) {
    const Kind kind = kindOf(field);
    const bool isText = field.cpp_type() == FieldDescriptor::CPPTYPE_STRING;
    variables["wire"] = kind.wire;
    variables["text"] = kind.text;
    variables["form"] = isText || field.is_packed() ? "kLength" : "kVarint";
  }
  return variables;
}

template <class Print>
void forEachField(const Descriptor& message, const Print& print) {
  for (int i = 0; i < message.field_count(); ++i) print(*message.field(i));
}

void printRead(Printer& printer, const FieldDescriptor& field) {
  const Variables variables = variablesOf(field);
  if (field.message_type()) {
    printer.Print(variables, "case tag_and_type($tag$, kLength):\n");
    printer.Print(variables, field.is_repeated()
                                 ? "  read(reader.get_message(), another(message.$field$));\n"
                                 : "  read(reader.get_message(), made(message.$field$));\n");
  } else {
    printer.Print(variables, "case tag_and_type($tag$, $form$):\n");
    if (field.is_packed()) {
      printer.Print(variables, "  addAll(reader.get_packed_$wire$(), message.$field$);\n");
    } else if (field.is_repeated()) {
      refuse(field);
    } else {
      printer.Print(variables, "  message.$field$ = reader.get_$wire$();\n");
    }
  }
  printer.Print("  break;\n");
}

void printReads(Printer& printer, const Descriptor& message) {
  printer.Print("while (reader.next()) {\n  switch (reader.tag_and_type()) {\n");
  printer.Indent();
  printer.Indent();
  forEachField(message, [&](const FieldDescriptor& field) { printRead(printer, field); });
  printer.Print("default:\n  reader.skip();\n");
  printer.Outdent();
  printer.Outdent();
  printer.Print("  }\n}\n");
}

void printWrite(Printer& printer, const FieldDescriptor& field) {
  const char* text = "if (message.$field$) writer.add_$wire$($tag$, *message.$field$);\n";
  if (field.is_packed()) {
    text = "writer.add_packed_$wire$($tag$, message.$field$.begin(), message.$field$.end());\n";
  } else if (field.is_repeated()) {
    text = "for (const auto& each : message.$field$) write(each, {writer, $tag$});\n";
  } else if (field.message_type()) {
    text = "if (message.$field$) write(*message.$field$, {writer, $tag$});\n";
  }
  printer.Print(variablesOf(field), text);
}

void printName(Printer& printer, const FieldDescriptor& field) {
  printer.Print(
      "if (message.$field$) {\n  out.literal(\"\\\"$field$\\\": \");\n"
      "  switch (*message.$field$) {\n",
      "field", field.name());
  const EnumDescriptor& values = *field.enum_type();
  for (int i = 0; i < values.value_count(); ++i) {
    if (values.FindValueByNumber(values.value(i)->number()) != values.value(i)) continue;
    printer.Print("    case $number$:\n      out.literal(\"\\\"$name$\\\", \");\n      break;\n",
                  "number", std::to_string(values.value(i)->number()), "name",
                  values.value(i)->name());
  }
  printer.Print("    default:\n      unknown(out, *message.$field$);\n  }\n}\n", "field",
                field.name());
}

void printText(Printer& printer, const FieldDescriptor& field) {
  const Variables variables = variablesOf(field);
  if (field.type() == FieldDescriptor::TYPE_ENUM) return printName(printer, field);
  printer.Print(variables, field.is_repeated() ? "if (!message.$field$.empty()) {\n"
                                               : "if (message.$field$) {\n");
  printer.Print(variables, "  out.literal(\"\\\"$field$\\\": \");\n");
  if (field.is_repeated()) {
    printer.Print(variables,
                  "  out.literal(\"[\");\n  for (const auto& each : message.$field$) {\n");
    printer.Print(variables,
                  field.message_type() ? "    appendText(each, out);\n" : "    $text$each);\n");
    printer.Print("  }\n  close(out, \"], \");\n");
  } else if (field.message_type()) {
    printer.Print(variables, "  appendText(*message.$field$, out);\n");
  } else {
    printer.Print(variables, "  $text$*message.$field$);\n");
  }
  printer.Print("}\n");
}

void printTexts(Printer& printer, const Descriptor& message, const FieldDescriptor* leftOut) {
  forEachField(message, [&](const FieldDescriptor& field) {
    if (&field != leftOut) printText(printer, field);
  });
  printer.Print("close(out, \"$end$\");\n", "end", leftOut ? "}" : "}, ");
}

// How a value is turned into the number that is written.
const char* numberOf(const FieldDescriptor& field) {
  switch (field.type()) {
    case FieldDescriptor::TYPE_SINT32:
      return "zigzag";
    case FieldDescriptor::TYPE_ENUM:
      return "extended";
    default:
      return "plainly";
  }
}

Variables sizedVariablesOf(const FieldDescriptor& field) {
  Variables variables = variablesOf(field);
  const bool isNumber =
      !field.message_type() && field.cpp_type() != FieldDescriptor::CPPTYPE_STRING;
  const int wire = isNumber && !field.is_packed() ? 0 : 2;
  const int key = field.number() << 3 | wire;
  variables["key"] = std::to_string(key);
  variables["keySize"] = std::to_string(key < 128 ? 1 : 2);
  variables["of"] = field.is_repeated() ? "each" : "*message." + field.name();
  variables["number"] = numberOf(field);
  return variables;
}

// `number` is for what stands there as a number, `held` for what has a length in front.
void printSized(Printer& printer, const FieldDescriptor& field, const char* number,
                const char* held) {
  const Variables variables = sizedVariablesOf(field);
  if (field.is_packed()) {
    printer.Print(variables,
                  "if (!message.$field$.empty()) {\n"
                  "  std::size_t length = 0;\n"
                  "  for (const auto each : message.$field$) "
                  "length += sizeOf($number$(each));\n");
    printer.Print(variables, held);
    printer.Print("}\n");
    return;
  }
  printer.Print(variables, field.is_repeated() ? "for (const auto& each : message.$field$) {\n"
                                               : "if (message.$field$) {\n");
  if (field.message_type() || field.cpp_type() == FieldDescriptor::CPPTYPE_STRING) {
    printer.Print(variables, "  const std::size_t length = lengthOf($of$);\n");
    printer.Print(variables, held);
  } else {
    printer.Print(variables, number);
  }
  printer.Print("}\n");
}

void printLengthOf(Printer& printer, const Descriptor& message) {
  printer.Print("std::size_t size = 0;\n");
  forEachField(message, [&](const FieldDescriptor& field) {
    printSized(printer, field, "  size += $keySize$ + sizeOf($number$($of$));\n",
               "  size += $keySize$ + sizeOf(length) + length;\n");
  });
  printer.Print("return size;\n");
}

void printPut(Printer& printer, const Descriptor& message) {
  forEachField(message, [&](const FieldDescriptor& field) {
    printSized(printer, field, "  at = put(put(at, $key$), $number$($of$));\n",
               field.is_packed()
                   ? "  at = put(put(at, $key$), length);\n"
                     "  for (const auto each : message.$field$) at = put(at, $number$(each));\n"
                   : "  at = put(put(put(at, $key$), length), $of$);\n");
  });
  printer.Print("return at;\n");
}

template <class Print>
void printFunction(Printer& printer, const std::string& head, const Print& print) {
  printer.Print("$head$ {\n", "head", head);
  printer.Indent();
  print();
  printer.Outdent();
  printer.Print("}\n\n");
}

void printSizedOperations(Printer& printer, const Descriptor& message) {
  const std::string& name = message.name();
  printFunction(printer, "std::size_t lengthOf(const " + name + "& message)",
                [&] { printLengthOf(printer, message); });
  printFunction(printer, "char* put(char* at, const " + name + "& message)",
                [&] { printPut(printer, message); });
}

}  // namespace

void printStruct(Printer& printer, const Descriptor& message) {
  printer.Print("struct $Message$ {\n", "Message", message.name());
  forEachField(message, [&](const FieldDescriptor& field) {
    printer.Print(variablesOf(field), field.is_repeated() ? "  std::vector<$type$> $field$;\n"
                                                          : "  std::optional<$type$> $field$;\n");
  });
  printer.Print("};\n\n");
}

void printHeldOperations(Printer& printer, const Descriptor& message) {
  const std::string& name = message.name();
  printSizedOperations(printer, message);
  printFunction(printer, "void read(pbf_reader reader, " + name + "& message)",
                [&] { printReads(printer, message); });
  printFunction(printer, "void write(const " + name + "& message, pbf_writer writer)", [&] {
    forEachField(message, [&](const FieldDescriptor& field) { printWrite(printer, field); });
  });
  printFunction(printer, "void appendText(const " + name + "& message, Line& out)", [&] {
    printer.Print("out.literal(\"{\");\n");
    printTexts(printer, message, nullptr);
  });
}

void printMetricOperations(Printer& printer, const Descriptor& message) {
  const std::string& name = message.name();
  const FieldDescriptor& first = *message.field(0);
  if (first.name() != "timestamp") refuse(first);
  printer.Print("namespace {\n\n");
  printSizedOperations(printer, message);
  printer.Print("}  // namespace\n\n");
  printFunction(printer, "void writeSized(const " + name + "& message, std::string& out)", [&] {
    printer.Print("out.resize(lengthOf(message));\nput(out.data(), message);\n");
  });
  printFunction(printer, "void read(std::string_view data, " + name + "& message)", [&] {
    printer.Print("pbf_reader reader(data.data(), data.size());\n");
    printReads(printer, message);
  });
  printFunction(printer, "void clear(" + name + "& message)", [&] {
    forEachField(message, [&](const FieldDescriptor& field) {
      printer.Print(
          field.is_repeated() ? "message.$field$.clear();\n" : "message.$field$.reset();\n",
          "field", field.name());
    });
  });
  printFunction(printer, "void write(const " + name + "& message, std::string& out)", [&] {
    printer.Print("pbf_writer writer(out);\n");
    forEachField(message, [&](const FieldDescriptor& field) { printWrite(printer, field); });
  });
  printFunction(printer,
                "void appendText(const " + name + "& message, std::string_view time, Line& out)",
                [&] {
                  printer.Print("out.literal(\"{\");\nappendTime(out, message.timestamp, time);\n");
                  printTexts(printer, message, &first);
                });
}

}  // namespace qel::bench::generator
