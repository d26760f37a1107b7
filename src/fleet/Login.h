// Secrets for a broker, in files for their owner's eyes alone.
#pragma once

#include <optional>
#include <string>

namespace qel::fleet {

struct Login {
  std::string user;
  std::string password;
};

// Two lines, "user NAME" and "password TEXT", of 4096 bytes in all at most. Nothing when the file
// says anything else or others may read it; `error` is then one line, "FILE: WHY", without its
// content.
std::optional<Login> readLogin(const std::string& path, std::string& error);

// Whether nobody but its owner, the user of this process or root, may read the file.
bool isForOwnerAlone(const std::string& path, std::string& error);

}  // namespace qel::fleet
