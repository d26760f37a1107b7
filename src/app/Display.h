// Which display the window goes to.
#pragma once

#include <string>

namespace qel {

// Is there a compositor or a display server, or has somebody chosen a platform?
bool hasDisplay();

// Makes the platform draw into memory. Before the application object is made.
void useMemoryAsDisplay();

// Nothing is typed into the window. The toolkit's way to a keyboard on the screen costs time at the
// start, and fails where a compositor has no input device. Before the application object is made.
void useNoInputMethod();

// Whether a phone's shell shows the window, which has no room for a title bar of the toolkit's.
// Once the application object is made.
bool isOnPhone();

// The toolkit wants a folder for the session's files, in which the session bus would be looked for
// too. Where the session names none it gets the one that the toolkit would make up, if that is a
// folder of this user that nobody else may enter, or else a new one, which is gone with this. Made
// before the application object and before the first connection to a bus.
class SessionFolder {
 public:
  SessionFolder();
  ~SessionFolder();
  SessionFolder(const SessionFolder&) = delete;
  SessionFolder& operator=(const SessionFolder&) = delete;

 private:
  std::string _made;  // empty: none
};

}  // namespace qel
