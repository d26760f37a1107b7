// The text of a local time, made once a minute; the seconds are put in.
#pragma once

#include <array>
#include <cstdint>
#include <ctime>
#include <string_view>

namespace qel::bench {

class KeptTime {
 public:
  // "2017-07-14 04:40:00 CEST"; valid until the next call.
  std::string_view at(std::uint64_t milliseconds) {
    const std::uint64_t seconds = milliseconds / 1000;
    const std::uint64_t into = seconds - _minute;
    if (into >= 60) return makeAnew(seconds);
    constexpr std::size_t kSeconds = std::string_view("2017-07-14 04:40:").size();
    _text[kSeconds] = static_cast<char>('0' + into / 10);
    _text[kSeconds + 1] = static_cast<char>('0' + into % 10);
    return {_text.data(), _size};
  }

 private:
  std::string_view makeAnew(std::uint64_t seconds) {
    const auto time = static_cast<std::time_t>(seconds);
    std::tm local{};
    ::localtime_r(&time, &local);
    _minute = seconds - static_cast<std::uint64_t>(local.tm_sec);
    _size = std::strftime(_text.data(), _text.size(), "%Y-%m-%d %H:%M:%S %Z", &local);
    return {_text.data(), _size};
  }

  std::uint64_t _minute = ~std::uint64_t{0} / 2;
  std::array<char, 64> _text{};
  std::size_t _size = 0;
};

}  // namespace qel::bench
