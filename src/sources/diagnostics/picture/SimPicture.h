// What is known of the SIM card's files, and where the modem is in reading them.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "base/Bytes.h"
#include "sources/diagnostics/picture/CardExchange.h"

namespace qel::diagnostics {

// What is selected on one of the card's logical channels.
struct CardChannel {
  enum class Application : std::uint8_t { unknown, usim, other };
  enum class Directory : std::uint8_t { unknown, master, application, gsm, other };

  Application application = Application::unknown;
  Directory directory = Directory::unknown;
  std::uint32_t file = 0;  // 0: none
  std::size_t readTo = 0;  // of that file, since it was selected: bytes, or records
};

struct SimFile {
  static constexpr std::size_t kMostBytes = 1024;

  std::uint32_t identifier = 0;
  Bytes content;  // from the beginning, as far as it was read
};

struct SimPicture {
  static constexpr std::size_t kChannels = 4;

  CardExchange exchange;
  std::array<CardChannel, kChannels> channels;
  std::vector<SimFile> files;  // those of the list in KeptFiles, each once
};

}  // namespace qel::diagnostics
