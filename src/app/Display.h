// Which display the window goes to.
#pragma once

namespace qel {

// Is there a compositor or a display server, or has somebody chosen a platform?
bool hasDisplay();

// Makes the platform draw into memory. Before the application object is made.
void useMemoryAsDisplay();

// The toolkit wants a folder for the session's files. Where the session has none it gets the one
// that the toolkit would make up, without the toolkit's remark about it.
void provideSessionFolder();

}  // namespace qel
