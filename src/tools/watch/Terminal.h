// The terminal that a person sits at, as a picture that changes and keys that come.
#pragma once

#include <termios.h>

#include <chrono>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "tools/watch/Sheet.h"

namespace qel::watch {

enum class Key : std::uint8_t {
  up,
  down,
  left,
  right,
  pageUp,
  pageDown,
  home,
  end,
  enter,
  escape,
  tab,
  character,
};

struct KeyPress {
  Key key = Key::character;
  char character = '\0';  // printable ASCII
};

// Where a sheet is looked at: its first row to be seen, and the chosen one.
struct Look {
  std::size_t top = 0;
  std::optional<std::size_t> chosen;
};

// One, on the main thread, made where standard input and output are a terminal. Everything that it
// changes at the terminal is as before once it is gone. Nothing here waits for a terminal that does
// not read: what is to be drawn then is left out until it has read what it was given.
class Terminal {
 public:
  // Nothing when its type is not known; `why` is then one line.
  static std::unique_ptr<Terminal> open(std::string& why);
  ~Terminal();
  Terminal(const Terminal&) = delete;
  Terminal& operator=(const Terminal&) = delete;

  Size size() const { return _size; }
  // How many rows of a sheet can be seen at once.
  std::size_t visibleRows(const Sheet& sheet) const;

  // Draws what differs from what is seen. Left out while the terminal is behind: then it is to be
  // called again once isBehind is no more.
  void draw(const Sheet& sheet, const Look& look);
  bool isBehind();

  // What was pressed; nothing when nothing more was.
  std::optional<KeyPress> pressed();
  // The size may have changed.
  void measure();
  // Gives the terminal back, stops the process as the person asked, and takes it again.
  void stopAndGoOn();
  // Whether it is gone.
  bool isClosed() const { return _isClosed; }

 private:
  struct Curses;
  explicit Terminal(std::unique_ptr<Curses> curses);
  void drawSmall();
  void drawSheet(const Sheet& sheet, const Look& look);
  void takeSettings();
  void giveBack();
  void send();

  const std::unique_ptr<Curses> _curses;
  termios _before{};
  Size _size;
  bool _isClosed = false;
};

}  // namespace qel::watch
