// protoc plugin: from the schemas, plain structs that protozero reads and writes, as one would
// write them by hand. All schemas go into one plain.h and plain.cpp, so that the compiler sees the
// whole; metrics.inc holds a row a metric.

#include <google/protobuf/compiler/code_generator.h>
#include <google/protobuf/compiler/plugin.h>
#include <google/protobuf/descriptor.h>
#include <google/protobuf/io/printer.h>
#include <google/protobuf/io/zero_copy_stream.h>
#include <options.pb.h>

#include <algorithm>
#include <memory>
#include <string>
#include <vector>

#include "StructCode.h"

namespace qel::bench::generator {
namespace {

using google::protobuf::Descriptor;
using google::protobuf::FileDescriptor;
using google::protobuf::compiler::CodeGenerator;
using google::protobuf::compiler::GeneratorContext;
using google::protobuf::io::Printer;

constexpr const char* kHead = "// Made from the schemas; changes belong there.\n";
constexpr const char* kHeaderHead =
    "#pragma once\n\n#include <cstdint>\n#include <optional>\n#include <string>\n"
    "#include <string_view>\n#include <vector>\n\n#include \"peers/Line.h\"\n\nnamespace "
    "qel::bench::plain {\n\n";
constexpr const char* kSourceHead =
    "#include \"plain.h\"\n\n#include \"peers/PlainCode.h\"\n\nnamespace qel::bench::plain {\n"
    "namespace {\n\nusing plain::lengthOf;\nusing plain::put;\n\n";
constexpr const char* kOperations =
    "// What is there lands on top of the message. Throws protozero::exception on damaged bytes.\n"
    "void read(std::string_view data, $Message$& message);\n"
    "void clear($Message$& message);\n"
    "// Appended to `out`.\n"
    "void write(const $Message$& message, std::string& out);\n"
    "// In place of `out`, without protozero: the lengths are counted first.\n"
    "void writeSized(const $Message$& message, std::string& out);\n"
    "// As JSON on one line, with `time` in place of the timestamp unless empty.\n"
    "void appendText(const $Message$& message, std::string_view time, Line& out);\n\n";

// Those that others hold before those others.
void addHoldersLast(const Descriptor& message, std::vector<const Descriptor*>& messages) {
  if (std::find(messages.begin(), messages.end(), &message) != messages.end()) return;
  for (int i = 0; i < message.field_count(); ++i) {
    if (const auto* held = message.field(i)->message_type()) addHoldersLast(*held, messages);
  }
  messages.push_back(&message);
}

class StructGenerator final : public CodeGenerator {
 public:
  bool GenerateAll(const std::vector<const FileDescriptor*>& schemas, const std::string&,
                   GeneratorContext* context, std::string*) const override {
    std::vector<const Descriptor*> messages;
    for (const FileDescriptor* schema : schemas) {
      for (int i = 0; i < schema->message_type_count(); ++i) {
        addHoldersLast(*schema->message_type(i), messages);
      }
    }
    printHeader(*context, messages);
    printSource(*context, messages);
    printMetrics(*context, messages);
    return true;
  }

  bool Generate(const FileDescriptor*, const std::string&, GeneratorContext*,
                std::string* error) const override {
    *error = "the schemas go in together";
    return false;
  }

 private:
  struct File {
    File(GeneratorContext& context, const char* name)
        : stream(context.Open(name)), printer(stream.get(), '$') {
      printer.PrintRaw(kHead);
    }
    std::unique_ptr<google::protobuf::io::ZeroCopyOutputStream> stream;
    Printer printer;
  };

  static unsigned metricOf(const Descriptor& message) {
    return message.options().GetExtension(qelwatch::schema::metric);
  }

  static void printHeader(GeneratorContext& context, const std::vector<const Descriptor*>& all) {
    File file(context, "plain.h");
    file.printer.PrintRaw(kHeaderHead);
    for (const Descriptor* message : all) printStruct(file.printer, *message);
    for (const Descriptor* message : all) {
      if (metricOf(*message)) file.printer.Print(kOperations, "Message", message->name());
    }
    file.printer.PrintRaw("}  // namespace qel::bench::plain\n");
  }

  static void printSource(GeneratorContext& context, const std::vector<const Descriptor*>& all) {
    File file(context, "plain.cpp");
    file.printer.PrintRaw(kSourceHead);
    for (const Descriptor* message : all) {
      if (!metricOf(*message)) printHeldOperations(file.printer, *message);
    }
    file.printer.PrintRaw("}  // namespace\n\n");
    for (const Descriptor* message : all) {
      if (metricOf(*message)) printMetricOperations(file.printer, *message);
    }
    file.printer.PrintRaw("}  // namespace qel::bench::plain\n");
  }

  static void printMetrics(GeneratorContext& context, const std::vector<const Descriptor*>& all) {
    File file(context, "metrics.inc");
    for (const Descriptor* message : all) {
      if (const unsigned metric = metricOf(*message)) {
        file.printer.Print("PEER($metric$, $Message$),\n", "metric", std::to_string(metric),
                           "Message", message->name());
      }
    }
  }
};

}  // namespace
}  // namespace qel::bench::generator

int main(int argc, char* argv[]) {
  const qel::bench::generator::StructGenerator generator;
  return google::protobuf::compiler::PluginMain(argc, argv, &generator);
}
