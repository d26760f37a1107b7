#include "service/bus/CallLimits.h"

#include <systemd/sd-bus.h>

#include <cstdint>
#include <string_view>

#include "base/TerminalText.h"
#include "service/ClientName.h"
#include "service/Limits.h"
#include "service/Request.h"
#include "service/bus/OpenedMessage.h"

namespace qel::service {
namespace {

constexpr std::size_t kMostEntries = 32;
constexpr std::size_t kLongestText = 256;

using Refusal = std::optional<tesk::CommandResult>;

// The text stays the message's.
std::string_view readText(sdbus::Message& message) {
  char* text = nullptr;
  message >> text;
  return text ? std::string_view(text) : std::string_view();
}

// How a key is called in an answer: anybody may print that.
std::string nameOf(std::string_view key) {
  constexpr std::size_t kLongestShown = 64;
  return key.size() <= kLongestShown && forTerminal(key) == key ? std::string(key) : "an entry";
}

Refusal tooLong(const std::string& what) {
  return refusal(CommandCode::requestTooLarge,
                 what + " is longer than " + std::to_string(kLongestText) + " bytes");
}

template <class Number>
bool skip(sdbus::Message& message) {
  Number number{};
  message >> number;
  return true;
}

// False when it is not of one of the types of numbers.
bool skipNumber(sdbus::Message& message, const std::string& type) {
  if (type == "x") return skip<std::int64_t>(message);
  if (type == "t") return skip<std::uint64_t>(message);
  if (type == "i") return skip<std::int32_t>(message);
  if (type == "u") return skip<std::uint32_t>(message);
  if (type == "n") return skip<std::int16_t>(message);
  if (type == "q") return skip<std::uint16_t>(message);
  if (type == "y") return skip<std::uint8_t>(message);
  return type == "b" && skip<bool>(message);
}

// However many there are: the C++ library would go through them one by one. `left` is what of the
// data in one request is still taken.
Refusal readData(sdbus::Message& message, std::string_view key, std::size_t& left) {
  const void* data = nullptr;
  std::size_t size = 0;
  sd_bus_message_read_array(OpenedMessage::within(message), 'y', &data, &size);
  if (size <= left) {
    left -= size;
    return std::nullopt;
  }
  return refusal(CommandCode::configurationTooLarge, nameOf(key) + " has " + std::to_string(size) +
                                                         " bytes, at most " + std::to_string(left) +
                                                         " are taken");
}

Refusal readValue(sdbus::Message& message, std::string_view key, std::size_t& dataLeft) {
  std::string type;
  std::string contents;
  message.peekType(type, contents);
  message.enterVariant(contents);
  if (contents == "ay") {
    if (auto refused = readData(message, key, dataLeft)) return refused;
  } else if (contents == "s") {
    if (readText(message).size() > kLongestText) return tooLong(nameOf(key));
  } else if (!skipNumber(message, contents)) {
    return refusal(CommandCode::wrongType, nameOf(key) + " is of a type that no command takes");
  }
  message.exitVariant();
  return std::nullopt;
}

Refusal readRequest(sdbus::Message& message) {
  if (readText(message).size() > kLongestText) return tooLong("the command");
  message.enterContainer("{sv}");
  std::size_t dataLeft = limits::kPayloadBytes;
  for (std::size_t entries = 0; message.enterDictEntry("sv"); ++entries) {
    if (entries == kMostEntries) {
      return refusal(CommandCode::requestTooLarge,
                     "the request has more than " + std::to_string(kMostEntries) + " entries");
    }
    const std::string_view key = readText(message);
    if (key.size() > kLongestText) return tooLong("a key");
    if (auto refused = readValue(message, key, dataLeft)) return refused;
    message.exitDictEntry();
  }
  return std::nullopt;
}

}  // namespace

std::string faultOfRegister(sdbus::MethodCall& call) {
  const std::string fault(faultOfClientName(readText(call)));
  call.rewind(true);
  return fault;
}

std::optional<tesk::CommandResult> refusedRequest(sdbus::MethodCall& call) {
  auto refused = readRequest(call);
  call.clearFlags();
  call.rewind(true);
  return refused;
}

}  // namespace qel::service
