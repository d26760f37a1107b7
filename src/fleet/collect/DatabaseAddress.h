// Where a database is, as libpq understands it.
#pragma once

#include <optional>
#include <string>

namespace qel::fleet {

// "dbname=fleet host=…" or "postgresql://…", completed by what this program needs. Nothing when it
// cannot be read or has a password in it; `why` is then a few words, without the password.
std::optional<std::string> databaseAddress(const std::string& given, std::string& why);

// Whether a server is there and lets people in: who is refused then has been refused for good.
bool isDatabaseOpen(const std::string& address);

}  // namespace qel::fleet
