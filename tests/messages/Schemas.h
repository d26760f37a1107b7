// The schemas as the stock protobuf runtime knows them: the judge of the codec in tests.
#pragma once

#include <google/protobuf/descriptor.h>
#include <google/protobuf/message.h>

#include <cstdint>
#include <memory>
#include <optional>
#include <string_view>
#include <vector>

namespace qel::testing {

const google::protobuf::Descriptor& schemaOf(std::string_view className);

// Every message of every schema.
std::vector<const google::protobuf::Descriptor*> allSchemas();

// The schema's (metric) option.
std::optional<std::uint32_t> metricOf(const google::protobuf::Descriptor& schema);

std::unique_ptr<google::protobuf::Message> stockMessage(const google::protobuf::Descriptor& schema);

}  // namespace qel::testing
