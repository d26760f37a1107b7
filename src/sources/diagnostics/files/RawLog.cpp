#include "sources/diagnostics/files/RawLog.h"

#include <sys/stat.h>
#include <sysexits.h>

#include <algorithm>
#include <utility>

#include "base/Clock.h"

namespace qel::diagnostics {
namespace {

using sources::SourceError;

constexpr std::size_t kPiece = 4 * 1024;  // bytes: what waits for its reader comes of this much
constexpr std::uint64_t kLookedAt = std::uint64_t{16} * 1024 * 1024;

std::uint64_t millisecondsOf(const timespec& time) {
  if (time.tv_sec < 0) return 0;
  return static_cast<std::uint64_t>(time.tv_sec) * 1000 +
         static_cast<std::uint64_t>(time.tv_nsec) / 1'000'000;
}

class Nobody final : public PacketSink {
 public:
  void log(const LogPacket&) override {}
  void event(const ModemEvent&) override {}
};

}  // namespace

std::unique_ptr<RawLog> RawLog::open(const std::string& path, SourceError& error) {
  const bool isStandardInput = path == "-";
  const std::string name = isStandardInput ? "standard input" : path;
  const std::string file = isStandardInput ? "/dev/stdin" : path;
  struct stat status {};
  const bool isKnown = ::stat(file.c_str(), &status) == 0;
  if (isKnown && !isStandardInput && (S_ISCHR(status.st_mode) || S_ISBLK(status.st_mode))) {
    error = {EX_NOINPUT, name + ": a device, and no file of what one sent"};
    return nullptr;
  }
  std::string why;
  auto bytes = FileBytes::open(file, why);
  if (!bytes) {
    error = {EX_NOINPUT, name + ": " + why};
    return nullptr;
  }
  const bool isFile = isKnown && S_ISREG(status.st_mode);
  const std::uint64_t writtenMs = isFile ? millisecondsOf(status.st_mtim) : systemClock().nowMs();
  return std::unique_ptr<RawLog>(new RawLog(name, writtenMs, std::move(bytes)));
}

RawLog::RawLog(std::string name, std::uint64_t writtenMs, std::unique_ptr<FileBytes> bytes)
    : _name(std::move(name)), _writtenMs(writtenMs), _bytes(std::move(bytes)) {}

bool RawLog::read(PacketSink& sink) {
  if (_left.empty()) _left = _bytes->next();
  if (_left.empty()) {
    end();
    return false;
  }
  const std::string_view piece = _left.substr(0, kPiece);
  _left.remove_prefix(piece.size());
  _forward.to = &sink;
  _frames.add({reinterpret_cast<const std::uint8_t*>(piece.data()), piece.size()},
              [this](ByteView packet) { _packets.take(packet); });
  _forward.to = nullptr;
  return true;
}

void RawLog::end() {
  _frames.cut();
  switch (_bytes->end()) {
    case FileBytes::End::whole:
      return;
    case FileBytes::End::cutOff:
      _fault = {EX_DATAERR, _name + ": the compressed file ends in the middle"};
      return;
    case FileBytes::End::notCompressed:
      _fault = {EX_DATAERR, _name + ": something follows the compressed content"};
      return;
    case FileBytes::End::damaged:
      _fault = {EX_DATAERR, _name + ": the compressed file is damaged"};
      return;
    case FileBytes::End::failed:
      _fault = {EX_IOERR, _name + ": " + _bytes->error()};
      return;
  }
}

bool checkRawLog(const std::string& path, SourceError& error) {
  const auto log = RawLog::open(path, error);
  if (!log) return false;
  Nobody nobody;
  while (log->frames().frames == 0 && log->frames().bytes < kLookedAt && log->read(nobody)) {
  }
  if (log->frames().frames > 0) return true;
  error = log->fault();
  if (error.message.empty()) {
    error = {EX_DATAERR, log->name() + ": no frame of a diagnostics port in it"};
  }
  return false;
}

}  // namespace qel::diagnostics
