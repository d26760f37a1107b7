#include "base/FileContent.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdint>

namespace qel {
namespace {

class Descriptor {
 public:
  // A pipe without a writer does not hold this up.
  explicit Descriptor(const std::string& path)
      : _number(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY)) {}
  ~Descriptor() {
    if (_number >= 0) ::close(_number);
  }
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;

  bool isRegularFile() const {
    struct stat about {};
    return _number >= 0 && ::fstat(_number, &about) == 0 && S_ISREG(about.st_mode);
  }
  int number() const { return _number; }

 private:
  const int _number;
};

}  // namespace

Bytes contentOfFile(const std::string& path, std::size_t most) {
  const Descriptor file(path);
  if (!file.isRegularFile()) return {};
  Bytes content;
  std::array<std::uint8_t, 16 * 1024> piece{};
  while (true) {
    const ssize_t count = ::read(file.number(), piece.data(), piece.size());
    if (count < 0 && errno == EINTR) continue;
    if (count == 0) return content;
    if (count < 0 || content.size() + static_cast<std::size_t>(count) > most) return {};
    content.insert(content.end(), piece.begin(), piece.begin() + count);
  }
}

}  // namespace qel
