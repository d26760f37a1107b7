// A file that takes its place when it is whole.
#pragma once

#include <string>
#include <string_view>

namespace qel {

// Written as PATH.part, for its owner's eyes alone, and gone with this unless it took its place.
// Closed by the destructor. One thread.
class PartFile {
 public:
  explicit PartFile(std::string path) : _path(std::move(path)) {}
  ~PartFile();
  PartFile(const PartFile&) = delete;
  PartFile& operator=(const PartFile&) = delete;

  const std::string& path() const { return _path; }
  std::string partPath() const { return _path + ".part"; }

  // Each is false when it failed: see error(). What an ended program left is replaced.
  bool create();
  bool write(std::string_view text);
  // Brings it to the disk and closes it.
  bool complete();
  // Closed or not, in the place of what is there.
  bool takePlace();

  // One line, "PATH: WHY".
  const std::string& error() const { return _error; }

 private:
  bool fail(int code);

  const std::string _path;
  int _descriptor = -1;
  bool _isThere = false;  // under its other name
  std::string _error;
};

}  // namespace qel
