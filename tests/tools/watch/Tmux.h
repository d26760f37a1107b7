// A terminal of a given size, with what stands on its screen.
#pragma once

#include <string>
#include <vector>

namespace qel::testing {

// tmux with one window and a server of its own, which ends with this.
class Tmux {
 public:
  // Runs the shell's words there.
  Tmux(int columns, int lines, const std::string& command);
  ~Tmux();
  Tmux(const Tmux&) = delete;
  Tmux& operator=(const Tmux&) = delete;

  // As tmux names keys: "Down", "Enter", "C-c", or a text.
  void press(const std::string& key) const;
  void resize(int columns, int lines) const;

  std::string screen() const;
  bool shows(const std::string& text) const { return screen().find(text) != std::string::npos; }

 private:
  std::string ask(std::vector<std::string> words) const;

  const std::string _socket;
};

}  // namespace qel::testing
