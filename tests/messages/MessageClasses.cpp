#include "MessageClasses.h"

#include <vector>

#include "messages/catalogue/MetricMessages.h"

namespace qel::testing {
namespace {

template <class Message>
std::shared_ptr<PBCodable> make() {
  return std::make_shared<Message>();
}

std::vector<MessageClass> listed() {
  std::vector<MessageClass> classes;
  AllMessages::forEach([&]<class Message>() {
    classes.push_back({Message::kClassName, make<Message>, decodeMessage<Message>});
  });
  return classes;
}

}  // namespace

std::span<const MessageClass> messageClasses() {
  static const std::vector<MessageClass> classes = listed();
  return classes;
}

}  // namespace qel::testing
