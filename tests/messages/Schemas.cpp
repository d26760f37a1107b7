#include "Schemas.h"

#include <google/protobuf/descriptor.pb.h>
#include <google/protobuf/dynamic_message.h>
#include <google/protobuf/unknown_field_set.h>

#include <fstream>
#include <string>

#include "base/FatalError.h"

namespace qel::testing {
namespace {

using google::protobuf::Descriptor;
using google::protobuf::DescriptorPool;
using google::protobuf::FileDescriptor;
using google::protobuf::FileDescriptorSet;

constexpr std::string_view kPackage = "qelwatch.schema.";

struct Pool {
  Pool() {
    std::ifstream stream(QEL_SCHEMA_DESCRIPTORS, std::ios::binary);
    FileDescriptorSet set;
    if (!set.ParseFromIstream(&stream)) fatalError("no schemas in " QEL_SCHEMA_DESCRIPTORS);
    for (const auto& file : set.file()) files.push_back(pool.BuildFile(file));
  }
  DescriptorPool pool;
  std::vector<const FileDescriptor*> files;
  google::protobuf::DynamicMessageFactory factory;
};

Pool& shared() {
  static Pool pool;
  return pool;
}

}  // namespace

const Descriptor& schemaOf(std::string_view className) {
  const std::string name = std::string(kPackage) + std::string(className);
  const Descriptor* schema = shared().pool.FindMessageTypeByName(name);
  if (!schema) fatalError("no schema " + name);
  return *schema;
}

std::vector<const Descriptor*> allSchemas() {
  std::vector<const Descriptor*> schemas;
  for (const FileDescriptor* file : shared().files) {
    if (file->package() + '.' != kPackage) continue;
    for (int i = 0; i < file->message_type_count(); ++i) schemas.push_back(file->message_type(i));
  }
  return schemas;
}

std::optional<std::uint32_t> metricOf(const Descriptor& schema) {
  constexpr int kMetricOption = 50101;
  const auto& options = schema.options();
  const auto& unknown = options.GetReflection()->GetUnknownFields(options);
  for (int i = 0; i < unknown.field_count(); ++i) {
    if (unknown.field(i).number() == kMetricOption) {
      return static_cast<std::uint32_t>(unknown.field(i).varint());
    }
  }
  return std::nullopt;
}

std::unique_ptr<google::protobuf::Message> stockMessage(const Descriptor& schema) {
  return std::unique_ptr<google::protobuf::Message>(shared().factory.GetPrototype(&schema)->New());
}

}  // namespace qel::testing
