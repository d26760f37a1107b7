#include "tesk/Message.h"

namespace tesk {

qel::Dictionary createDictionaryFromMessage(const Message& message) { return message.entries(); }

}  // namespace tesk
