// The same schemas in the stock protobuf runtime.
#pragma once

#include <cstdint>

namespace google::protobuf {
class Message;
}

namespace qel::bench {

// An empty message of the metric's class, which lives as long as the program. The metric must have
// a message class.
const google::protobuf::Message* stockPrototype(std::uint32_t metric);

}  // namespace qel::bench
