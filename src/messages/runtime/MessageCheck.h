// Whether bytes are a message, without making one.
#pragma once

#include "messages/runtime/MessagePlan.h"

namespace qel {

// Where reading stops, damaged if the bytes are: as the message reader says, and logging what it
// logs.
Cursor checkMessage(const MessagePlan& plan, Cursor part);
// The same of the value of one field, which stands at the cursor.
Cursor pastValue(const FieldPlan& field, Cursor cursor);

}  // namespace qel
