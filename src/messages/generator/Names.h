// How schema names become C++ names.
#pragma once

#include <google/protobuf/descriptor.h>

#include <string>
#include <string_view>

namespace qel::generator {

// "S_intra_search_P" → "sIntraSearchP".
std::string camelCase(std::string_view key);

// "rxInfo" → "RxInfo".
std::string capitalised(std::string name);

// The accessor name of a field: its key in camel case, in the plural when it is repeated.
std::string propertyName(const google::protobuf::FieldDescriptor& field);

// "lte_serving.proto" → "lte_serving".
std::string stem(const google::protobuf::FileDescriptor& file);

// The C++ name of an enumeration's table of names.
std::string namesTable(const google::protobuf::EnumDescriptor& enumeration);

// A comment of the schema as C++ comment lines with the given indent; empty when there is none.
template <class Descriptor>
std::string commentOf(const Descriptor& descriptor, std::string_view indent) {
  google::protobuf::SourceLocation location;
  if (!descriptor.GetSourceLocation(&location)) return "";
  std::string out;
  std::string_view rest = location.leading_comments;
  while (!rest.empty()) {
    const auto end = rest.find('\n');
    out += indent;
    out += "//";
    out += rest.substr(0, end);
    out += '\n';
    if (end == std::string_view::npos) break;
    rest.remove_prefix(end + 1);
  }
  return out;
}

}  // namespace qel::generator
