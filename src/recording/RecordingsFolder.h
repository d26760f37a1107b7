// The folder in which the viewer keeps its recordings.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace qel {

struct RecordingFile {
  std::string name;
  std::uint64_t bytes = 0;
  std::int64_t changedMs = 0;  // since 1970-01-01 00:00 UTC
};

// $XDG_DATA_HOME/qelwatch/recordings or the like, made when it is needed, for its owner alone. Any
// thread. Files of other kinds are left alone.
class RecordingsFolder {
 public:
  struct Limits {
    std::size_t files = 200;                              // beyond them none is begun
    std::uint64_t bytes = std::uint64_t{1} << 30U;        // of all; a recording ends at them
    std::uint64_t leastForOne = std::uint64_t{1} << 20U;  // less left: none is begun
  };

  explicit RecordingsFolder(std::string path) : RecordingsFolder(std::move(path), Limits()) {}
  RecordingsFolder(std::string path, const Limits& limits)
      : _path(std::move(path)), _limits(limits) {}
  // Where the user's data belongs; empty when that is nowhere.
  static std::string usualPath();

  const std::string& path() const { return _path; }
  const Limits& limits() const { return _limits; }
  std::string pathOf(const std::string& name) const { return _path + "/" + name; }

  // By name, the newest last. Nothing where there is no folder. What is beyond ten times the limit
  // of files is not listed.
  std::vector<RecordingFile> files() const;
  std::uint64_t bytes() const;

  // A name for a recording begun now, which no file has. Nothing when none may be begun; `why` is
  // then one sentence.
  std::optional<std::string> nameForNew(std::uint64_t nowMs, std::string& why) const;

  // Takes a recording out of the list, or back into it. Empty, or one line why not.
  std::string hide(const std::string& name) const;
  std::string restore(const std::string& name) const;
  // It is gone after this.
  void drop(const std::string& name) const;
  // And so are hidden ones: this one, or those that were hidden before this time.
  void dropHidden(const std::string& name) const;
  void dropHiddenBefore(std::uint64_t timeMs) const;

 private:
  std::string _path;
  Limits _limits;
};

}  // namespace qel
