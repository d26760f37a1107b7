// The dictionary form of a stock message, made by reflection.
#pragma once

#include <google/protobuf/message.h>

#include "base/Value.h"

namespace qel::testing {

Dictionary stockDictionary(const google::protobuf::Message& message);

}  // namespace qel::testing
