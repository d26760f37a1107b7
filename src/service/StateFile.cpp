#include "service/StateFile.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <memory>
#include <optional>

#include "base/DescriptorSink.h"
#include "base/FileContent.h"
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

void log(const std::string& path, const std::string& what) {
  systemLog().write("basebandd: " + path + ": " + what);
}

// Why there is nothing to be had of the file, or no word when it is not there.
std::string inWords(const FileContent& content) {
  switch (content.fault) {
    case FileContent::Fault::none:
      return "";
    case FileContent::Fault::unreadable:
      if (content.error == ENOENT) return "";
      return std::string("cannot be read: ") + std::strerror(content.error);
    case FileContent::Fault::notRegular:
      return "not a regular file, ignored";
    case FileContent::Fault::tooLarge:
      return "larger than any state of this service, ignored";
  }
  return "";
}

// What the file says, or nothing; `fault` then holds why, unless there is no file.
std::optional<KeptState> stateIn(const std::string& path, std::string& fault) {
  const FileContent content = readFile(path, StateFile::kLargest);
  fault = inWords(content);
  if (content.fault != FileContent::Fault::none) return std::nullopt;
  auto state = decoded(content.bytes);
  if (!state) fault = "not a state of this service, ignored";
  return state;
}

// The whole content on the disk under this name; 0 or the error number. Whatever bears the name
// from before, such as a write that was cut off, goes.
int writeDurably(const std::string& path, const Bytes& content) {
  ::unlink(path.c_str());
  const File file(::open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0600));
  if (file.descriptor < 0) return errno;
  const std::string_view text(reinterpret_cast<const char*>(content.data()), content.size());
  if (const int error = writeAll(file.descriptor, text)) return error;
  return ::fsync(file.descriptor) == 0 ? 0 : errno;
}

}  // namespace

StateFile::StateFile(std::string directory) : _directory(std::move(directory)) {}

KeptState StateFile::load() {
  const std::string path = _directory + "/state";
  std::string fault;
  auto state = stateIn(path, fault);
  if (!fault.empty()) log(path, fault);
  return state ? std::move(*state) : KeptState{};
}

void StateFile::save(const KeptState& state) {
  std::string failure = replaceBy(encoded(state));
  if (!failure.empty() && failure != _failure) systemLog().write("basebandd: " + failure);
  _failure = std::move(failure);
}

std::string StateFile::replaceBy(const Bytes& content) const {
  const std::string path = _directory + "/state";
  const std::string written = path + ".new";
  const auto failed = [](const std::string& name, const char* what, int error) {
    return name + ": " + what + ": " + std::strerror(error);
  };
  if (content.size() > kLargest) return failed(path, "cannot be written", EFBIG);
  if (const int error = writeDurably(written, content)) {
    return failed(written, "cannot be written", error);
  }
  if (::rename(written.c_str(), path.c_str()) != 0) {
    return failed(path, "cannot be replaced", errno);
  }
  const File directory(::open(_directory.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  if (directory.descriptor < 0 || ::fsync(directory.descriptor) != 0) {
    return failed(_directory, "cannot be synchronised", errno);
  }
  return "";
}

}  // namespace qel::service
