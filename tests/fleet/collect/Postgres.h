// Debian's PostgreSQL, on a socket of the test's own.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "support/ChildProcess.h"

namespace qel::testing {

// A server for this object's life, in a folder of its own, with the database "fleet" of the user
// "owner", and the user "collector" who may do nothing. Whoever connects is believed.
class Postgres {
 public:
  // Whether it is installed here.
  static bool isThere();

  Postgres();
  ~Postgres();
  Postgres(const Postgres&) = delete;
  Postgres& operator=(const Postgres&) = delete;

  // For --database.
  std::string address(const std::string& user = "collector") const;
  // What the owner is answered: rows as lines, their cells with '|' between them. Throws for an
  // error.
  std::string ask(const std::string& sql) const;
  std::vector<std::string> lines(const std::string& sql) const;
  long number(const std::string& sql) const { return std::stol(ask(sql)); }
  // As that user: the error, or nothing.
  std::string complaint(const std::string& user, const std::string& sql) const;

  // The owner, who says this and waits for the answers until the object is gone.
  std::unique_ptr<ChildProcess> session(const std::string& sql) const;

  void start();
  // Like a machine that loses its power.
  void kill();

 private:
  std::string _folder;
  std::unique_ptr<ChildProcess> _server;
};

}  // namespace qel::testing
