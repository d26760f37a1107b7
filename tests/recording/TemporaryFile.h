// A file that is gone with the test.
#pragma once

#include <unistd.h>
#include <zlib.h>

#include <cstdlib>
#include <fstream>
#include <iterator>
#include <string>
#include <string_view>

namespace qel::testing {

class TemporaryFile {
 public:
  explicit TemporaryFile(const std::string& suffix = ".jsonl") {
    std::string pattern = "/tmp/qel-recording-XXXXXX" + suffix;
    const int descriptor = ::mkstemps(pattern.data(), static_cast<int>(suffix.size()));
    if (descriptor < 0) std::abort();
    ::close(descriptor);
    _path = pattern;
  }
  TemporaryFile(const std::string& suffix, std::string_view content) : TemporaryFile(suffix) {
    write(content);
  }
  ~TemporaryFile() { ::unlink(_path.c_str()); }
  TemporaryFile(const TemporaryFile&) = delete;
  TemporaryFile& operator=(const TemporaryFile&) = delete;

  const std::string& path() const { return _path; }

  void write(std::string_view content) const {
    std::ofstream(_path, std::ios::binary | std::ios::trunc) << content;
  }
  std::string content() const {
    std::ifstream file(_path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  }

 private:
  std::string _path;
};

// The text as a whole gzip stream.
inline std::string gzipped(std::string_view text) {
  const TemporaryFile file(".gz");
  const gzFile stream = ::gzopen(file.path().c_str(), "wb");
  ::gzwrite(stream, text.data(), static_cast<unsigned>(text.size()));
  ::gzclose(stream);
  return file.content();
}

}  // namespace qel::testing
