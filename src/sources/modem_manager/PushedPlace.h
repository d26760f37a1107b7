// The place of the serving cell that a modem pushes, and the technology that it belongs to.
#pragma once

#include <chrono>
#include <optional>
#include <string>
#include <utility>

#include "sources/modem_manager/ModemPicture.h"

namespace qel::sources {

// After a change of technology the old place stays where it was until there is a new one. Which
// comes first, the news of the technology or that of the place, is open. One thread.
class PushedPlace {
 public:
  using Clock = std::chrono::steady_clock;

  // What is pushed now, which may be nothing, and the technology in use, if one is known.
  void notice(std::string text, std::optional<Technology> technology, Clock::time_point now) {
    if (text != _text) {
      _text = std::move(text);
      _since = now;
      _of = technology;
    }
    const bool together = now - _since <= std::chrono::seconds(1);
    if (!_of || (technology && together)) _of = technology;
    _holds = !technology || !_of || _of == technology;
  }

  // Empty when it is that of another technology.
  std::string current() const { return _holds ? _text : std::string(); }

 private:
  std::string _text;
  Clock::time_point _since;
  std::optional<Technology> _of;
  bool _holds = true;
};

}  // namespace qel::sources
