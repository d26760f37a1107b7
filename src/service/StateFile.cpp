#include "service/StateFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <iterator>
#include <memory>
#include <optional>

#include "base/DescriptorSink.h"
#include "base/LogSink.h"
#include "messages/service_state.h"

namespace qel::service {
namespace {

constexpr std::uint32_t kFormat = 1;

Bytes encoded(const KeptState& state) {
  ServiceState message;
  message.setFormat(kFormat);
  for (const auto& [application, installed] : state.configurations) {
    auto kept = std::make_shared<KeptConfiguration>();
    kept->setApplication(static_cast<std::uint64_t>(application));
    kept->setPayload(installed.payload);
    if (!installed.client.empty()) kept->setClient(installed.client);
    message.addConfiguration(std::move(kept));
  }
  for (const auto& [name, use] : state.applicationOfClient) {
    auto kept = std::make_shared<KeptClient>();
    kept->setName(name);
    kept->setApplication(static_cast<std::uint64_t>(use.application));
    if (use.usedMs != 0) kept->setUsedMs(use.usedMs);
    message.addClient(std::move(kept));
  }
  return message.data();
}

std::optional<KeptState> decoded(const Bytes& bytes) {
  const auto message = ServiceState::initWithData(bytes);
  if (!message || message->format() != kFormat) return std::nullopt;
  KeptState state;
  for (const auto& kept : message->configurations()) {
    if (!kept->hasPayload()) return std::nullopt;
    state.configurations[static_cast<std::int64_t>(kept->application())] = {
        *kept->payload(), kept->client().value_or("")};
  }
  for (const auto& kept : message->clients()) {
    if (!kept->hasName()) return std::nullopt;
    state.applicationOfClient[*kept->name()] = {static_cast<std::int64_t>(kept->application()),
                                                kept->usedMs()};
  }
  return state;
}

// Closes its descriptor.
struct File {
  explicit File(int opened) : descriptor(opened) {}
  ~File() {
    if (descriptor >= 0) ::close(descriptor);
  }
  File(const File&) = delete;
  File& operator=(const File&) = delete;
  const int descriptor;
};

void logFailure(const std::string& path, const char* what, int error) {
  systemLog().write("basebandd: " + path + ": " + what + ": " + std::strerror(error));
}

// The whole content on the disk under this name; 0 or the error number.
int writeDurably(const std::string& path, const Bytes& content) {
  const File file(::open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0600));
  if (file.descriptor < 0) return errno;
  const std::string_view text(reinterpret_cast<const char*>(content.data()), content.size());
  if (const int error = writeAll(file.descriptor, text)) return error;
  return ::fsync(file.descriptor) == 0 ? 0 : errno;
}

}  // namespace

StateFile::StateFile(std::string directory) : _directory(std::move(directory)) {}

KeptState StateFile::load() {
  const std::string path = _directory + "/state";
  std::ifstream file(path, std::ios::binary);
  if (!file) return {};
  const Bytes content{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  auto state = decoded(content);
  if (!state) {
    systemLog().write("basebandd: " + path + ": not a state of this service, ignored");
    return {};
  }
  return std::move(*state);
}

void StateFile::save(const KeptState& state) {
  const std::string path = _directory + "/state";
  const std::string written = path + ".new";
  if (const int error = writeDurably(written, encoded(state))) {
    logFailure(written, "cannot be written", error);
    return;
  }
  if (::rename(written.c_str(), path.c_str()) != 0) {
    logFailure(path, "cannot be replaced", errno);
    return;
  }
  const File directory(::open(_directory.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  if (directory.descriptor < 0 || ::fsync(directory.descriptor) != 0) {
    logFailure(_directory, "cannot be synchronised", errno);
  }
}

}  // namespace qel::service
