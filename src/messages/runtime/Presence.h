// The presence word of a message: one bit a scalar field.
#pragma once

namespace qel {

// The one place that reaches into a message's `_has`.
struct Presence {
  // All of it; 0 for a message without scalars.
  template <class Message>
  static auto word(const Message& message) {
    if constexpr (requires { message._has; }) {
      return message._has;
    } else {
      return 0U;
    }
  }

  template <class Message>
  static bool get(const Message& message, unsigned bit) {
    return (message._has >> bit & 1) != 0;
  }

  template <class Message>
  static void set(Message& message, unsigned bit, bool present) {
    using Word = decltype(message._has);
    const auto mask = static_cast<Word>(Word{1} << bit);
    message._has = static_cast<Word>(present ? message._has | mask : message._has & ~mask);
  }
};

}  // namespace qel
