// Writes what the fuzzers start from: make_seeds DIRECTORY RECORDING CONFIGURATION.

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

#include "base/FatalError.h"
#include "fuzz/seeds/DiagnosticsSeeds.h"
#include "fuzz/seeds/FrameSeeds.h"
#include "fuzz/seeds/MessageSeeds.h"
#include "fuzz/seeds/ModemSeeds.h"
#include "fuzz/seeds/RecordedSeeds.h"
#include "fuzz/seeds/RrcSeeds.h"
#include "fuzz/support/Seed.h"
#include "messages/service_state.h"
#include "tesk/Constants.h"

namespace qel::fuzz {
namespace {

void writeFile(const std::filesystem::path& path, const Bytes& bytes) {
  std::ofstream file(path, std::ios::binary);
  file.write(reinterpret_cast<const char*>(bytes.data()),
             static_cast<std::streamsize>(bytes.size()));
  if (!file.flush()) fatalError(path.string() + " cannot be written");
}

void writeAll(const std::filesystem::path& directory, const std::vector<Bytes>& seeds) {
  std::filesystem::create_directories(directory);
  for (std::size_t i = 0; i < seeds.size(); ++i) {
    writeFile(directory / ("seed-" + std::to_string(i)), seeds[i]);
  }
}

Bytes contentOf(const char* path) {
  std::ifstream file(path, std::ios::binary);
  Bytes content{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  if (content.empty()) fatalError(std::string(path) + " cannot be read");
  return content;
}

std::vector<Bytes> messageSeeds() {
  const std::vector<Bytes> messages = wholeMessages();
  std::vector<Bytes> seeds;
  for (std::size_t i = 0; i < messages.size(); ++i) {
    seeds.push_back(Seed().byte(i).piece(messages[i]).rest(messages[i]).bytes);
  }
  return seeds;
}

std::vector<Bytes> requestSeeds(const Bytes& configuration) {
  constexpr std::size_t kWithConfiguration = 2;
  const Dictionary query = {
      {tesk::kKeyAppID, 2},       {tesk::kKeyPayloadType, 0},      {tesk::kKeyTriggerRef, 9999},
      {tesk::kKeyTriggerType, 0}, {tesk::kKeyTriggerID, 0x7F4E04}, {tesk::kKeyProfileID, 0},
      {tesk::kKeyMetricID, 0}};
  return {
      Seed().byte(1).byte(0).byte(kWithConfiguration).piece(configuration).byte(2).bytes,
      Seed().byte(1).byte(2).byte(0).entries(query).byte(0).bytes,
      Seed().byte(1).byte(1).byte(0).entries({{tesk::kKeyAppID, 2}}).byte(0).bytes,
  };
}

std::vector<Bytes> stateSeeds(const Bytes& configuration) {
  ServiceState state;
  state.setFormat(1);
  const auto kept = std::make_shared<KeptConfiguration>();
  kept->setApplication(2);
  kept->setPayload(configuration);
  state.addConfiguration(kept);
  const auto client = std::make_shared<KeptClient>();
  client->setName("qelwatch");
  client->setApplication(2);
  state.addClient(client);
  return {state.data()};
}

void makeSeeds(const std::filesystem::path& directory, const char* recording,
               const char* configuration) {
  const auto events = firstOfEach(recording);
  const Bytes wishes = contentOf(configuration);
  writeAll(directory / "messages", messageSeeds());
  writeAll(directory / "events", eventSeeds(events));
  writeAll(directory / "lines", lineSeeds(events));
  writeAll(directory / "phones", lineSeeds(events));
  writeAll(directory / "recordings", recordingSeeds(events));
  writeAll(directory / "identities", identitySeeds(events));
  writeAll(directory / "packets", packetSeeds(events));
  writeAll(directory / "requests", requestSeeds(wishes));
  writeAll(directory / "states", stateSeeds(wishes));
  writeAll(directory / "modems", modems());
  writeAll(directory / "rrc", rrcSeeds());
  writeAll(directory / "frames", frameSeeds());
  writeAll(directory / "diagnostics", diagnosticsSeeds());
}

}  // namespace
}  // namespace qel::fuzz

int main(int count, char** arguments) {
  if (count != 4) {
    std::fputs("make_seeds DIRECTORY RECORDING CONFIGURATION\n", stderr);
    return 64;
  }
  qel::fuzz::makeSeeds(arguments[1], arguments[2], arguments[3]);
}
