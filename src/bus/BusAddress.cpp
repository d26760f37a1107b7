#include "bus/BusAddress.h"

#include <algorithm>
#include <cctype>

namespace qel::bus {
namespace {

bool isWord(std::string_view text) {
  const auto isOfWord = [](unsigned char c) { return std::isalnum(c) || c == '-' || c == '_'; };
  return !text.empty() && std::ranges::all_of(text, isOfWord);
}

// What stands before the mark; the text goes on behind it.
std::string_view takeUntil(char mark, std::string_view& text) {
  const auto end = std::min(text.find(mark), text.size());
  const std::string_view taken = text.substr(0, end);
  text.remove_prefix(std::min(end + 1, text.size()));
  return taken;
}

// "transport:key=value,key=value".
bool isOneAddress(std::string_view text) {
  if (text.find(':') == std::string_view::npos || !isWord(takeUntil(':', text))) return false;
  while (!text.empty()) {
    std::string_view pair = takeUntil(',', text);
    if (pair.find('=') == std::string_view::npos || !isWord(takeUntil('=', pair))) return false;
  }
  return true;
}

bool isAddress(std::string_view text) {
  if (text.empty()) return false;
  while (!text.empty()) {
    if (!isOneAddress(takeUntil(';', text))) return false;
  }
  return true;
}

}  // namespace

std::string faultOfBusName(std::string_view name) {
  if (name == "system" || name == "session" || isAddress(name)) return {};
  return '"' + std::string(name) + "\" is neither system nor session nor the address of a bus";
}

std::unique_ptr<sdbus::IConnection> connectTo(const BusAddress& address) {
  if (address.name == "system") return sdbus::createSystemBusConnection();
  if (address.name == "session") return sdbus::createSessionBusConnection();
  return sdbus::createSessionBusConnectionWithAddress(address.name);
}

}  // namespace qel::bus
