// The tables are made, or made like those of this program.
#pragma once

#include <string>

#include "fleet/collect/AnswerWatch.h"
#include "fleet/collect/DatabaseTrouble.h"

namespace qel::fleet {

struct Prepared {
  int tables = 0;   // that were made
  int columns = 0;  // that were added to others
  bool hasHypertables = false;
  bool couldHaveHypertables = false;  // the server knows how to, and this database was not told so
};

// By somebody who may make schemas and roles; all at once or nothing. What is there stays. False
// when it could not be done.
bool prepareDatabase(const std::string& address, const AnswerPatience& patience, Prepared& prepared,
                     DatabaseTrouble& trouble);

}  // namespace qel::fleet
