// The reading rules once more, told as plainly as they can be and slow: a model that the codec is
// compared with on damaged bytes. It shares no code with the codec.
#pragma once

#include <google/protobuf/descriptor.h>

#include <map>
#include <optional>
#include <string>
#include <vector>

#include "base/Value.h"

namespace qel::testing {

struct ModelResult {
  std::optional<Dictionary> dictionary;  // empty when the bytes yield no message
  std::vector<std::string> log;
};

ModelResult modelDecode(const google::protobuf::Descriptor& schema, const Bytes& bytes);

}  // namespace qel::testing
