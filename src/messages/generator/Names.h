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

}  // namespace qel::generator
