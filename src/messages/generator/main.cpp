// protoc plugin: from a schema, the message classes of this system. For each x.proto it writes x.h
// and x.cpp; the rules of the codec are not here but in messages/runtime. With the parameter
// "document" it writes fields.md instead, the table of the fields of all schemas, and with "facts"
// FieldFacts.cpp, what the program itself knows of them.

#include <google/protobuf/compiler/code_generator.h>
#include <google/protobuf/compiler/plugin.h>
#include <google/protobuf/io/printer.h>
#include <google/protobuf/io/zero_copy_stream.h>

#include <memory>
#include <vector>

#include "messages/generator/ClassCode.h"
#include "messages/generator/FactsCode.h"
#include "messages/generator/FieldDocument.h"
#include "messages/generator/Names.h"

namespace qel::generator {
namespace {

using google::protobuf::FileDescriptor;
using google::protobuf::compiler::CodeGenerator;
using google::protobuf::compiler::GeneratorContext;
using google::protobuf::io::Printer;

// Opens `name` among the files of the run and hands a printer for it to `print`.
template <class Print>
void write(GeneratorContext& context, const std::string& name, Print&& print) {
  const std::unique_ptr<google::protobuf::io::ZeroCopyOutputStream> stream(context.Open(name));
  Printer printer(stream.get(), '$');
  print(printer);
}

class MessageGenerator final : public CodeGenerator {
 public:
  bool GenerateAll(const std::vector<const FileDescriptor*>& schemas, const std::string& parameter,
                   GeneratorContext* context, std::string* error) const override {
    if (parameter == "document") {
      write(*context, "fields.md",
            [&](Printer& printer) { printer.PrintRaw(fieldDocument(schemas)); });
      return true;
    }
    if (parameter == "facts") {
      write(*context, "FieldFacts.cpp",
            [&](Printer& printer) { printer.PrintRaw(factsCode(schemas)); });
      return true;
    }
    return CodeGenerator::GenerateAll(schemas, parameter, context, error);
  }

  bool Generate(const FileDescriptor* schema, const std::string&, GeneratorContext* context,
                std::string*) const override {
    write(*context, stem(*schema) + ".h", [&](Printer& printer) { printHeader(printer, *schema); });
    write(*context, stem(*schema) + ".cpp",
          [&](Printer& printer) { printSource(printer, *schema); });
    return true;
  }
};

}  // namespace
}  // namespace qel::generator

int main(int argc, char* argv[]) {
  const qel::generator::MessageGenerator generator;
  return google::protobuf::compiler::PluginMain(argc, argv, &generator);
}
