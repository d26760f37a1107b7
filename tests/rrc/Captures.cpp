#include "rrc/Captures.h"

#include <algorithm>
#include <array>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <optional>
#include <set>
#include <string>

namespace qel::testing {
namespace {

using rrc::lte::Channel;

constexpr std::uint8_t kFrameEnd = 0x7E;
constexpr std::uint8_t kEscape = 0x7D;
constexpr std::size_t kLogHead = 16;

std::vector<Bytes> framesOf(const std::filesystem::path& path) {
  std::ifstream file(path, std::ios::binary);
  std::vector<Bytes> frames(1);
  bool escaped = false;
  for (std::istreambuf_iterator<char> byte(file), end; byte != end; ++byte) {
    const auto value = static_cast<std::uint8_t>(*byte);
    if (value == kFrameEnd) {
      frames.emplace_back();
    } else if (value == kEscape) {
      escaped = true;
    } else {
      frames.back().push_back(escaped ? value ^ 0x20 : value);
      escaped = false;
    }
  }
  return frames;
}

std::size_t number(ByteView bytes, std::size_t place) {
  return place + 1 < bytes.size() ? bytes[place] + 256U * bytes[place + 1] : 0;
}

// The channels' codes begin with that of BCH; a version leaves some out.
std::optional<Channel> channelOf(unsigned version, unsigned code) {
  constexpr std::array<std::array<unsigned, 8>, 4> kCodes = {{
      {1, 2, 3, 4, 5, 6, 7, 8},
      {8, 9, 10, 11, 12, 13, 14, 15},
      {1, 2, 4, 5, 6, 7, 8, 9},
      {1, 3, 6, 7, 8, 9, 10, 11},
  }};
  const auto isOneOf = [&](std::initializer_list<unsigned> versions) {
    return std::find(versions.begin(), versions.end(), version) != versions.end();
  };
  std::size_t row = 3;
  if (version <= 8 || isOneOf({13, 22})) row = 0;
  if (isOneOf({9, 12})) row = 1;
  if (isOneOf({14, 15, 16, 20, 24, 25})) row = 2;
  const auto& codes = kCodes[row];
  const auto found = std::find(codes.begin(), codes.end(), code);
  if (found == codes.end()) return std::nullopt;
  return static_cast<Channel>(found - codes.begin());
}

struct Layout {
  std::size_t channel, length, message;
};

Layout layoutOf(unsigned version) {
  if (version <= 4) return {10, 11, 13};
  if (version <= 7) return {10, 15, 17};
  if (version <= 24) return {12, 17, 19};
  return {14, 19, version <= 29 ? 21U : 24U};
}

std::optional<CapturedMessage> messageIn(ByteView frame) {
  constexpr std::uint8_t kWrapper = 0x98;
  constexpr std::size_t kWrapperHead = 8;
  constexpr std::uint8_t kLog = 0x10;
  constexpr std::size_t kRrcMessage = 0xB0C0;
  constexpr std::size_t kShortest = 32;
  if (frame.size() > kWrapperHead && frame[0] == kWrapper) frame = frame.subspan(kWrapperHead);
  if (frame.size() < kShortest || frame[0] != kLog || number(frame, 6) != kRrcMessage) return {};
  const ByteView body = frame.subspan(kLogHead);
  const Layout layout = layoutOf(body[0]);
  if (layout.message >= body.size()) return {};
  const auto channel = channelOf(body[0], body[layout.channel]);
  const std::size_t length = number(body, layout.length);
  if (!channel || layout.message + length > body.size()) return {};
  const ByteView pdu = body.subspan(layout.message, length);
  return CapturedMessage{*channel, Bytes(pdu.begin(), pdu.end())};
}

}  // namespace

std::vector<CapturedMessage> capturedLteMessages() {
  std::vector<CapturedMessage> messages;
  const char* folder = std::getenv("QEL_DIAG_CAPTURES");
  if (folder == nullptr) return messages;
  std::set<std::pair<Channel, Bytes>> seen;
  for (const auto& entry : std::filesystem::directory_iterator(folder)) {
    if (entry.path().extension() != ".qmdl") continue;
    for (const Bytes& frame : framesOf(entry.path())) {
      const auto message = messageIn(frame);
      if (!message || !seen.emplace(message->channel, message->pdu).second) continue;
      messages.push_back(*message);
    }
  }
  return messages;
}

}  // namespace qel::testing
