// A connection to a database that answers in time or is cut off.
#pragma once

#include <functional>
#include <pqxx/connection>
#include <string>

#include "fleet/collect/AnswerWatch.h"
#include "fleet/collect/DatabaseTrouble.h"

namespace qel::fleet {

// One thread.
class WatchedConnection {
 public:
  // Throws what the library throws when there is no connection. What the server itself limits the
  // caller says in the address, or by a statement.
  WatchedConnection(const std::string& address, const AnswerPatience& patience);

  pqxx::connection& library() { return _connection; }

  // Does it. False when it threw; a server that did not answer is then silent, and the connection
  // of no use any more.
  bool answersTo(const std::function<void()>& work, DatabaseTrouble& trouble);
  // Within such work, before each further statement that may take long.
  void expectAnswer() { _watch.expect(_connection.sock()); }

 private:
  pqxx::connection _connection;
  AnswerWatch _watch;
};

}  // namespace qel::fleet
