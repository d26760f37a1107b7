#include "base/FileContent.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdint>
#include <utility>

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

  int number() const { return _number; }

 private:
  const int _number;
};

}  // namespace

FileContent readFile(const std::string& path, std::size_t most) {
  using Fault = FileContent::Fault;
  const Descriptor file(path);
  struct stat about {};
  if (file.number() < 0 || ::fstat(file.number(), &about) != 0) {
    return {{}, Fault::unreadable, errno};
  }
  if (!S_ISREG(about.st_mode)) return {{}, Fault::notRegular, 0};
  Bytes content;
  std::array<std::uint8_t, 16 * 1024> piece{};
  while (true) {
    const ssize_t count = ::read(file.number(), piece.data(), piece.size());
    if (count < 0 && errno == EINTR) continue;
    if (count < 0) return {{}, Fault::unreadable, errno};
    if (count == 0) return {std::move(content), Fault::none, 0};
    if (content.size() + static_cast<std::size_t>(count) > most) return {{}, Fault::tooLarge, 0};
    content.insert(content.end(), piece.begin(), piece.begin() + count);
  }
}

}  // namespace qel
