// Why a database did not do what it was asked for.
#pragma once

#include <cstdint>
#include <functional>
#include <stdexcept>
#include <string>

namespace qel::fleet {

struct DatabaseTrouble {
  enum class Kind : std::uint8_t {
    away,     // another time it may
    silent,   // it took a statement and never answered; another time it may
    refused,  // login or rights: trying again changes nothing
    layout,   // its tables are not those of this program
  };
  Kind kind = Kind::away;
  std::string why;  // one line
};

// Thrown within guarded().
class WrongLayout : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// Does it. False when it threw, whatever that was.
bool guarded(const std::function<void()>& work, DatabaseTrouble& trouble);

}  // namespace qel::fleet
