#include "recording/RecordingsFolder.h"

#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <system_error>

#include "base/Amounts.h"
#include "base/TimeZone.h"

namespace qel {
namespace {

namespace fs = std::filesystem;

constexpr std::string_view kHiddenEnding = ".deleted";
constexpr std::array<std::string_view, 2> kEndings = {".jsonl", ".jsonl.gz"};
constexpr std::string_view kEndingOfNew = ".jsonl.gz";
constexpr unsigned kMostOfASecond = 100;  // recordings begun in one

bool isRecording(std::string_view name) {
  return !name.starts_with('.') && name.find('/') == std::string_view::npos &&
         std::ranges::any_of(kEndings, [name](auto ending) { return name.ends_with(ending); });
}

bool isHidden(std::string_view name) {
  return name.starts_with('.') && name.ends_with(kHiddenEnding) &&
         isRecording(name.substr(1, name.size() - 1 - kHiddenEnding.size()));
}

std::string hiddenName(const std::string& name) { return "." + name + std::string(kHiddenEnding); }

std::string moved(const std::string& from, const std::string& to) {
  return std::rename(from.c_str(), to.c_str()) == 0 ? "" : from + ": " + std::strerror(errno);
}

// "2026-11-22 03.55.10": sorts by time, and no file system minds it.
std::string beginningOf(std::uint64_t nowMs) {
  const CivilTime time = systemTimeZone().at(static_cast<std::int64_t>(nowMs / 1000));
  std::array<char, 64> text;
  std::snprintf(text.data(), text.size(), "%04lld-%02d-%02d %02d.%02d.%02d",
                static_cast<long long>(time.year), time.month, time.day, time.hour, time.minute,
                time.second);
  return text.data();
}

}  // namespace

std::string RecordingsFolder::usualPath() {
  const auto valueOf = [](const char* name) {
    const char* value = std::getenv(name);
    return std::string(value && value[0] == '/' ? value : "");
  };
  std::string data = valueOf("XDG_DATA_HOME");
  if (data.empty() && !valueOf("HOME").empty()) data = valueOf("HOME") + "/.local/share";
  return data.empty() ? "" : data + "/qelwatch/recordings";
}

std::vector<RecordingFile> RecordingsFolder::files() const {
  std::vector<RecordingFile> files;
  std::error_code code;
  for (fs::directory_iterator entry(_path, code), end; !code && entry != end;
       entry.increment(code)) {
    const std::string name = entry->path().filename().string();
    struct stat status {};
    if (!isRecording(name) || ::lstat(entry->path().c_str(), &status) != 0) continue;
    if (!S_ISREG(status.st_mode) || files.size() >= 10 * _limits.files) continue;
    files.push_back(
        {name, static_cast<std::uint64_t>(status.st_size),
         std::int64_t{status.st_mtim.tv_sec} * 1000 + status.st_mtim.tv_nsec / 1000000});
  }
  std::ranges::sort(files, {}, &RecordingFile::name);
  return files;
}

std::uint64_t RecordingsFolder::bytes() const {
  std::uint64_t bytes = 0;
  for (const RecordingFile& file : files()) bytes += file.bytes;
  return bytes;
}

std::optional<std::string> RecordingsFolder::nameForNew(std::uint64_t nowMs,
                                                        std::string& why) const {
  if (_path.empty()) {
    why = "There is no folder for recordings: neither XDG_DATA_HOME nor HOME names one";
    return std::nullopt;
  }
  std::error_code code;
  fs::create_directories(fs::path(_path).parent_path(), code);
  if (::mkdir(_path.c_str(), 0700) != 0 && errno != EEXIST) {
    why = _path + ": " + std::strerror(errno);
    return std::nullopt;
  }
  const auto there = files();
  if (there.size() >= _limits.files) {
    why = std::to_string(there.size()) + " recordings are kept, and no more than " +
          std::to_string(_limits.files) + ": delete one first";
    return std::nullopt;
  }
  if (bytes() + _limits.leastForOne > _limits.bytes) {
    why = "Recordings take up the " + sizeText(_limits.bytes) + " that they may: delete one first";
    return std::nullopt;
  }
  const std::string beginning = beginningOf(nowMs);
  for (unsigned i = 1; i <= kMostOfASecond; ++i) {
    std::string name = beginning + (i == 1 ? "" : " (" + std::to_string(i) + ")");
    name += kEndingOfNew;
    const bool isTaken = ::access(pathOf(name).c_str(), F_OK) == 0 ||
                         ::access(pathOf(hiddenName(name)).c_str(), F_OK) == 0;
    if (!isTaken) return name;
  }
  why = "Too many recordings begin with " + beginning;
  return std::nullopt;
}

std::string RecordingsFolder::hide(const std::string& name) const {
  if (!isRecording(name)) return name + ": no recording of this folder";
  return moved(pathOf(name), pathOf(hiddenName(name)));
}

std::string RecordingsFolder::restore(const std::string& name) const {
  if (!isRecording(name)) return name + ": no recording of this folder";
  if (::access(pathOf(name).c_str(), F_OK) == 0) return pathOf(name) + ": " + std::strerror(EEXIST);
  return moved(pathOf(hiddenName(name)), pathOf(name));
}

void RecordingsFolder::drop(const std::string& name) const {
  if (isRecording(name)) ::unlink(pathOf(name).c_str());
}

void RecordingsFolder::dropHidden(const std::string& name) const {
  if (isRecording(name)) ::unlink(pathOf(hiddenName(name)).c_str());
}

void RecordingsFolder::dropHiddenBefore(std::uint64_t timeMs) const {
  std::vector<std::string> hidden;
  std::error_code code;
  for (fs::directory_iterator entry(_path, code), end; !code && entry != end;
       entry.increment(code)) {
    const std::string name = entry->path().filename().string();
    struct stat status {};
    if (!isHidden(name) || ::lstat(entry->path().c_str(), &status) != 0) continue;
    // Renaming changes no content, but the file's state.
    const std::int64_t hiddenMs = std::int64_t{status.st_ctim.tv_sec} * 1000;
    if (hiddenMs < static_cast<std::int64_t>(timeMs)) hidden.push_back(name);
  }
  for (const std::string& name : hidden) ::unlink(pathOf(name).c_str());
}

}  // namespace qel
