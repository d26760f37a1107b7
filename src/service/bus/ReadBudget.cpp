#include "service/bus/ReadBudget.h"

namespace qel::service {

bool ReadBudget::allows(std::string_view caller) {
  if (_spent < kOfAll) return true;
  auto found = _calls.find(caller);
  if (found == _calls.end()) found = _calls.emplace(caller, 0).first;
  return ++found->second <= kOfOneCaller;
}

void ReadBudget::nextTurn() {
  _calls.clear();
  _spent = {};
}

}  // namespace qel::service
