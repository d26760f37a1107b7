// The same message as other senders might write it: nothing in the wire format tells them to do as
// ours does.
#pragma once

#include <google/protobuf/descriptor.h>

#include "RandomMessage.h"

namespace qel::testing {

// The fields of the message and of all within it in any order. Elements of a list change places
// too.
Bytes shuffled(RandomMessages& random, const google::protobuf::Descriptor& schema,
               const Bytes& bytes);

// Every field twice, in any order.
Bytes doubled(RandomMessages& random, const google::protobuf::Descriptor& schema,
              const Bytes& bytes);

// Fields of a later schema behind those of the message and of every one within it.
Bytes fromTheFuture(RandomMessages& random, const google::protobuf::Descriptor& schema,
                    const Bytes& bytes);

}  // namespace qel::testing
