// A file descriptor that is closed with its owner.
#pragma once

#include <unistd.h>

#include <utility>

namespace qel::diagnostics {

class Descriptor {
 public:
  explicit Descriptor(int number = -1) : _number(number) {}
  ~Descriptor() {
    if (_number >= 0) ::close(_number);
  }
  Descriptor(Descriptor&& other) noexcept : _number(std::exchange(other._number, -1)) {}
  Descriptor& operator=(Descriptor&& other) noexcept {
    std::swap(_number, other._number);
    return *this;
  }

  int number() const { return _number; }
  explicit operator bool() const { return _number >= 0; }

 private:
  int _number;
};

}  // namespace qel::diagnostics
