#include "tools/InputLines.h"

#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>

#include "tools/ToolError.h"

namespace qel::tools {

bool InputLines::isThere() {
  _searched = std::min(_read.find('\n', _searched), _read.size());
  return _searched < _read.size();
}

// False at the end.
bool InputLines::fill() {
  constexpr std::size_t kPiece = 64 * 1024;
  _read.erase(0, _taken);
  _searched -= _taken;
  _taken = 0;
  const std::size_t kept = _read.size();
  _read.resize(kept + kPiece);
  ssize_t count = 0;
  do {
    count = ::read(STDIN_FILENO, _read.data() + kept, kPiece);
  } while (count < 0 && errno == EINTR);
  if (count < 0) throw ToolError(EX_IOERR, "standard input", std::strerror(errno));
  _read.resize(kept + static_cast<std::size_t>(count));
  return count > 0;
}

InputLines::Outcome InputLines::next(std::string_view& line) {
  while (!isThere() && _searched - _taken <= _longest && fill()) {
  }
  if (_taken == _read.size()) return Outcome::end;
  const std::size_t size = _searched - _taken;
  if (size > _longest) return Outcome::tooLong;
  line = std::string_view(_read).substr(_taken, size);
  _taken = _searched = std::min(_searched + 1, _read.size());
  return Outcome::line;
}

}  // namespace qel::tools
