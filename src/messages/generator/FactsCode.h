// The constant table of what every field means.
#pragma once

#include <google/protobuf/descriptor.h>

#include <string>
#include <vector>

namespace qel::generator {

// The source of what messages/catalogue/FieldFacts.h declares.
std::string factsCode(const std::vector<const google::protobuf::FileDescriptor*>& schemas);

}  // namespace qel::generator
