#include "fleet/collect/WatchedConnection.h"

namespace qel::fleet {

WatchedConnection::WatchedConnection(const std::string& address, const AnswerPatience& patience)
    : _connection(address), _watch(patience) {}

bool WatchedConnection::answersTo(const std::function<void()>& work, DatabaseTrouble& trouble) {
  expectAnswer();
  const bool isDone = guarded(work, trouble);
  _watch.answered();
  if (!isDone && _watch.hasGivenUp()) {
    trouble = {DatabaseTrouble::Kind::silent, "it does not answer"};
  }
  return isDone;
}

}  // namespace qel::fleet
