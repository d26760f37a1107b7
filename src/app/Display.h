// Which display the window goes to.
#pragma once

namespace qel {

// Is there a compositor or a display server, or has somebody chosen a platform?
bool hasDisplay();

// Makes the platform draw into memory. Before the application object is made.
void useMemoryAsDisplay();

}  // namespace qel
