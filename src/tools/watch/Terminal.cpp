#include "tools/watch/Terminal.h"

#include <curses.h>
#include <langinfo.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <clocale>
#include <csignal>
#include <cstdio>
#include <string_view>

#include "base/NonBlockingWriter.h"
#include "base/TerminalText.h"
#include "tools/watch/Palette.h"
#include "tools/watch/TerminalRescue.h"

namespace qel::watch {
namespace {

using namespace std::chrono_literals;

constexpr int kEscapeDelayMs = 25;
constexpr auto kPatienceAtTheEnd = 500ms;
constexpr int kEndOfText = 4;  // Ctrl-D
constexpr int kEscape = 27;

// Block characters need a character set that has them.
void chooseCharacters() {
  std::setlocale(LC_CTYPE, "");
  if (std::string_view(::nl_langinfo(CODESET)) != "UTF-8") std::setlocale(LC_CTYPE, "C.UTF-8");
}

// What ends the look of a viewer: the terminal's own words, without the pauses of old ones.
std::string leaveSequence() {
  std::string text;
  for (const char* name : {"sgr0", "op", "rmkx", "cnorm", "rmcup"}) {
    const char* own = ::tigetstr(name);
    if (!own || own == reinterpret_cast<const char*>(-1)) continue;
    text += own;
    for (auto pause = text.find("$<"); pause != std::string::npos; pause = text.find("$<")) {
      text.erase(pause, text.find('>', pause) - pause + 1);
    }
  }
  return text;
}

struct CodeOfKey {
  int code;
  Key key;
};

constexpr std::array kKeys = {
    CodeOfKey{KEY_UP, Key::up},        CodeOfKey{KEY_DOWN, Key::down},
    CodeOfKey{KEY_LEFT, Key::left},    CodeOfKey{KEY_RIGHT, Key::right},
    CodeOfKey{KEY_PPAGE, Key::pageUp}, CodeOfKey{KEY_NPAGE, Key::pageDown},
    CodeOfKey{KEY_HOME, Key::home},    CodeOfKey{KEY_END, Key::end},
    CodeOfKey{KEY_ENTER, Key::enter},  CodeOfKey{'\n', Key::enter},
    CodeOfKey{'\r', Key::enter},       CodeOfKey{'\t', Key::tab},
    CodeOfKey{kEscape, Key::escape},   CodeOfKey{KEY_BACKSPACE, Key::escape},
    CodeOfKey{0x7F, Key::escape},      CodeOfKey{'\b', Key::escape},
};

}  // namespace

// Curses writes into a file in memory, from which the terminal is given what it takes.
struct Terminal::Curses {
  Curses() : memory(::memfd_create("qelctl-watch", MFD_CLOEXEC)), writer(STDOUT_FILENO) {
    if (memory >= 0) file = ::fdopen(memory, "w");
  }
  ~Curses() {
    if (screen) ::delscreen(screen);
    if (file) std::fclose(file);
  }

  // Takes out of the file what curses wrote since.
  void collect() {
    std::fflush(file);
    const off_t size = ::lseek(memory, 0, SEEK_CUR);
    if (size <= 0) return;
    const std::size_t before = waiting.size();
    waiting.resize(before + static_cast<std::size_t>(size));
    const ssize_t got = ::pread(memory, waiting.data() + before, static_cast<std::size_t>(size), 0);
    waiting.resize(before + static_cast<std::size_t>(std::max<ssize_t>(got, 0)));
    ::lseek(memory, 0, SEEK_SET);
    (void)!::ftruncate(memory, 0);
  }

  const int memory;
  std::FILE* file = nullptr;
  SCREEN* screen = nullptr;
  NonBlockingWriter writer;
  std::string waiting;  // of the terminal's reading
  Palette palette;
};

std::unique_ptr<Terminal> Terminal::open(std::string& why) {
  chooseCharacters();
  auto curses = std::make_unique<Curses>();
  if (!curses->file) {
    why = "no memory to draw in";
    return nullptr;
  }
  ::set_escdelay(kEscapeDelayMs);
  ::use_env(FALSE);
  curses->screen = ::newterm(nullptr, curses->file, stdin);
  if (!curses->screen) {
    const char* type = std::getenv("TERM");
    why = std::string("the terminal's type is not known: TERM is ") +
          (type && *type ? '"' + std::string(type) + '"' : "not set");
    return nullptr;
  }
  return std::unique_ptr<Terminal>(new Terminal(std::move(curses)));
}

Terminal::Terminal(std::unique_ptr<Curses> curses) : _curses(std::move(curses)) {
  ::tcgetattr(STDIN_FILENO, &_before);
  takeSettings();
  ::keypad(stdscr, TRUE);
  ::nodelay(stdscr, TRUE);
  ::typeahead(-1);
  ::curs_set(0);
  _curses->palette.begin();
  measure();
}

Terminal::~Terminal() {
  giveBack();
  const auto end = std::chrono::steady_clock::now() + kPatienceAtTheEnd;
  while (isBehind() && !_isClosed && std::chrono::steady_clock::now() < end) {
    _curses->writer.wait(50ms);
  }
  ::tcsetattr(STDIN_FILENO, TCSANOW, &_before);
  releaseTerminal();
}

// Key by key, without an echo; signals are made of keys as before.
void Terminal::takeSettings() {
  holdTerminal(_before, leaveSequence());
  termios settings = _before;
  settings.c_lflag &= ~static_cast<tcflag_t>(ICANON | ECHO);
  settings.c_iflag &= ~static_cast<tcflag_t>(ICRNL | IXON);
  settings.c_cc[VMIN] = 1;
  settings.c_cc[VTIME] = 0;
  ::tcsetattr(STDIN_FILENO, TCSANOW, &settings);
}

void Terminal::giveBack() {
  ::endwin();
  send();
}

void Terminal::measure() {
  struct winsize size {};
  if (::ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) != 0 || size.ws_row == 0 || size.ws_col == 0) {
    size.ws_row = static_cast<unsigned short>(kSmallest.lines);
    size.ws_col = static_cast<unsigned short>(kSmallest.columns);
  }
  _size = {std::min<int>(size.ws_col, kLargest.columns),
           std::min<int>(size.ws_row, kLargest.lines)};
  if (::is_term_resized(_size.lines, _size.columns)) ::resizeterm(_size.lines, _size.columns);
  ::clearok(stdscr, TRUE);
}

void Terminal::stopAndGoOn() {
  giveBack();
  ::tcsetattr(STDIN_FILENO, TCSANOW, &_before);
  releaseTerminal();
  std::signal(SIGTSTP, SIG_DFL);
  std::raise(SIGTSTP);
  ::tcgetattr(STDIN_FILENO, &_before);
  takeSettings();
  measure();
}

// Nothing more once another thread has given the terminal back.
void Terminal::send() {
  if (!isTerminalHeld()) return;
  _curses->collect();
  std::string& waiting = _curses->waiting;
  waiting.erase(0, _curses->writer.write(waiting));
  if (_curses->writer.error() != 0) _isClosed = true;
}

bool Terminal::isBehind() {
  send();
  return !_curses->waiting.empty();
}

std::size_t Terminal::visibleRows(const Sheet& sheet) const {
  constexpr std::size_t kTitleAndKeys = 3;  // and a blank line below the title
  const std::size_t taken = kTitleAndKeys + sheet.foot.size();
  const auto lines = static_cast<std::size_t>(_size.lines);
  return lines > taken ? lines - taken : 0;
}

void Terminal::draw(const Sheet& sheet, const Look& look) {
  if (isBehind() || _isClosed) return;
  ::erase();
  if (_size.columns < kSmallest.columns || _size.lines < kSmallest.lines) {
    drawSmall();
  } else {
    drawSheet(sheet, look);
  }
  ::wnoutrefresh(stdscr);
  ::doupdate();
  send();
}

void Terminal::drawSmall() {
  const std::string text = "The terminal has " + std::to_string(_size.columns) + "x" +
                           std::to_string(_size.lines) + " characters; 80x24 are needed.";
  _curses->palette.put(0, 0, {{text, Style::plain}}, _size.columns, false);
}

void Terminal::drawSheet(const Sheet& sheet, const Look& look) {
  const Palette& palette = _curses->palette;
  const int side = static_cast<int>(columnsOf(sheet.side));
  palette.put(0, 0, {{sheet.title, Style::strong}}, _size.columns - side - 1, false);
  if (side < _size.columns) {
    palette.put(0, _size.columns - side, {{sheet.side, Style::muted}}, side, false);
  }
  const std::size_t count = visibleRows(sheet);
  for (std::size_t i = 0; i < count && look.top + i < sheet.rows.size(); ++i) {
    palette.put(static_cast<int>(i) + 2, 0, sheet.rows[look.top + i].spans, _size.columns,
                look.chosen == look.top + i);
  }
  const int foot = _size.lines - 1 - static_cast<int>(sheet.foot.size());
  for (std::size_t i = 0; i < sheet.foot.size(); ++i) {
    palette.put(foot + static_cast<int>(i), 0, sheet.foot[i].spans, _size.columns, false);
  }
  std::string keys = sheet.keys;
  if (sheet.rows.size() > count) {
    const std::size_t last = std::min(look.top + count, sheet.rows.size());
    keys = std::to_string(look.top + 1) + "-" + std::to_string(last) + " of " +
           std::to_string(sheet.rows.size()) + "  " + keys;
  }
  palette.put(_size.lines - 1, 0, {{keys, Style::muted}}, _size.columns, false);
}

std::optional<KeyPress> Terminal::pressed() {
  while (true) {
    errno = 0;
    const int code = ::getch();
    if (code == ERR || code == kEndOfText) {
      pollfd input{STDIN_FILENO, POLLIN, 0};
      const bool isReady = ::poll(&input, 1, 0) > 0;
      if (isReady && (input.revents & (POLLHUP | POLLERR | POLLNVAL)) != 0) _isClosed = true;
      return std::nullopt;
    }
    const auto* found = std::ranges::find(kKeys, code, &CodeOfKey::code);
    if (found != kKeys.end()) return KeyPress{found->key, '\0'};
    if (code >= ' ' && code <= '~') return KeyPress{Key::character, static_cast<char>(code)};
  }
}

}  // namespace qel::watch
