// A file that takes its place when it is whole.
#pragma once

#include <string>
#include <string_view>

namespace qel {

// Written beside PATH under a name that no file has, PATH.XXXXXX.part, for its owner's eyes alone,
// and gone with this unless it took its place. Closed by the destructor. One thread.
class PartFile {
 public:
  explicit PartFile(std::string path) : _path(std::move(path)) {}
  ~PartFile();
  PartFile(const PartFile&) = delete;
  PartFile& operator=(const PartFile&) = delete;

  const std::string& path() const { return _path; }
  const std::string& partPath() const { return _part; }  // once it is created

  // Each is false when it failed: see error().
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
  std::string _part;
  int _descriptor = -1;
  bool _isThere = false;  // under its other name
  std::string _error;
};

}  // namespace qel
